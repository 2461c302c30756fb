#include "FaultInjectionEnable.h"

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Enable or disable Kiro Fault Injection.";
constexpr char kSource[] = "internal/FaultInjectionEnable";
constexpr int kInitLine = 45;
constexpr char kChangeFailed[] = "Failed to change the fault injection status.";

}  // namespace

boost::shared_ptr<FaultInjectionEnable> FaultInjectionEnable::New() {
  return boost::shared_ptr<FaultInjectionEnable>(new FaultInjectionEnable());
}

FaultInjectionEnable::FaultInjectionEnable() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> FaultInjectionEnable::GetInputSpecInternal() {
  return DeclareParameters({
      {kEnabled, "e", ParameterType::Bool, kRequired, "true / false"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> FaultInjectionEnable::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void FaultInjectionEnable::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, kInitLine);
  if (TarnLib_SetFaultInjectionEnabled(input->GetBool(kEnabled))) {
    EndWithTrue(output);
  } else {
    EndWithError(output, kChangeFailed);
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
