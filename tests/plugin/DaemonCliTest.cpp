// The daemon control, fault injection and volume commands end to end.
#include <nlohmann/json.hpp>

#include "CliSupport.h"

namespace PluginCliTest {
namespace {

using nlohmann::json;

TEST_F(CliTest, DaemonSettingsAndRulesReachTheDaemon) {
  EXPECT_EQ(Tarn({"daemon", "set", "-l", "Verbose", "-d", "--unbind-period", "1000"}),
            (Outcome{0, "true\n", ""}));
  EXPECT_EQ(Tarn({"faultInjection", "rule", "add", "-f", "NET", "-n", "3"}),
            (Outcome{0, "true\n", ""}));
  EXPECT_EQ(World()["daemon"], json::parse(R"({"running": true, "logLevel": 32,
      "dumpRequests": 1, "unbindPeriod": 1000, "spaceEfficiencyManipulation": true,
      "activations": [], "providerFaults": [], "faultInjection": {"enabled": false,
      "rules": [{"operation": "*", "fault": "NET", "frequency": 3, "time": -1}]}})"));
  EXPECT_EQ(
      Tarn({"virtualvolume", "metadata", "list", "-c", "2C3D4E5F6A7B4C8D9E0FA1B2C3D4E5F6", "-u",
            "7f8e9d0c-1b2a-4c3d-8e4f-5a6b7c8d9e0f"}),
      (Outcome{0, "key     value\n------  -------\nowner   qa\nbackup  nightly\ntier    3\n", ""}));
}

TEST_F(CliTest, RefusedDaemonSettingsChangeNothing) {
  const json daemon = World()["daemon"];
  ASSERT_EQ(Sim({"fail", "TarnLib_DebugCommand", "--message", "daemon busy"}).status, 0);
  EXPECT_EQ(Tarn({"daemon", "set", "-t", "5"}),
            (Outcome{1, "", "TarnLib_DebugCommand  failed with error daemon busy\n"}));
  ASSERT_EQ(Sim({"journal", "--clear"}).status, 0);
  EXPECT_EQ(Tarn({"faultInjection", "rule", "set", "-f", "NET", "-t", "4294967297"}),
            (Outcome{1, "",
                     "Invalid value for parameter time: 4294967297 is outside the range "
                     "-2147483648 to 2147483647\n"}));
  // Nothing was sent: only openings of the daemon library reached the host.
  const json journal = json::parse(Sim({"journal", "--json"}).out);
  EXPECT_FALSE(journal.empty());
  for (const json& call : journal) EXPECT_EQ(call["operation"], "TarnLib_Init") << call;
  EXPECT_EQ(World()["daemon"], daemon);
}

TEST_F(CliTest, UnbindPeriodIsCheckedOnlyWhereItIsSent) {
  // The endpoint and space-efficiency actions never send the period, so any
  // value lets them run.
  EXPECT_EQ(Tarn({"daemon", "set", "--start-pe-apd", "pe-a1", "--unbind-period", "4294967296"}),
            (Outcome{1, "", "Notify PE APD command returned containers: gold, .\n"}));
  EXPECT_EQ(World()["arrays"][0]["protocolEndpoints"][0]["accessible"], false);
  EXPECT_EQ(Tarn({"daemon", "set", "--end-pe-apd", "pe-a1", "-t", "-4294967296"}),
            (Outcome{1, "", "Notify PE APD command returned containers: gold, .\n"}));
  EXPECT_EQ(World()["arrays"][0]["protocolEndpoints"][0]["accessible"], true);
  EXPECT_EQ(Tarn({"daemon", "set", "--disable-spm-space-efficiency-cmds", "true", "-t",
                  "4294967296"}),
            (Outcome{0, "true\n", ""}));
  EXPECT_EQ(World()["daemon"]["spaceEfficiencyManipulation"], false);
  // Where it is sent, a period the daemon cannot hold is still refused.
  const json world = World();
  EXPECT_EQ(Tarn({"daemon", "set", "-d", "-t", "4294967296"}),
            (Outcome{1, "",
                     "Invalid value for parameter unbind-period: 4294967296 is outside the range "
                     "-2147483648 to 2147483647\n"}));
  EXPECT_EQ(World(), world);
}

}  // namespace
}  // namespace PluginCliTest
