#include "ConfigTarnRemove.h"

#include "support/CommandSpecs.h"
#include "support/ConfigTarnAction.h"
#include "support/SharedParameters.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Unmount and delete a given config Tarn.";
constexpr char kMissingName[] = "Either name or uuid is required";

}  // namespace

boost::shared_ptr<ConfigTarnRemove> ConfigTarnRemove::New() {
  return boost::shared_ptr<ConfigTarnRemove>(new ConfigTarnRemove());
}

ConfigTarnRemove::ConfigTarnRemove() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> ConfigTarnRemove::GetInputSpecInternal() {
  return DeclareConfigTarnParameters("Directory Path");
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> ConfigTarnRemove::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void ConfigTarnRemove::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  ExecuteConfigTarnAction(*input, output, &HostCtl::Storage::TarnFileSystem::RemoveConfigTarn,
                          kMissingName);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
