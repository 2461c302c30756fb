// What the `faultInjection rule` commands share: how a rule's operation is
// read, and the whole work of `rule add` and `rule set`, which differ only in
// the daemon call and their texts.
#pragma once

#include <cstdint>
#include <string>

#include "Fendle/CallSpec.h"
#include "support/CommandEndings.h"

namespace HalvikCli {
namespace TarnNamespace {

// A frequency or maximum time that was not given; both in a modify remove
// the rule.
inline constexpr int32_t kRuleLimitNotGiven = -1;

// The operation given, passed on even when empty; the wildcard "*" when the
// parameter is omitted.
std::string ReadRuleOperation(const Fendle::CallSpec::Input& input);

// What sets `rule add` and `rule set` apart.
struct FaultRuleAction {
  // TarnLib_AddFaultInjectionRule or TarnLib_ModifyFaultInjectionRule.
  bool (*daemonCall)(const char* operation, const char* fault, int32_t frequency,
                     int32_t maxTimeMs);
  const char* failureText;       // the daemon refused the rule
  const char* missingLimitText;  // neither frequency nor time is above 0
};

// Reads fault, operation, frequency and time, and hands the rule to the daemon
// when frequency or time is above 0. The daemon client library must be open.
void ExecuteFaultRule(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                      const FaultRuleAction& action);

}  // namespace TarnNamespace
}  // namespace HalvikCli
