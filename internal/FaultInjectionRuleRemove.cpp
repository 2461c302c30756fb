#include "FaultInjectionRuleRemove.h"

#include <string>

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/FaultInjectionRule.h"
#include "support/ParameterNames.h"
#include "support/SharedParameters.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Removes a fault injection rule.";
constexpr char kSource[] = "internal/FaultInjectionRuleRemove";
constexpr int kInitLine = 52;
constexpr char kRemoveFailed[] = "The injection rule could not be removed.";

}  // namespace

boost::shared_ptr<FaultInjectionRuleRemove> FaultInjectionRuleRemove::New() {
  return boost::shared_ptr<FaultInjectionRuleRemove>(new FaultInjectionRuleRemove());
}

FaultInjectionRuleRemove::FaultInjectionRuleRemove() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> FaultInjectionRuleRemove::GetInputSpecInternal() {
  return DeclareParameters({
      {kFault, "f", ParameterType::String, kRequired, kFaultHelp},
      {kOperation, "o", ParameterType::String, kOptional,
       "The Kiro op (e.g. - \"createVirtualVolume\") as listed in the Kiro 2.0 specification "
       "-- omit this parameter to remove a 'wildcard' rule."},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> FaultInjectionRuleRemove::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void FaultInjectionRuleRemove::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, kInitLine);
  const std::string fault = input->GetString(kFault);
  const std::string operation = ReadRuleOperation(*input);
  // A modify without frequency and time removes the rule.
  if (TarnLib_ModifyFaultInjectionRule(operation.c_str(), fault.c_str(), kRuleLimitNotGiven,
                                       kRuleLimitNotGiven)) {
    EndWithTrue(output);
  } else {
    EndWithErrorFalseAndFinish(output, kRemoveFailed);
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
