// The daemon's records as the commands read them. Each record the daemon
// client library hands out has an owner here that gives it back with the
// library's matching free function on every path; texts in the records are C
// strings that a record may lack, and a missing one reads as an empty text
// instead of being dereferenced.
#pragma once

#include <cstdlib>
#include <memory>
#include <string>

#include "Fendle/MetaObj.h"
#include "TarnLib/TarnLib.h"

namespace HalvikCli {
namespace TarnNamespace {

// Releases a daemon record with the library's matching free function.
template <typename Record, void (*Free)(Record*)>
struct TarnLibRecordFree {
  void operator()(Record* record) const { Free(record); }
};

template <typename Record, void (*Free)(Record*)>
using TarnLibRecordOwner = std::unique_ptr<Record, TarnLibRecordFree<Record, Free> >;

typedef TarnLibRecordOwner<TarnInfo, &TarnLib_FreeTarnInfo> TarnInfoOwner;
typedef TarnLibRecordOwner<TarnSpaceStatsInfo, &TarnLib_FreeTarnSpaceStatsInfo> TarnSpaceStatsOwner;
typedef TarnLibRecordOwner<TarnMetadata, &TarnLib_FreeTarnMetadata> TarnMetadataOwner;
typedef TarnLibRecordOwner<QueryResult, &TarnLib_FreeQueryResult> QueryResultOwner;
typedef TarnLibRecordOwner<StorageContainerResult, &TarnLib_FreeStorageContainerResult>
    ContainerResultOwner;

// The block of TarnLib_UnsharedChunksTarn is plain allocated memory.
struct UnsharedChunksFree {
  void operator()(void* block) const { std::free(block); }
};
typedef std::unique_ptr<void, UnsharedChunksFree> UnsharedChunksOwner;

// text, or an empty text when it is null.
inline std::string TextOf(const char* text) {
  return text != nullptr ? std::string(text) : std::string();
}

// Sets the text field of row to text; a text the record lacks leaves the
// field as it is.
inline void SetTextIfPresent(Fendle::MetaObj::MetaStruct& row, const char* field,
                             const char* text) {
  if (text != nullptr) row.SetField(field, text);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
