// The exported containers, their config-tarns and container ids.
#include <algorithm>
#include <cstring>
#include <string>
#include <unordered_map>
#include <vector>

#include "ContainerId.h"
#include "DaemonCall.h"
#include "Records.h"
#include "Status.h"
#include "TarnLib/TarnLib.h"

using HyraSim::Access;
using TarnSim::Allocate;
using TarnSim::CallDaemon;
using TarnSim::CopyText;
using TarnSim::Count32;
using TarnSim::Refusal;

namespace {

// What one exported container carries to its record. Arrays are shared by
// many containers and read once per call; the pointers stay valid while the
// call's array cache lives.
struct ExportedContainer {
  HyraSim::Container container;
  std::vector<const HyraSim::StorageArray*> arrays;
};

void FillEndpoint(ProtocolEndpointRecord*& slot, const HyraSim::ProtocolEndpoint& pe) {
  slot = Allocate<ProtocolEndpointRecord>();
  slot->localUID = CopyText(pe.localUid);
  slot->isAccessible = pe.accessible ? 1 : 0;
  slot->isConfigured = pe.configured ? 1 : 0;
  slot->address = Allocate<ProtocolEndpointAddress>();
  ProtocolEndpointAddress& address = *slot->address;
  switch (pe.type) {
    case HyraSim::EndpointType::kScsi:
      address.type = PROTOCOL_ENDPOINT_SCSI;
      address.firstText = CopyText(pe.lunId);
      break;
    case HyraSim::EndpointType::kNfs:
      address.type = PROTOCOL_ENDPOINT_NFS;
      address.firstText = CopyText(pe.ipAddress);
      address.secondText = CopyText(pe.serverMount);
      break;
    case HyraSim::EndpointType::kNfs4x:
      address.type = PROTOCOL_ENDPOINT_NFS4X;
      address.firstText = CopyText(pe.serverMount);
      slot->nfs4xAddresses = Allocate<char*>(pe.addresses.size());
      slot->nfs4xAddressCount = Count32(pe.addresses.size());
      for (size_t i = 0; i < pe.addresses.size(); ++i) {
        slot->nfs4xAddresses[i] = CopyText(pe.addresses[i]);
      }
      break;
  }
}

void FillArray(StorageArrayRecord*& slot, const HyraSim::StorageArray& array) {
  slot = Allocate<StorageArrayRecord>();
  slot->arrayId = CopyText(array.id);
  slot->arrayName = CopyText(array.name);
  slot->vendorId = CopyText(array.vendorId);
  slot->modelId = CopyText(array.modelId);
  slot->protocolEndpoints = Allocate<ProtocolEndpointRecord*>(array.endpoints.size());
  slot->peCount = Count32(array.endpoints.size());
  for (size_t i = 0; i < array.endpoints.size(); ++i) {
    FillEndpoint(slot->protocolEndpoints[i], array.endpoints[i]);
  }
}

// Fills the record in place, so that a failure part way leaves a record that
// its free function releases whole.
void FillContainer(StorageContainerRecord*& slot, const ExportedContainer& exported) {
  slot = Allocate<StorageContainerRecord>();
  slot->containerName = CopyText(exported.container.name);
  slot->vpUrl = CopyText(exported.container.vpUrl);
  slot->containerId = CopyText(exported.container.id);
  slot->maxTarnSizeMB = exported.container.maxTarnSizeMB;
  slot->arrays = Allocate<StorageArrayRecord*>(exported.arrays.size());
  slot->arrayCount = Count32(exported.arrays.size());
  for (size_t i = 0; i < exported.arrays.size(); ++i)
    FillArray(slot->arrays[i], *exported.arrays[i]);
}

void FreeEndpoint(ProtocolEndpointRecord* pe) {
  if (pe == nullptr) return;
  free(pe->localUID);
  for (int32_t i = 0; pe->nfs4xAddresses != nullptr && i < pe->nfs4xAddressCount; ++i) {
    free(pe->nfs4xAddresses[i]);
  }
  free(pe->nfs4xAddresses);
  if (pe->address != nullptr) {
    free(pe->address->firstText);
    free(pe->address->secondText);
    free(pe->address);
  }
  free(pe);
}

void FreeArray(StorageArrayRecord* array) {
  if (array == nullptr) return;
  free(array->arrayId);
  free(array->arrayName);
  free(array->vendorId);
  free(array->modelId);
  for (int32_t i = 0; array->protocolEndpoints != nullptr && i < array->peCount; ++i) {
    FreeEndpoint(array->protocolEndpoints[i]);
  }
  free(array->protocolEndpoints);
  free(array);
}

// A text longer than the record holds is cut before a whole character, never
// inside a multi-byte UTF-8 sequence.
void FillErrorText(TarnLib_ErrorEx& error, const std::string& text) {
  size_t length = std::min(text.size(), sizeof(error.text) - 1);
  if (length < text.size()) {
    while (length > 0 && (static_cast<unsigned char>(text[length]) & 0xC0) == 0x80) --length;
  }
  std::memcpy(error.text, text.data(), length);
  error.text[length] = '\0';
}

TarnLib_ErrorEx ErrorRecord(TarnLib_Status status) {
  TarnLib_ErrorEx error;
  std::memset(&error, 0, sizeof(error));
  error.status = status;
  if (status != TARNLIB_OK) FillErrorText(error, TarnLib_Err2String(status));
  return error;
}

}  // namespace

extern "C" void TarnLib_FreeStorageContainerResult(StorageContainerResult* result) {
  if (result == nullptr) return;
  for (uint32_t i = 0; result->containers != nullptr && i < result->containerCount; ++i) {
    StorageContainerRecord* container = result->containers[i];
    if (container == nullptr) continue;
    free(container->containerName);
    free(container->vpUrl);
    free(container->containerId);
    for (int32_t j = 0; container->arrays != nullptr && j < container->arrayCount; ++j) {
      FreeArray(container->arrays[j]);
    }
    free(container->arrays);
    free(container);
  }
  free(result->containers);
  free(result);
}

extern "C" TarnLib_ErrorEx TarnLib_GetStorageContainer(int32_t scope, const char* filter,
                                                       StorageContainerResult** result) {
  if (result == nullptr) return ErrorRecord(TarnSim::kInvalidArgument);
  std::vector<ExportedContainer> exported;
  // Node-based, so that the arrays do not move while containers point at them.
  std::unordered_map<std::string, std::optional<HyraSim::StorageArray> > arrays;
  const TarnSim::CallOutcome outcome =
      CallDaemon("TarnLib_GetStorageContainer", Access::kRead,
                 {std::to_string(scope), TarnSim::Arg(filter)}, [&](sqlite3* db) {
                   HyraSim::ForEachExportedContainer(db, [&](const HyraSim::Container& container) {
                     ExportedContainer entry{container, {}};
                     for (const auto& arrayId : container.arrays) {
                       auto found = arrays.find(arrayId);
                       if (found == arrays.end()) {
                         found = arrays.emplace(arrayId, HyraSim::FindArray(db, arrayId)).first;
                       }
                       if (found->second) entry.arrays.push_back(&*found->second);
                     }
                     exported.push_back(std::move(entry));
                   });
                 });
  if (outcome.status != TARNLIB_OK) return ErrorRecord(outcome.status);
  if (outcome.nothing) {
    *result = nullptr;
    return ErrorRecord(TARNLIB_OK);
  }
  try {
    TarnSim::Owned<StorageContainerResult> built(Allocate<StorageContainerResult>(),
                                                 &TarnLib_FreeStorageContainerResult);
    built->containers = Allocate<StorageContainerRecord*>(exported.size());
    built->containerCount = static_cast<uint32_t>(Count32(exported.size()));
    for (size_t i = 0; i < exported.size(); ++i) FillContainer(built->containers[i], exported[i]);
    *result = built.release();
    return ErrorRecord(TARNLIB_OK);
  } catch (...) {
    return ErrorRecord(TarnSim::StatusOfCurrentException());
  }
}

extern "C" bool TarnLib_ErrorExIsSuccess(const TarnLib_ErrorEx* error) {
  return error != nullptr && error->status == TARNLIB_OK;
}

extern "C" const char* TarnLib_ErrorExStr(const TarnLib_ErrorEx* error) {
  return error != nullptr ? error->text : "";
}

extern "C" void TarnLib_FreeQueryResult(QueryResult* result) {
  if (result == nullptr) return;
  for (int32_t i = 0; result->entries != nullptr && i < result->entryCount; ++i) {
    ConfigTarnEntry* entry = result->entries[i];
    if (entry == nullptr) continue;
    free(entry->tarnId);
    free(entry->name);
    free(entry->vmUuid);
    free(entry);
  }
  free(result->entries);
  free(result);
}

extern "C" TarnLib_Status TarnLib_QueryAllConfigTarns(const char* containerId, int32_t maxEntries,
                                                      int32_t offset, QueryResult** result,
                                                      int32_t flags) {
  if (result == nullptr) return TarnSim::kInvalidArgument;
  std::vector<HyraSim::Tarn> configTarns;
  const TarnSim::CallOutcome outcome = CallDaemon(
      "TarnLib_QueryAllConfigTarns", Access::kRead,
      {TarnSim::Arg(containerId), std::to_string(maxEntries), std::to_string(offset),
       std::to_string(flags)},
      [&](sqlite3* db) {
        const HyraSim::ContainerRow container = TarnSim::FindKnownContainer(db, containerId);
        if (maxEntries < 0 || offset < 0) throw Refusal{TarnSim::kInvalidArgument};
        configTarns = HyraSim::ReadConfigTarns(db, container.pos, offset, maxEntries);
      });
  if (outcome.nothing) {
    *result = nullptr;
    return TARNLIB_OK;
  }
  if (outcome.status != TARNLIB_OK) configTarns.clear();
  try {
    // A failed query still answers an (empty) result, which the caller frees.
    TarnSim::Owned<QueryResult> built(Allocate<QueryResult>(), &TarnLib_FreeQueryResult);
    built->entries = Allocate<ConfigTarnEntry*>(configTarns.size());
    built->entryCount = Count32(configTarns.size());
    for (size_t i = 0; i < configTarns.size(); ++i) {
      ConfigTarnEntry*& entry = built->entries[i];
      entry = Allocate<ConfigTarnEntry>();
      entry->tarnId = CopyText(configTarns[i].uuid);
      entry->name = CopyText(configTarns[i].configTarn->name);
      entry->vmUuid = CopyText(configTarns[i].configTarn->vmUuid);
      entry->mounted = configTarns[i].configTarn->mounted ? 1 : 0;
    }
    *result = built.release();
  } catch (...) {
    return TarnSim::StatusOfCurrentException();
  }
  return outcome.status;
}

extern "C" bool TarnLib_NormalizeContainerIdString(const char* id, char* normalized) {
  try {
    const HyraSim::Injection injection =
        HyraSim::CountCall("TarnLib_NormalizeContainerIdString", {TarnSim::Arg(id)});
    if (injection.fired) return false;
  } catch (const HyraSim::UnknownOperation&) {
    throw;
  } catch (...) {
    // Normalising is done here, not by the daemon; an unreadable world only
    // means that no arming can be seen.
  }
  return HyraSim::NormalizeContainerId(id, normalized);
}
