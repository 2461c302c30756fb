#include "StorageContainerAdd.h"

#include <memory>
#include <string>
#include <vector>

#include "HostCtl/Lib.h"
#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"

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

void StorageContainerAdd::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  const std::string name = input->GetString(kContainerName);
  std::string id = input->GetString(kContainerId);
  const std::vector<std::string> arrayIds = input->GetStringList(kArray);
  try {
    {
      // The file system object is destroyed before Finish.
      const std::unique_ptr<HostCtl::Storage::TarnFileSystem> system(
          storageInfo.AddTarnFileSystem(name, id, arrayIds, true));
      // A host that mounted nothing answers false, without an error of its own.
      output->SetResult(Fendle::MetaObj::MetaBool::New(system != nullptr));
    }
    output->Finish();
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, e.GetMessage(false));
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
