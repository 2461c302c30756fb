#include "StorageContainerAdd.h"

#include "CommandSpecs.h"
#include "ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] =
    "Add a new Tarn StorageContainer to the Hyra Host and mount it with the given volume name.";

}  // namespace

boost::shared_ptr<StorageContainerAdd> StorageContainerAdd::New() {
  return boost::shared_ptr<StorageContainerAdd>(new StorageContainerAdd());
}

StorageContainerAdd::StorageContainerAdd() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> StorageContainerAdd::GetInputSpecInternal() {
  return DeclareParameters({
      {kContainerName, "n", ParameterType::String, kRequired, "StorageContainer Name"},
      {kContainerId, "c", ParameterType::String, kRequired, "StorageContainer ID"},
      {kArray, "a", ParameterType::StringList, kOptional, "List of Array UUID"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> StorageContainerAdd::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
