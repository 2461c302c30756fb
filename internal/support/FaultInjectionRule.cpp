#include "support/FaultInjectionRule.h"

#include "support/Int32Values.h"
#include "support/ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kWildcardOperation[] = "*";

// The limit name as given, else kRuleLimitNotGiven. A value beyond 32 bits is
// refused (error set, false answered) instead of being cut.
bool ReadRuleLimit(const Fendle::CallSpec::Input& input, const char* name, int32_t& limit,
                   std::string& error) {
  limit = kRuleLimitNotGiven;
  return !input.IsSet(name) || ReadInt32(input, name, limit, error);
}

}  // namespace

std::string ReadRuleOperation(const Fendle::CallSpec::Input& input) {
  return input.IsSet(kOperation) ? input.GetString(kOperation) : kWildcardOperation;
}

void ExecuteFaultRule(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                      const FaultRuleAction& action) {
  const std::string fault = input.GetString(kFault);
  const std::string operation = ReadRuleOperation(input);
  int32_t frequency;
  int32_t time;
  std::string error;
  if (!ReadRuleLimit(input, kFrequency, frequency, error) ||
      !ReadRuleLimit(input, kTime, time, error)) {
    EndWithError(output, error);
    return;
  }

  // One limit above 0 is enough; the other is passed on as it is.
  if (time > 0 || frequency > 0) {
    if (action.daemonCall(operation.c_str(), fault.c_str(), frequency, time)) {
      EndWithTrue(output);
    } else {
      EndWithErrorFalseAndFinish(output, action.failureText);
    }
    return;
  }
  EndWithError(output, action.missingLimitText);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
