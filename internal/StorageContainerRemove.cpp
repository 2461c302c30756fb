#include "StorageContainerRemove.h"

#include <cstring>
#include <string>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Remove given Tarn StorageContainer from Hyra host";
constexpr char kSource[] = "internal/StorageContainerRemove";
constexpr int kInitLine = 31;
constexpr char kBadIdPrefix[] = "Bad CID : ";

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

void StorageContainerRemove::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  const std::string id = input->GetString(kContainerId);
  char normalized[TARNLIB_CONTAINER_ID_TEXT_SIZE] = {};
  if (!TarnLib_NormalizeContainerIdString(id.c_str(), normalized)) {
    EndWithError(output, kBadIdPrefix + id);
    return;
  }
  try {
    // Never read past the buffer, even were its terminator missing.
    storageInfo.RemoveTarnFileSystem(
        std::string(normalized, strnlen(normalized, sizeof normalized)));
    EndWithTrue(output);
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, e.GetMessage(false));
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
