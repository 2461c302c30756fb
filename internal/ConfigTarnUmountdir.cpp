#include "ConfigTarnUmountdir.h"

#include "support/CommandSpecs.h"
#include "support/ConfigTarnAction.h"
#include "support/SharedParameters.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Unmount a given Config Tarn from the Hyra file system";
constexpr char kMissingName[] = "Either StorageContainer Name or UUID is required";

}  // namespace

boost::shared_ptr<ConfigTarnUmountdir> ConfigTarnUmountdir::New() {
  return boost::shared_ptr<ConfigTarnUmountdir>(new ConfigTarnUmountdir());
}

ConfigTarnUmountdir::ConfigTarnUmountdir() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> ConfigTarnUmountdir::GetInputSpecInternal() {
  return DeclareConfigTarnParameters("Directory Name");
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> ConfigTarnUmountdir::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void ConfigTarnUmountdir::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  ExecuteConfigTarnAction(*input, output, &HostCtl::Storage::TarnFileSystem::UnmountConfigTarn,
                          kMissingName);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
