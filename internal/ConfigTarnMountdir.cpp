#include "ConfigTarnMountdir.h"

#include "CommandSpecs.h"
#include "SharedParameters.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kDescription[] = "Mount a given config Tarn as directory in the Hyra file system";

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

}  // namespace TarnNamespace
}  // namespace HalvikCli
