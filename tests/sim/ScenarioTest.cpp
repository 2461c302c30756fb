// The scenario format through hyrasim and the world interface: round trips,
// refusals that name the field, and the database file itself.
#include <sqlite3.h>
#include <sys/stat.h>
#include <unistd.h>

#include <string>

#include "OskCtl/Storage.h"
#include "SimTest.h"

namespace {

using Json = nlohmann::ordered_json;
using Scenario = SimTest::FreshWorld;

// A scenario with every field given, so that reading and writing it again
// must reproduce it exactly.
const char kFullScenario[] = R"json({
  "daemon": { "running": false, "logLevel": 8, "dumpRequests": 3, "unbindPeriod": 300000000,
              "faultInjection": { "enabled": true, "rules": [ { "operation": "*", "fault": "STORAGE_FAULT", "frequency": 10, "time": -1 } ] },
              "spaceEfficiencyManipulation": true,
              "activations": [ { "arrayId": "array-a", "provider": "vp1", "active": true, "activeProviderUrl": "" } ],
              "providerFaults": [ { "provider": "vp1", "url": "https://vp1.example.test:8443/kiro", "status": "offline",
                                    "arrays": [ { "arrayId": "array-a", "isActive": false } ] } ] },
  "arrays": [
    { "id": "array-a", "name": "Array A", "vendorId": "ACME", "modelId": "M100",
      "protocolEndpoints": [
        { "localUID": "pe-a1", "type": "NFS", "ipAddress": "192.0.2.10", "serverMount": "/exports/a1", "accessible": true, "configured": false },
        { "localUID": "pe-a2", "type": "SCSI", "lunId": "lun-0001", "accessible": true, "configured": true },
        { "localUID": "pe-a3", "type": "NFS4x", "addresses": [], "serverMount": "/exports/a3", "accessible": false, "configured": true } ] } ],
  "containers": [
    { "name": "gold", "id": "6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F", "vpUrl": "https://vp1.example.test:8443/kiro",
      "maxTarnSizeMB": 2097152, "arrays": ["array-a"],
      "tarns": [
        { "uuid": "0c9e2d1a-3b4f-4a5e-8f70-112233445566", "logicalSizeMB": 10240, "committedSizeMB": 2048,
          "unsharedSizeMB": null, "storageProfile": null, "blockSize": 4096,
          "metadata": [ ["owner", "ops"], ["owner", "twice"] ], "accessibility": 7,
          "configTarn": { "name": "vm-config-1", "policy": "p", "vmUuid": "", "mounted": false } } ] } ],
  "host": {
    "providers": [ { "name": "vp1", "url": "https://vp1.example.test:8443/kiro", "reserved": "kept",
                     "arrays": [ { "arrayId": "array-a", "isActive": true, "priority": -1 } ] } ],
    "mounted": [ { "name": "gold", "id": "6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F", "arrays": ["array-a"] } ],
    "kiroContext": "zm-1" }
})json";

TEST_F(Scenario, InitThenShowGivesTheSameDocument) {
  const std::string demo = HyraSim::ExportScenario();
  HyraSim::InitScenario(demo);
  EXPECT_EQ(HyraSim::ExportScenario(), demo);

  WriteFile("full.json", kFullScenario);
  ASSERT_EQ(Hyrasim("init --scenario " + Path("full.json")).status, 0);
  const SimTest::ToolResult shown = Hyrasim("show --json");
  ASSERT_EQ(shown.status, 0);
  EXPECT_EQ(Json::parse(shown.out), Json::parse(kFullScenario));

  // And the exported text reads back to itself, byte for byte.
  HyraSim::InitScenario(shown.out);
  EXPECT_EQ(HyraSim::ExportScenario(), shown.out);
}

TEST_F(Scenario, BadScenariosNameTheFieldAndChangeNothing) {
  struct Case {
    std::string json;
    const char* error;
  };
  const std::string mount = R"({"name": "m", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f"})";
  const Case cases[] = {
      {"[]", "scenario: document: must be an object"},
      {"{\"arrays\": [", "scenario: not valid JSON"},
      // A parser message quotes its token, here all of it; only its start is kept.
      {"{\"arrays\": \"" + std::string(100000, 'x'), "scenario: not valid JSON"},
      {std::string(100000, '['), "scenario: [0][0][0][0][0][0][0][0][0][0][0][0][0][0][0][0][0]"},
      {R"({"daemon": {")" + std::string(100000, 'k') + R"(": 1}})", "scenario: daemon.kkkkkkkk"},
      {R"({"host": {"mounted": [{"name": "m", "id": ")" + std::string(100000, 'i') + "\"}]}}",
       "scenario: host.mounted[0].id: \"iiiiiiii"},
      // Numbers past what a double holds, or past 64 bits, name their field.
      {R"({"daemon": {"logLevel": 1e400}})", "scenario: daemon.logLevel: is a number too large"},
      {R"({"arrays": [{"id": "a"}, {"id": "b", "name": -)" + std::string(100000, '7') + "}]}",
       "scenario: arrays[1].name: is a number too large"},
      {R"({"daemon": {"dumpRequests": 18446744073709551616}})",
       "scenario: daemon.dumpRequests: must be between 0 and 9223372036854775807"},
      {R"({"daemon": {"logLevel": 1, "running": true, "logLevel": 2}})",
       "scenario: daemon.logLevel: is given more than once"},
      {R"({"host": {"mounted": [{"name": "m", "id": "m"}]}})",
       "scenario: host.mounted[0].id: \"m\" is not a valid container id"},
      {R"({"host": {"mounted": [)" + mount +
           R"(, {"name": "n", "id": "6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F"}]}})",
       "scenario: host.mounted[1].id: duplicate mounted container id "
       "\"6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F\""},
      {R"({"host": {"providers": [{"name": ""}]}})",
       "scenario: host.providers[0].name: must not be empty"},
      {R"({"colour": 1})", "scenario: colour: is not a field of this record"},
      {R"({"daemon": {"logLevel": "high"}})", "scenario: daemon.logLevel: must be a whole number"},
      {R"({"daemon": {"unbindPeriod": 2147483648}})", "daemon.unbindPeriod: must be between"},
      {R"({"daemon": {"faultInjection": {"rules": [{"fault": "F"}, {"operation": "*", "fault": "F"}]}}})",
       "daemon.faultInjection.rules[1]: duplicate rule \"*, F\""},
      {R"({"daemon": {"providerFaults": [{"provider": "p", "status": "Online"}]}})",
       "daemon.providerFaults[0].status: must be online, offline, syncError, unknown or default"},
      {R"({"arrays": [{"id": "a"}, {"id": "a"}]})", "arrays[1].id: duplicate array id \"a\""},
      {R"({"arrays": [{"id": "a", "protocolEndpoints": [{"localUID": "u", "type": "FC"}]}]})",
       "arrays[0].protocolEndpoints[0].type: must be SCSI, NFS or NFS4x"},
      {R"({"arrays": [{"id": "a", "protocolEndpoints": [{"localUID": "u", "type": "SCSI", "ipAddress": "x"}]}]})",
       "arrays[0].protocolEndpoints[0].ipAddress: is not a field of this record"},
      {R"({"arrays": [{"id": "a", "protocolEndpoints": [{"localUID": "u", "type": "SCSI"}]},
                      {"id": "b", "protocolEndpoints": [{"localUID": "u", "type": "SCSI"}]}]})",
       "arrays[1].protocolEndpoints[0].localUID: duplicate endpoint localUID \"u\""},
      {R"({"containers": [{"name": "c", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5"}]})",
       "containers[0].id: \"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5\" is not a valid container id"},
      {R"({"containers": [{"name": "c", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f"},
                          {"name": "d", "id": "6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F"}]})",
       "containers[1].id: duplicate container id"},
      {R"({"containers": [{"name": "c", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f", "arrays": ["nope"]}]})",
       "containers[0].arrays[0]: no array has the id \"nope\""},
      {R"({"containers": [{"name": "c", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f",
                           "tarns": [{"uuid": "AB"}, {"uuid": "ab"}]}]})",
       "containers[0].tarns[1].uuid: duplicate tarn uuid \"ab\""},
      {R"({"containers": [{"name": "c", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f",
                           "tarns": [{"uuid": "t", "logicalSizeMB": -1}]}]})",
       "containers[0].tarns[0].logicalSizeMB: must be between 0 and"},
      {R"({"containers": [{"name": "c", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f",
                           "tarns": [{"uuid": "t", "metadata": [["k"]]}]}]})",
       "containers[0].tarns[0].metadata[0]: must be a pair [key, value]"},
      {R"({"containers": [{"name": "c", "id": "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f",
                           "tarns": [{"uuid": "t", "configTarn": {"name": "x"}},
                                     {"uuid": "u", "configTarn": {"name": "x"}}]}]})",
       "containers[0].tarns[1].configTarn.name: duplicate config-tarn name \"x\""},
      {R"({"host": {"providers": [{"name": "p"}, {"name": "p"}]}})",
       "host.providers[1].name: duplicate provider name \"p\""},
      {R"({"host": {"providers": [{"url": "u"}]}})", "host.providers[0].name: is missing"},
      {R"({"host": {"mounted": [{"name": "../x", "id": "i"}]}})",
       "host.mounted[0].name: \"../x\" cannot be a directory name"},
      {R"({"host": {"kiroContext": "a\u0000b"}})",
       "host.kiroContext: must not contain a NUL character"},
  };
  const std::string before = HyraSim::ExportScenario();
  for (const Case& c : cases) {
    WriteFile("bad.json", c.json);
    const SimTest::ToolResult result = Hyrasim("init --scenario " + Path("bad.json"));
    EXPECT_NE(result.status, 0) << c.json.substr(0, 80);
    EXPECT_NE(result.err.find(c.error), std::string::npos) << result.err.substr(0, 400);
    EXPECT_LT(result.err.size(), 400u) << "a refusal repeats no long input";
  }
  EXPECT_EQ(HyraSim::ExportScenario(), before);
}

// Only a regular file of at most 64 MiB is read, and nothing else is even
// opened: a pipe with no writer would hold the reader forever.
TEST_F(Scenario, ScenarioFileMustBeARegularFileOfAtMost64MiB) {
  ASSERT_EQ(mkfifo(Path("pipe").c_str(), 0600), 0);
  WriteFile("huge.json", "");
  ASSERT_EQ(truncate(Path("huge.json").c_str(), (64 << 20) + 1), 0);  // sparse, so cheap
  const std::string refused = "hyrasim: cannot read the scenario file ";
  const struct {
    std::string path;
    std::string why;
  } cases[] = {
      {Path("pipe"), "it is a named pipe, not a regular file"},
      {dir_.string(), "it is a directory, not a regular file"},
      {"/dev/zero", "it is a device, not a regular file"},
      {Path("huge.json"), "it is larger than 64 MiB"},
      {Path("missing.json"), "No such file or directory"},
  };
  const std::string before = HyraSim::ExportScenario();
  for (const auto& c : cases) {
    EXPECT_EQ(Hyrasim("init --scenario " + c.path).err, refused + c.path + ": " + c.why + "\n");
  }
  EXPECT_EQ(HyraSim::ExportScenario(), before);

  // A file of exactly the largest size is read (and here refused as JSON).
  ASSERT_EQ(truncate(Path("huge.json").c_str(), 64 << 20), 0);
  EXPECT_NE(Hyrasim("init --scenario " + Path("huge.json")).err.find("not valid JSON"),
            std::string::npos);
}

TEST_F(Scenario, TextsThatAreNotUtf8AreStoredAndShownReplaced) {
  OskCtl::Storage::StorageInfoImpl host;
  host.UpdateTarnVendorProvider({{"vp\xff\xfe", "", "", {}}});
  EXPECT_TRUE(host.TarnVpExists("vp\xff\xfe")) << "stored as given";
  EXPECT_EQ(World()["host"]["providers"][2]["name"], "vp\xEF\xBF\xBD\xEF\xBF\xBD");
}

TEST_F(Scenario, DatabaseIsPrivateAndFollowsTheEnvironment) {
  struct stat info;
  ASSERT_EQ(stat(Path("world.db").c_str(), &info), 0);
  EXPECT_EQ(info.st_mode & 0777, 0600u);

  // Without HYRA_SIM_DB the world lives below XDG_STATE_HOME, created on use.
  const std::string state = Path("state");
  unsetenv("HYRA_SIM_DB");
  setenv("XDG_STATE_HOME", state.c_str(), 1);
  EXPECT_EQ(HyraSim::DatabasePath(), state + "/hyrasim/world.db");
  HyraSim::SetDaemonRunning(false);
  EXPECT_EQ(World()["daemon"]["running"], false);
  unsetenv("XDG_STATE_HOME");
  ASSERT_EQ(stat((state + "/hyrasim/world.db").c_str(), &info), 0);

  // Switching back reaches the first world again, untouched.
  setenv("HYRA_SIM_DB", Path("world.db").c_str(), 1);
  EXPECT_EQ(World()["daemon"]["running"], true);
}

TEST_F(Scenario, FilesThatHoldNoWorldAreNeverTakenOver) {
  sqlite3* db = nullptr;
  ASSERT_EQ(sqlite3_open(Path("foreign.db").c_str(), &db), SQLITE_OK);
  sqlite3_exec(db, "CREATE TABLE notes(text)", nullptr, nullptr, nullptr);
  sqlite3_close(db);
  WriteFile("text.db", "not a database\n");
  for (const char* name : {"foreign.db", "text.db"}) {
    const std::string before = ReadText(Path(name));
    for (const char* command : {"show", "init --demo"}) {
      const SimTest::ToolResult result =
          Run("HYRA_SIM_DB=" + Path(name) + " " + HYRASIM_PATH, command);
      EXPECT_EQ(result.status, 1) << name << " " << command;
      EXPECT_NE(result.err.find(Path(name)), std::string::npos) << result.err;
    }
    EXPECT_EQ(ReadText(Path(name)), before) << name;
  }
}

TEST_F(Scenario, SeveralProcessesWritingAtOnceLoseNothing) {
  std::string command = "(";
  for (int i = 0; i < 6; ++i) {
    command += std::string(SIM_PROBE_PATH) + " add-providers p" + std::to_string(i) + " 30 >>" +
               Path("errors.txt") + " 2>&1 & ";
  }
  command += "wait)";
  ASSERT_EQ(std::system(command.c_str()), 0);
  EXPECT_EQ(ReadText(Path("errors.txt")), "");
  // Provider names are unique, so the count shows that no update was lost.
  EXPECT_EQ(World()["host"]["providers"].size(), 2u + 6 * 30);
}

}  // namespace
