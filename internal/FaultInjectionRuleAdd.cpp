#include "FaultInjectionRuleAdd.h"

#include "CommandEndings.h"
#include "CommandSpecs.h"
#include "FaultInjectionRule.h"
#include "SharedParameters.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Add a fault injection rule.";
constexpr char kSource[] = "internal/FaultInjectionRuleAdd";

constexpr FaultRuleAction kAction = {
    &TarnLib_AddFaultInjectionRule,
    "The injection rule could not be added.",
    "You must specify either a frequency or a maximum time to add a rule.",
};

}  // namespace

boost::shared_ptr<FaultInjectionRuleAdd> FaultInjectionRuleAdd::New() {
  return boost::shared_ptr<FaultInjectionRuleAdd>(new FaultInjectionRuleAdd());
}

FaultInjectionRuleAdd::FaultInjectionRuleAdd() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> FaultInjectionRuleAdd::GetInputSpecInternal() {
  return DeclareFaultRuleParameters();
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> FaultInjectionRuleAdd::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void FaultInjectionRuleAdd::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, __LINE__);
  ExecuteFaultRule(*input, output, kAction);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
