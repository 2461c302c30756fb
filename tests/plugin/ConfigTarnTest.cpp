// The config-tarn commands and kirocontext set against the simulated host.
#include <fstream>

#include "ConfigTarnAdd.h"
#include "ConfigTarnMountdir.h"
#include "ConfigTarnRemove.h"
#include "ConfigTarnUmountdir.h"
#include "HostCtl/Lib.h"
#include "KiroContextSet.h"
#include "OskCtl/Storage.h"
#include "PluginTestSupport.h"
#include "World.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using nlohmann::json;

const std::string kGold = "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f";
const std::string kSilver = "9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d";      // not mounted
const std::string kConfigUuid = "5d2f7a10-6b1c-4e3d-9a8b-7c6d5e4f3a2b";  // vm-config-1 in gold
const Calls kTrue{"result: true", "finish"};

// Gold's config-tarn of that directory name as [policy, vmUuid, size, mounted], or null.
json InGold(const std::string& name) {
  const json world = json::parse(HyraSim::ExportScenario());
  for (const json& t : world["containers"][0]["tarns"]) {
    const json& c = t.value("configTarn", json::object());
    if (c.value("name", "") == name)
      return {c["policy"], c["vmUuid"], t["logicalSizeMB"], c["mounted"]};
  }
  return nullptr;
}

class ConfigTarnTest : public SimWorldTest {};

TEST_F(ConfigTarnTest, AddSendsPolicySizeAndVmUuidOrRefuses) {
  const std::string missing = directory_ + "/missing";
  std::ofstream(directory_ + "/empty");
  auto refused = [](const std::string& why) { return Calls{"error: " + why, "result: false"}; };
  const struct {
    json options;
    const char* armed;  // armed to fail with "boom"
    Calls calls;
    json stored;
  } cases[] = {
      // clang-format off
      {{{"policy", "p"}, {"vmuuid", "vm"}, {"size", 1024}, {"priority", nullptr}}, nullptr, kTrue,
       {"p", "vm", 1024, false}},
      {json::object(), nullptr, kTrue, {"", "", 0, false}},
      {{{"policy-file", directory_ + "/empty"}}, nullptr, kTrue, {"", "", 0, false}},
      // Refused before the host is asked.
      {{{"policy-file", missing}}, "GetTarnFileSystems",
       refused("Unable to read policy file " + missing), nullptr},
      {{{"policy-file", directory_}}, nullptr, refused("Unable to read policy file " + directory_),
       nullptr},
      {{{"container-id", kSilver}}, nullptr,
       refused("Failed to find Tarn StorageContainer " + kSilver), nullptr},
      {json::object(), "CreateConfigTarn", {"error: Failed to create Config-Tarn. boom"}, nullptr},
      // clang-format on
  };
  for (const auto& c : cases) {
    HyraSim::InitDemo();
    if (c.armed) Arm(c.armed, "boom");
    json options = {{"name", "cfg"}, {"container-id", kGold}};
    options.update(c.options);
    EXPECT_EQ(RunCommand(*ConfigTarnAdd::New(), Args(options)), c.calls);
    EXPECT_EQ(InGold("cfg"), c.stored);
  }
  Arm("MatchesContainerId");  // not handled by add
  EXPECT_THROW(RunCommand(*ConfigTarnAdd::New(), Args({{"container-id", kGold}})),
               HostCtl::Lib::HostCtlException);
}

TEST_F(ConfigTarnTest, MountUmountAndRemoveReportTheirOwnTexts) {
  const struct {
    boost::shared_ptr<Fendle::AutoCli::Command> command;
    const char* operation;
    std::string missingName;
  } twins[] = {
      {ConfigTarnMountdir::New(), "MountConfigTarn", "Either name or uuid is required"},
      {ConfigTarnUmountdir::New(), "UnmountConfigTarn",
       "Either StorageContainer Name or UUID is required"},
      {ConfigTarnRemove::New(), "RemoveConfigTarn", "Either name or uuid is required"},
  };
  const json before = World();
  for (const auto& t : twins) {
    EXPECT_EQ(RunCommand(*t.command, Args({{"container-id", kSilver}})),
              (Calls{"error: " + t.missingName, "result: false"}));
    EXPECT_EQ(RunCommand(*t.command, Args({{"container-id", kSilver}, {"name", "vm-config-1"}})),
              (Calls{"error: Failed to find Tarn StorageContainer " + kSilver, "result: false"}));
    for (const char* armed : {"MatchesContainerId", t.operation}) {
      Arm(armed, "boom");
      EXPECT_EQ(RunCommand(*t.command, Args({{"container-id", kGold}, {"uuid", kConfigUuid}})),
                Calls{"error: boom"});
    }
  }
  EXPECT_EQ(World(), before);
}

TEST_F(ConfigTarnTest, TheFirstMatchingContainerIsNamedByUuidBeforeName) {
  json world = World();
  world["host"]["mounted"].push_back(
      {{"name", "silver"}, {"id", kSilver}, {"arrays", json::array()}});
  LoadScenario(world);
  Arm("MatchesContainerId", "asked twice", 1);  // the walk ends at the first match
  EXPECT_EQ(RunCommand(*ConfigTarnMountdir::New(),
                       Args({{"container-id", kGold}, {"uuid", kConfigUuid}, {"name", "none"}})),
            kTrue);
  EXPECT_EQ(InGold("vm-config-1")[3], true);
}

TEST_F(ConfigTarnTest, KiroContextEndsEveryPathWithFinish) {
  auto refused = [](const std::string& why) {
    return Calls{"error: Failed to update host Kiro context Uuid: " + why, "result: false",
                 "finish"};
  };
  const Calls neitherOrBoth = refused("Exactly one of --clear or --uuid must be specified!");
  const struct {
    json args;
    const char* armed;  // armed to fail with "locked"
    Calls calls;
    json context;
  } cases[] = {
      {{{"uuid", " ZM-1 "}}, nullptr, kTrue, " ZM-1 "},
      {{{"clear", nullptr}}, nullptr, kTrue, nullptr},
      {{{"clear", nullptr}, {"uuid", "zm"}}, nullptr, neitherOrBoth, "old"},
      {json::object(), nullptr, neitherOrBoth, "old"},
      {{{"uuid", ""}}, nullptr, refused("--uuid requires a parameter"), "old"},
      {{{"uuid", "zm"}}, "SetKiroContext", refused("locked"), "old"},
  };
  for (const auto& c : cases) {
    OskCtl::Storage::TarnFileSystemImpl::SetKiroContext("old");
    if (c.armed) Arm(c.armed, "locked");
    EXPECT_EQ(RunCommand(*KiroContextSet::New(), Args(c.args)), c.calls);
    EXPECT_EQ(World()["host"]["kiroContext"], c.context);
  }
}

}  // namespace
}  // namespace PluginTest
