#include "ConfigTarnAdd.h"

#include "CommandSpecs.h"
#include "ParameterNames.h"
#include "SharedParameters.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "ConfigTarnAdd a config Tarn in a given Tarn StorageContainer.";

}  // namespace

boost::shared_ptr<ConfigTarnAdd> ConfigTarnAdd::New() {
  return boost::shared_ptr<ConfigTarnAdd>(new ConfigTarnAdd());
}

ConfigTarnAdd::ConfigTarnAdd() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> ConfigTarnAdd::GetInputSpecInternal() {
  return DeclareParameters({
      {kName, "n", ParameterType::String, kRequired, "Directory Name"},
      {kContainerId, "c", ParameterType::String, kRequired, "StorageContainer ID"},
      {kSize, "s", ParameterType::Int, kOptional, "Size of the meta-tarn object in MB"},
      {kPolicy, "p", ParameterType::String, kOptional, "Policy string for meta-tarn object"},
      {kVmUuid, "v", ParameterType::String, kOptional, "VM Uuid string for meta-tarn object"},
      {kPolicyFile, "f", ParameterType::String, kOptional, "Policy file for meta-tarn object"},
      {kPriority, kNoAlias, ParameterType::Flag, kOptional, kPriorityFlagHelp},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> ConfigTarnAdd::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
