// `daemon set` and the faultInjection commands against the simulated daemon:
// what reaches the daemon, and the exact texts of each outcome.
#include "DaemonCommand.h"
#include "FaultInjectionEnable.h"
#include "FaultInjectionRuleAdd.h"
#include "FaultInjectionRuleRemove.h"
#include "FaultInjectionRuleSet.h"
#include "PluginTestSupport.h"
#include "World.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using nlohmann::json;

const Calls kTrue = {"result: true", "finish"};
const std::string kRange = " is outside the range -2147483648 to 2147483647";

json Rules(const std::vector<json>& rules) { return {{"faultInjection", {{"rules", rules}}}}; }
json Rule(const char* operation, const char* fault, int32_t frequency, int32_t time) {
  return {{"operation", operation}, {"fault", fault}, {"frequency", frequency}, {"time", time}};
}

struct Case {
  boost::shared_ptr<Fendle::AutoCli::Command> command;
  const char* args;  // a JSON object
  Calls calls;
  json change = nullptr;        // merged into the daemon's state; null: no change
  const char* armed = nullptr;  // a daemon function armed to fail with "busy"
};

class DaemonControlTest : public SimWorldTest {
 protected:
  // Each case starts from the demo daemon with start merged in.
  static void RunCases(const json& start, const std::vector<Case>& cases) {
    for (const Case& c : cases) {
      SCOPED_TRACE(c.args);
      HyraSim::InitDemo();
      json world = World();
      world["daemon"].merge_patch(start);
      LoadScenario(world);
      if (c.armed) Arm(c.armed, "busy");
      EXPECT_EQ(RunCommand(*c.command, Args(json::parse(c.args))), c.calls);
      if (!c.change.is_null()) world["daemon"].merge_patch(c.change);
      EXPECT_EQ(World()["daemon"], world["daemon"]);
    }
  }
};

TEST_F(DaemonControlTest, DaemonSetPerformsTheOneActionItsParametersChoose) {
  const auto d = DaemonCommand::New();
  const std::string apd = "error: Notify PE APD command returned containers: ";
  // clang-format off
  const std::vector<Case> cases = {
      {d, R"({"log-level": "WARNING"})", kTrue, {{"logLevel", 8}}},
      {d, R"({"dump-objects": null})", kTrue, {{"dumpRequests", 1}}},
      {d, R"({"unbind-now": null, "unbind-period": 4294967297})", kTrue, {{"unbindPeriod", 0}}},
      {d, R"({"log-level": "info", "unbind-period": -2147483649})",
       {"error: Invalid value for parameter unbind-period: -2147483649" + kRange}},
      {d, R"({"log-level": "info", "disable-spm-space-efficiency-cmds": true})", kTrue,
       {{"spaceEfficiencyManipulation", false}}},
      {d, R"({"log-level": "info", "start-pe-apd": "pe-a1", "end-pe-apd": "pe-a1"})",
       {apd + "gold, .\n"}},
      {d, R"({"end-pe-apd": "pe-b2"})", {apd + ".\n"}},
      {d, R"({"log-level": "info"})", {"error: TarnLib_DebugCommand  failed with error busy\n"},
       nullptr, "TarnLib_DebugCommand"},
      {d, R"({"disable-spm-space-efficiency-cmds": false})",
       {"error: TarnLib_SetSPMSpaceEfficiencyManipulationEnabled failed with error, busy\n",
        "finish"}, nullptr, "TarnLib_SetSPMSpaceEfficiencyManipulationEnabled"},
  };
  // clang-format on
  RunCases({{"logLevel", 32}}, cases);
}

TEST_F(DaemonControlTest, FaultInjectionSendsTheRuleOrRefusesIt) {
  const auto add = FaultInjectionRuleAdd::New();
  const auto set = FaultInjectionRuleSet::New();
  const auto remove = FaultInjectionRuleRemove::New();
  const json wildcard = Rule("*", "SF", 5, -1);
  // clang-format off
  const std::vector<Case> cases = {
      {FaultInjectionEnable::New(), R"({"enabled": false})", kTrue,
       {{"faultInjection", {{"enabled", false}}}}},
      {add, R"({"fault": "NET", "operation": "op", "time": 500})", kTrue,
       Rules({wildcard, Rule("op", "NET", -1, 500)})},
      {add, R"({"fault": "NET", "frequency": 10, "time": -5})", kTrue,
       Rules({wildcard, Rule("*", "NET", 10, -5)})},
      {add, R"({"fault": "NET", "frequency": 0, "time": 0})",
       {"error: You must specify either a frequency or a maximum time to add a rule."}},
      {add, R"({"fault": "SF", "frequency": 1})",
       {"error: The injection rule could not be added.", "result: false", "finish"}},
      {add, R"({"fault": "NET", "frequency": 4294967297, "time": 5})",
       {"error: Invalid value for parameter frequency: 4294967297" + kRange}},
      {set, R"({"fault": "SF", "frequency": 7})", kTrue, Rules({Rule("*", "SF", 7, -1)})},
      {set, R"({"fault": "SF", "operation": "", "time": 7})",
       {"error: The injection rule could not be modified.  Verify that the rule exists.",
        "result: false", "finish"}},
      {remove, R"({"fault": "SF", "frequency": 9})", kTrue, Rules({})},
      {remove, R"({"fault": "SF", "operation": "op"})",
       {"error: The injection rule could not be removed.", "result: false", "finish"}},
  };
  // clang-format on
  RunCases({{"faultInjection", {{"enabled", true}, {"rules", {wildcard}}}}}, cases);
}

}  // namespace
}  // namespace PluginTest
