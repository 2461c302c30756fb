#include "ConfigTarnMountdir.h"

#include "support/CommandSpecs.h"
#include "support/ConfigTarnAction.h"
#include "support/SharedParameters.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Mount a given config Tarn as directory in the Hyra file system";
constexpr char kMissingName[] = "Either name or uuid is required";

}  // namespace

boost::shared_ptr<ConfigTarnMountdir> ConfigTarnMountdir::New() {
  return boost::shared_ptr<ConfigTarnMountdir>(new ConfigTarnMountdir());
}

ConfigTarnMountdir::ConfigTarnMountdir() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> ConfigTarnMountdir::GetInputSpecInternal() {
  return DeclareConfigTarnParameters("Directory Name");
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> ConfigTarnMountdir::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void ConfigTarnMountdir::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  ExecuteConfigTarnAction(*input, output, &HostCtl::Storage::TarnFileSystem::MountConfigTarn,
                          kMissingName);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
