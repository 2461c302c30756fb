#include "KiroContextSet.h"

#include "CommandSpecs.h"
#include "ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Set the Tarn Kiro context (ZM UUID) on the host.";

}  // namespace

boost::shared_ptr<KiroContextSet> KiroContextSet::New() {
  return boost::shared_ptr<KiroContextSet>(new KiroContextSet());
}

KiroContextSet::KiroContextSet() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> KiroContextSet::GetInputSpecInternal() {
  return DeclareParameters({
      {kUuid, "u", ParameterType::String, kOptional,
       "The ZM UUID for the Tarn Kiro context you wish to configure on the host"},
      {kClear, "c", ParameterType::Flag, kOptional, "Clear the Tarn Kiro context for the host"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> KiroContextSet::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
