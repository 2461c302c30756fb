#include "FaultInjectionRuleSet.h"

#include "CommandEndings.h"
#include "CommandSpecs.h"
#include "SharedParameters.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Modify a fault injection rule.";
constexpr char kSource[] = "internal/FaultInjectionRuleSet";

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
    const boost::shared_ptr<Fendle::CallSpec::Input>& /*input*/,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, __LINE__);
  EndWithError(output, kNotImplemented);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
