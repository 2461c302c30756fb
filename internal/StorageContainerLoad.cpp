#include "StorageContainerLoad.h"

#include <memory>
#include <sstream>
#include <unordered_set>

#include "HostCtl/Lib.h"
#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"
#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/DaemonRecords.h"
#include "support/TarnFileSystemList.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaInt;
using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaString;
using Fendle::MetaObj::MetaStruct;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "Load All the Tarn StorageContainers exported by the VP.";
constexpr char kSource[] = "internal/StorageContainerLoad";
constexpr int kInitLine = 42;

constexpr char kContainerStructure[] = "StorageContainer";
constexpr char kContainerNameField[] = "StorageContainer Name";
constexpr char kContainerIdField[] = "StorageContainer Id";
constexpr char kMaxTarnSizeField[] = "Max Tarn Size (MB)";
constexpr char kVpUrlField[] = "VP URL";
constexpr char kArraysField[] = "Arrays";

constexpr char kArrayStructure[] = "Array";
constexpr char kArrayIdField[] = "ArrayId";
constexpr char kArrayNameField[] = "Name";
constexpr char kVendorIdField[] = "VendorId";
constexpr char kModelIdField[] = "ModelId";
constexpr char kPeInfoField[] = "PEInfo";

constexpr char kLoadFailedPrefix[] = "Unable to load Tarn datastores: ";
constexpr char kMountFailedPrefix[] = "Error getting/adding tarn file system '";
constexpr char kMountFailedSuffix[] = ", skipping";
constexpr char kNothingMountedPrefix[] = "no file system was returned for container ";

// The NFS4x addresses of an endpoint joined by commas.
std::string JoinAddresses(const ProtocolEndpointRecord& endpoint) {
  std::string joined;
  for (int32_t i = 0; endpoint.nfs4xAddresses != nullptr && i < endpoint.nfs4xAddressCount; ++i) {
    if (i > 0) joined += ',';
    joined += TextOf(endpoint.nfs4xAddresses[i]);
  }
  return joined;
}

SAInfo ReadStorageArray(const StorageArrayRecord& array) {
  SAInfo info;
  info.arrayId = TextOf(array.arrayId);
  info.arrayName = TextOf(array.arrayName);
  info.vendorId = TextOf(array.vendorId);
  info.modelId = TextOf(array.modelId);
  for (int32_t j = 0; array.protocolEndpoints != nullptr && j < array.peCount; ++j) {
    if (const ProtocolEndpointRecord* endpoint = array.protocolEndpoints[j]) {
      info.peInfo.push_back(DescribeProtocolEndpoint(j, *endpoint));
    }
  }
  return info;
}

}  // namespace

std::vector<std::string> ReadArrayIds(const StorageContainerRecord& container) {
  std::vector<std::string> ids;
  for (int32_t i = 0; container.arrays != nullptr && i < container.arrayCount; ++i) {
    if (const StorageArrayRecord* array = container.arrays[i])
      ids.push_back(TextOf(array->arrayId));
  }
  return ids;
}

std::vector<SAInfo> ReadStorageArrays(const StorageContainerRecord& container) {
  std::vector<SAInfo> arrays;
  for (int32_t i = 0; container.arrays != nullptr && i < container.arrayCount; ++i) {
    if (const StorageArrayRecord* array = container.arrays[i]) {
      arrays.push_back(ReadStorageArray(*array));
    }
  }
  return arrays;
}

std::string DescribeProtocolEndpoint(int32_t index, const ProtocolEndpointRecord& endpoint) {
  std::ostringstream line;
  line << "PE #" << index << " (localUID: " << TextOf(endpoint.localUID)
       << ", isAccessible: " << (endpoint.isAccessible != 0 ? 1 : 0)
       << ", isConfigured: " << (endpoint.isConfigured != 0 ? 1 : 0);
  // An endpoint without an address is described like one of an unknown type.
  if (endpoint.address == nullptr) return line.str();
  const ProtocolEndpointAddress& address = *endpoint.address;
  switch (address.type) {
    case PROTOCOL_ENDPOINT_SCSI:
      line << ", type: SCSI, lunID: " << TextOf(address.firstText) << ")";
      break;
    case PROTOCOL_ENDPOINT_NFS:
      line << ", type: NFS, ipAddress: " << TextOf(address.firstText)
           << ", serverMount: " << TextOf(address.secondText) << ")";
      break;
    case PROTOCOL_ENDPOINT_NFS4X:
      line << ", type: NFS4x, ipAddress(es): " << JoinAddresses(endpoint)
           << ", serverMount: " << TextOf(address.firstText) << ")";
      break;
    default:
      break;
  }
  return line.str();
}

boost::shared_ptr<StorageContainerLoad> StorageContainerLoad::New() {
  return boost::shared_ptr<StorageContainerLoad>(new StorageContainerLoad());
}

StorageContainerLoad::StorageContainerLoad() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
  SetDefaultOutputParameter(HeaderHintKey(kContainerStructure),
                            FieldReference(kContainerNameField));
  SetDefaultOutputParameter(HeaderHintKey(kArrayStructure), FieldReference(kArrayIdField));
  SetDefaultOutputParameter(
      "table-columns", JoinFieldNames({kContainerNameField, kContainerIdField, kMaxTarnSizeField,
                                       kVpUrlField, kArraysField}));
  OpenTarnLib(kSource, kInitLine);
}

StorageContainerLoad::~StorageContainerLoad() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> StorageContainerLoad::GetInputSpecInternal() {
  return DeclareParameters({});
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> StorageContainerLoad::GetOutputSpecInternal() {
  return DeclareResult(MetaList::New(MetaType::Struct, GetOutputStructure()));
}

boost::shared_ptr<MetaStruct> StorageContainerLoad::GetOutputStructure() {
  boost::shared_ptr<MetaStruct> row = MetaStruct::New(kContainerStructure);
  row->SetField(kContainerNameField, MetaString::New());
  row->SetField(kContainerIdField, MetaString::New());
  row->SetField(kMaxTarnSizeField, MetaInt::New());
  row->SetField(kVpUrlField, MetaString::New());
  row->SetField(kArraysField, MetaList::New(MetaType::Struct, GetStorageArrayStructure()));
  return row;
}

boost::shared_ptr<MetaStruct> StorageContainerLoad::GetStorageArrayStructure() {
  boost::shared_ptr<MetaStruct> array = MetaStruct::New(kArrayStructure);
  array->SetField(kArrayIdField, MetaString::New());
  array->SetField(kArrayNameField, MetaString::New());
  array->SetField(kVendorIdField, MetaString::New());
  array->SetField(kModelIdField, MetaString::New());
  array->SetField(kPeInfoField, MetaList::New(MetaType::String));
  return array;
}

boost::shared_ptr<MetaList> StorageContainerLoad::GetStorageArrayList(
    const std::vector<SAInfo>& arrays) {
  boost::shared_ptr<MetaList> list = MetaList::New(MetaType::Struct, GetStorageArrayStructure());
  for (const SAInfo& info : arrays) {
    boost::shared_ptr<MetaStruct> array = GetStorageArrayStructure();
    array->SetField(kArrayIdField, info.arrayId);
    array->SetField(kArrayNameField, info.arrayName);
    array->SetField(kVendorIdField, info.vendorId);
    array->SetField(kModelIdField, info.modelId);
    array->SetField(kPeInfoField, info.peInfo);
    list->Append(array);
  }
  return list;
}

void StorageContainerLoad::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& /*input*/,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  StorageContainerResult* handedOut = nullptr;
  const TarnLib_ErrorEx error = TarnLib_GetStorageContainer(1, nullptr, &handedOut);
  const ContainerResultOwner result(handedOut);
  if (!TarnLib_ErrorExIsSuccess(&error)) {
    EndWithError(output, kLoadFailedPrefix + TextOf(TarnLib_ErrorExStr(&error)));
    return;
  }

  try {
    // Taken once: a container mounted below is not looked up again.
    const TarnFileSystemList mounted = TakeTarnFileSystems(storageInfo);
    // A set, so that each exported container is looked up in constant time.
    std::unordered_set<std::string> mountedNames;
    mountedNames.reserve(mounted.size());
    for (const auto& system : mounted) mountedNames.insert(system->GetContainerName());

    const boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct, GetOutputStructure());
    // A success without a result exports nothing.
    const uint32_t count =
        result != nullptr && result->containers != nullptr ? result->containerCount : 0;
    for (uint32_t i = 0; i < count; ++i) {
      const StorageContainerRecord* container = result->containers[i];
      if (container == nullptr) continue;
      const std::string name = TextOf(container->containerName);
      std::string id = TextOf(container->containerId);
      const std::vector<std::string> arrayIds = ReadArrayIds(*container);
      if (mountedNames.count(name) != 0) continue;

      const std::unique_ptr<HostCtl::Storage::TarnFileSystem> system(
          storageInfo.AddTarnFileSystem(name, id, arrayIds, true));
      // A mount that yields nothing ends the load as a refused mount does,
      // saying that the host answered nothing rather than that it refused.
      if (system == nullptr) {
        throw HostCtl::Lib::HostCtlException(kNothingMountedPrefix + name,
                                             HostCtl::Lib::KelmMessage());
      }
      const boost::shared_ptr<MetaStruct> row = GetOutputStructure();
      row->SetField(kContainerNameField, system->GetContainerName());
      row->SetField(kContainerIdField, system->GetContainerId());
      row->SetField(kMaxTarnSizeField, container->maxTarnSizeMB);
      row->SetField(kVpUrlField, TextOf(container->vpUrl));
      row->SetField(kArraysField, GetStorageArrayList(ReadStorageArrays(*container)));
      rows->Append(row);
    }
    EndWithResult(output, rows);
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, kMountFailedPrefix + e.GetMessage(false) + kMountFailedSuffix);
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
