#include "FaultInjectionRuleSet.h"

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/FaultInjectionRule.h"
#include "support/SharedParameters.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Modify a fault injection rule.";
constexpr char kSource[] = "internal/FaultInjectionRuleSet";
constexpr int kInitLine = 47;

constexpr FaultRuleAction kAction = {
    &TarnLib_ModifyFaultInjectionRule,
    "The injection rule could not be modified.  Verify that the rule exists.",
    "You must specify either a frequency or a maximum time to modify a rule.",
};

}  // namespace

boost::shared_ptr<FaultInjectionRuleSet> FaultInjectionRuleSet::New() {
  return boost::shared_ptr<FaultInjectionRuleSet>(new FaultInjectionRuleSet());
}

FaultInjectionRuleSet::FaultInjectionRuleSet() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> FaultInjectionRuleSet::GetInputSpecInternal() {
  return DeclareFaultRuleParameters();
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> FaultInjectionRuleSet::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void FaultInjectionRuleSet::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, kInitLine);
  ExecuteFaultRule(*input, output, kAction);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
