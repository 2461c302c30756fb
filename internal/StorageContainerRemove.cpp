#include "StorageContainerRemove.h"

#include "CommandSpecs.h"
#include "ParameterNames.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Remove given Tarn StorageContainer from Hyra host";
constexpr char kSource[] = "internal/StorageContainerRemove";
constexpr int kInitLine = 31;

}  // namespace

boost::shared_ptr<StorageContainerRemove> StorageContainerRemove::New() {
  return boost::shared_ptr<StorageContainerRemove>(new StorageContainerRemove());
}

StorageContainerRemove::StorageContainerRemove() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

StorageContainerRemove::~StorageContainerRemove() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> StorageContainerRemove::GetInputSpecInternal() {
  return DeclareParameters({
      {kContainerId, "c", ParameterType::String, kRequired, "StorageContainer ID"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> StorageContainerRemove::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
