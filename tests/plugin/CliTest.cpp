// The kiroprovider commands end to end: hyracli with the plug-in beside it,
// against a world that hyrasim sets up, arms and shows.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <sstream>
#include <string>
#include <vector>

namespace {

using nlohmann::json;

struct Outcome {
  int status;
  std::string out;
  std::string err;
};

bool operator==(const Outcome& a, const Outcome& b) {
  return a.status == b.status && a.out == b.out && a.err == b.err;
}

std::ostream& operator<<(std::ostream& os, const Outcome& o) {
  return os << "status " << o.status << ", out \"" << o.out << "\", err \"" << o.err << "\"";
}

std::string Quoted(const std::string& word) {
  std::string quoted = "'";
  for (char c : word) quoted += (c == '\'') ? std::string("'\\''") : std::string(1, c);
  return quoted + "'";
}

class CliTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (std::filesystem::temp_directory_path() / "plugin-cli-XXXXXX").string();
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    directory_ = pattern;
    setenv("HYRA_SIM_DB", (directory_ + "/world.db").c_str(), 1);
    ASSERT_EQ(Sim({"init", "--demo"}).status, 0);
  }
  void TearDown() override {
    unsetenv("HYRA_SIM_DB");
    std::error_code ignored;
    std::filesystem::remove_all(directory_, ignored);
  }

  Outcome Tool(const char* path, const std::vector<std::string>& args) {
    const std::string errPath = directory_ + "/stderr";
    std::string command = Quoted(path);
    for (const auto& arg : args) command += " " + Quoted(arg);
    command += " 2>" + Quoted(errPath);
    Outcome outcome{-1, "", ""};
    FILE* pipe = popen(command.c_str(), "r");
    if (pipe == nullptr) return outcome;
    char buffer[4096];
    for (size_t n; (n = fread(buffer, 1, sizeof buffer, pipe)) > 0;) outcome.out.append(buffer, n);
    const int status = pclose(pipe);
    outcome.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    std::ifstream err(errPath);
    std::ostringstream text;
    text << err.rdbuf();
    outcome.err = text.str();
    return outcome;
  }

  // hyracli storage internal tarn kiroprovider <args>
  Outcome Provider(std::vector<std::string> args) {
    args.insert(args.begin(), {"storage", "internal", "tarn", "kiroprovider"});
    return Tool(HYRACLI_PATH, args);
  }
  Outcome Sim(const std::vector<std::string>& args) { return Tool(HYRASIM_PATH, args); }
  json World() { return json::parse(Sim({"show", "--json"}).out); }

  std::string directory_;
};

TEST_F(CliTest, ProviderLifecycleLeavesExactlyWhatEachCommandStored) {
  struct Step {
    std::vector<std::string> args;
    std::string out;
  };
  const Step steps[] = {
      {{"add", "-v", "vp9", "-U", "https://vp9.test", "-a", "array-c", "-p", "5", "-i", "true"},
       "Succesfully Added VP with name : vp9\n"},
      {{"set", "--vp-name", "vp9", "-a", "array-c", "-a", "array-a", "-p", "9", "--priority", "-3",
        "-i", "false", "-i", "TRUE"},
       "Successfully Updated VP with name : vp9\n"},
      {{"activate", "-n", "vp9", "-a", "array-a"}, "true\n"},
      {{"deactivate", "-n", "vp9", "-a", "array-c"}, "true\n"},
      {{"injectfault", "-v", "vp9", "-s", "offline", "-a", "array-a", "-i", "false"},
       "Successfully Injected fault for VP with name : vp9\n"},
  };
  for (const Step& step : steps) {
    SCOPED_TRACE(step.args[0]);
    EXPECT_EQ(Provider(step.args), (Outcome{0, step.out, ""}));
  }
  const json world = World();
  EXPECT_EQ(world["host"]["providers"][2], json::parse(R"({"name": "vp9", "url": "https://vp9.test",
      "arrays": [{"arrayId": "array-c", "isActive": false, "priority": 9},
                 {"arrayId": "array-a", "isActive": true, "priority": -3}]})"));
  EXPECT_EQ(world["daemon"]["activations"], json::parse(R"([
      {"arrayId": "array-a", "provider": "vp9", "active": true, "activeProviderUrl": ""},
      {"arrayId": "array-c", "provider": "vp9", "active": false, "activeProviderUrl": ""}])"));
  EXPECT_EQ(world["daemon"]["providerFaults"], json::parse(R"([{"provider": "vp9",
      "url": "https://vp9.test", "status": "offline",
      "arrays": [{"arrayId": "array-a", "isActive": false}]}])"));

  EXPECT_EQ(Provider({"remove", "-v", "vp9"}), (Outcome{0, "true\n", ""}));
  EXPECT_EQ(World()["host"]["providers"].size(), 2u);
}

TEST_F(CliTest, FailuresEndWithTheCommandsTextAndChangeNoProvider) {
  struct Case {
    std::vector<std::string> arm;  // hyrasim arguments, or empty
    std::vector<std::string> args;
    std::string err;
  };
  const Case cases[] = {
      {{"fail", "UpdateTarnVendorProvider", "--message", "disk full"},
       {"add", "-v", "vp7", "-U", "u"},
       "Failed to add VP: disk full\n"},
      {{},
       {"add", "-v", "vp7", "-U", "u", "-a", "x", "-p", "4294967297", "-i", "true"},
       "Invalid value for parameter priority: 4294967297 is outside the range -2147483648 to "
       "2147483647\n"},
      {{"fail", "TarnLib_ActivateProvider", "--message", "array busy"},
       {"activate", "-n", "vp1", "-a", "array-a"},
       "TarnLib_ActivateProvider failed with error array busy\n"},
      {{},
       {"deactivate", "-n", "vp1", "-a", "array-c"},
       "TarnLib_DeactivateProvider failed with error not found\n"},
  };
  const json demo = World();
  for (const Case& c : cases) {
    SCOPED_TRACE(c.args[0] + " " + c.err);
    ASSERT_EQ(Sim({"init", "--demo"}).status, 0);
    if (!c.arm.empty()) {
      ASSERT_EQ(Sim(c.arm).status, 0);
    }
    EXPECT_EQ(Provider(c.args), (Outcome{1, "", c.err}));
    EXPECT_EQ(World()["host"], demo["host"]);
  }
}

TEST_F(CliTest, StoppedDaemonKeepsThePluginFromRegistering) {
  ASSERT_EQ(Sim({"daemon", "stop"}).status, 0);
  const Outcome outcome = Provider({"remove", "-v", "vp1"});
  EXPECT_EQ(outcome.status, 3);
  EXPECT_NE(outcome.err.find("Unable to initialize tarnLib (internal/VendorProviderRemove:35)"),
            std::string::npos);
}

}  // namespace
