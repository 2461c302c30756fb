// Queries of one volume (tarn) of a container the daemon knows.
#include <cstring>
#include <limits>

#include "DaemonCall.h"
#include "Records.h"
#include "Status.h"
#include "TarnLib/TarnLib.h"

using HyraSim::Access;
using HyraSim::Tarn;
using TarnSim::Allocate;
using TarnSim::CopyText;

namespace {

constexpr int64_t kBytesPerMB = 1024 * 1024;

// Looks the tarn up as the call function and, unless an armed failure asks
// for nothing, hands it to build, which fills the result. place is set only
// on success. With metadata the tarn's metadata is read as well.
template <typename T, typename Build>
TarnLib_Status QueryTarn(const char* function, const char* containerId, const char* uuid, T** place,
                         Build build, bool metadata = false) {
  if (place == nullptr) return TarnSim::kInvalidArgument;
  Tarn tarn;
  const TarnSim::CallOutcome outcome = TarnSim::CallDaemon(
      function, Access::kRead, {TarnSim::Arg(containerId), TarnSim::Arg(uuid)}, [&](sqlite3* db) {
        const TarnSim::KnownTarn known = TarnSim::FindKnownTarn(db, containerId, uuid);
        tarn = known.row.tarn;
        if (metadata)
          tarn.metadata = HyraSim::ReadTarnMetadata(db, known.containerPos, known.row.pos);
      });
  if (outcome.status != TARNLIB_OK) return outcome.status;
  if (outcome.nothing) {
    *place = nullptr;
    return TARNLIB_OK;
  }
  try {
    *place = build(tarn);
  } catch (...) {
    return TarnSim::StatusOfCurrentException();
  }
  return TARNLIB_OK;
}

}  // namespace

extern "C" void TarnLib_FreeTarnInfo(TarnInfo* info) {
  if (info == nullptr) return;
  free(info->uuid);
  free(info->storageProfile);
  free(info);
}

extern "C" TarnLib_Status TarnLib_GetTarnInfo(const char* containerId, const char* uuid,
                                              TarnInfo** info) {
  return QueryTarn("TarnLib_GetTarnInfo", containerId, uuid, info, [](const Tarn& tarn) {
    TarnSim::Owned<TarnInfo> built(Allocate<TarnInfo>(), &TarnLib_FreeTarnInfo);
    built->uuid = CopyText(tarn.uuid);
    if (tarn.storageProfile) built->storageProfile = CopyText(*tarn.storageProfile);
    built->logicalSizeMB = tarn.logicalSizeMB;
    built->accessibility = tarn.accessibility;
    return built.release();
  });
}

extern "C" void TarnLib_FreeTarnSpaceStatsInfo(TarnSpaceStatsInfo* stats) { free(stats); }

extern "C" TarnLib_Status TarnLib_SpaceStatsForTarn(const char* containerId, const char* uuid,
                                                    TarnSpaceStatsInfo** stats) {
  return QueryTarn("TarnLib_SpaceStatsForTarn", containerId, uuid, stats, [](const Tarn& tarn) {
    auto* built = Allocate<TarnSpaceStatsInfo>();
    built->logicalSizeMB = tarn.logicalSizeMB;
    built->committedSizeMB = tarn.committedSizeMB;
    built->unsharedSizeValid = tarn.unsharedSizeMB.has_value();
    built->unsharedSizeMB = tarn.unsharedSizeMB.value_or(0);
    return built;
  });
}

extern "C" void TarnLib_FreeTarnMetadata(TarnMetadata* metadata) {
  if (metadata == nullptr) return;
  TarnMetadataEntry* entry = metadata->first;
  while (entry != nullptr) {
    TarnMetadataEntry* next = entry->next;
    free(entry->key);
    free(entry->value);
    free(entry);
    entry = next;
  }
  free(metadata);
}

extern "C" TarnLib_Status TarnLib_GetTarnMetadata(const char* containerId, const char* uuid,
                                                  TarnMetadata** metadata) {
  return QueryTarn(
      "TarnLib_GetTarnMetadata", containerId, uuid, metadata,
      [](const Tarn& tarn) {
        TarnSim::Owned<TarnMetadata> built(Allocate<TarnMetadata>(), &TarnLib_FreeTarnMetadata);
        // Each entry joins the chain before it is filled, so the chain is always
        // whole enough to be freed.
        TarnMetadataEntry** next = &built->first;
        for (const auto& pair : tarn.metadata) {
          *next = Allocate<TarnMetadataEntry>();
          (*next)->key = CopyText(pair.first);
          (*next)->value = CopyText(pair.second);
          next = &(*next)->next;
        }
        return built.release();
      },
      true);
}

extern "C" TarnLib_Status TarnLib_UnsharedChunksTarn(const char* containerId, const char* uuid,
                                                     uint64_t /*offset*/, uint64_t /*length*/,
                                                     uint32_t /*chunkLimit*/, uint32_t /*flags*/,
                                                     uint32_t /*reserved*/, void** block) {
  return QueryTarn("TarnLib_UnsharedChunksTarn", containerId, uuid, block, [](const Tarn& tarn) {
    // The block: the block size in bytes, then the number of unshared chunks.
    const int64_t unsharedMB = tarn.unsharedSizeMB.value_or(0);
    const int64_t chunks = unsharedMB > std::numeric_limits<int64_t>::max() / kBytesPerMB
                               ? std::numeric_limits<int64_t>::max() / tarn.blockSize
                               : unsharedMB * kBytesPerMB / tarn.blockSize;
    const int64_t words[2] = {tarn.blockSize, chunks};
    void* built = Allocate<int64_t>(2);
    std::memcpy(built, words, sizeof(words));
    return built;
  });
}
