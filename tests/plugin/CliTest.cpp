// The kiroprovider commands end to end.
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliSupport.h"

namespace PluginCliTest {
namespace {

using nlohmann::json;

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
      {{"activate", "-n", "vp9", "-a", "array-a", "-u", "https://old"}, "true\n"},
      {{"deactivate", "-n", "vp9", "-a", "array-c"}, "true\n"},
      {{"injectfault", "-v", "vp9", "-s", "offline", "-a", "array-a", "-i", "false", "-a", "Q",
        "-i", "true"},
       "Successfully Injected fault for VP with name : vp9\n"},
  };
  for (const Step& step : steps) {
    EXPECT_EQ(Provider(step.args), (Outcome{0, step.out, ""}));
  }
  const json world = World();
  EXPECT_EQ(world["host"]["providers"][2], json::parse(R"({"name": "vp9", "url": "https://vp9.test",
      "arrays": [{"arrayId": "array-c", "isActive": false, "priority": 9},
                 {"arrayId": "array-a", "isActive": true, "priority": -3}]})"));
  EXPECT_EQ(world["daemon"]["activations"], json::parse(R"([
      {"arrayId": "array-a", "provider": "vp9", "active": true, "activeProviderUrl": "https://old"},
      {"arrayId": "array-c", "provider": "vp9", "active": false, "activeProviderUrl": ""}])"));
  EXPECT_EQ(world["daemon"]["providerFaults"], json::parse(R"([{"provider": "vp9",
      "url": "https://vp9.test", "status": "offline", "arrays": [
      {"arrayId": "array-a", "isActive": false}, {"arrayId": "Q", "isActive": true}]}])"));

  EXPECT_EQ(Provider({"remove", "-v", "vp9"}), (Outcome{0, "true\n", ""}));
  EXPECT_EQ(World()["host"]["providers"].size(), 2u);
}

TEST_F(CliTest, FailuresEndWithTheCommandsTextAndChangeNothing) {
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
      // remove reports the host's text alone.
      {{"fail", "UnRegisterVendorProvider", "--message", "busy"},
       {"remove", "-v", "vp1"},
       "busy\n"},
  };
  const json demo = World();
  for (const Case& c : cases) {
    ASSERT_EQ(Sim({"init", "--demo"}).status, 0);
    ASSERT_EQ(c.arm.empty() ? 0 : Sim(c.arm).status, 0);
    EXPECT_EQ(Provider(c.args), (Outcome{1, "", c.err}));
    EXPECT_EQ(World(), demo);
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
}  // namespace PluginCliTest
