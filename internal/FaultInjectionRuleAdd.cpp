#include "FaultInjectionRuleAdd.h"

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/FaultInjectionRule.h"
#include "support/SharedParameters.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Add a fault injection rule.";
constexpr char kSource[] = "internal/FaultInjectionRuleAdd";
constexpr int kInitLine = 47;

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
  InvocationBracket bracket(kSource, kInitLine);
  ExecuteFaultRule(*input, output, kAction);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
