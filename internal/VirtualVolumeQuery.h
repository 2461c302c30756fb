// What the `virtualvolume` commands share: the volume's address as the daemon
// takes it, and owners that give the daemon's volume records back on every
// path.
#pragma once

#include <cstdlib>
#include <memory>
#include <string>

#include "CommandEndings.h"
#include "Fendle/CallSpec.h"
#include "TarnLib/TarnLib.h"

namespace HalvikCli {
namespace TarnNamespace {

// One volume: the UUID as given and the container id in its normal form,
// which every daemon call and every result uses instead of the text given.
struct VirtualVolumeAddress {
  std::string uuid;
  char containerId[TARNLIB_CONTAINER_ID_TEXT_SIZE] = {};
};

// Reads uuid, then container-id, and checks the container id before the UUID.
// On a failure reports its text (no result, no Finish) and answers false.
// The daemon client library must be open.
bool ReadVirtualVolumeAddress(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                              VirtualVolumeAddress& address);

// Releases a daemon record with the library's matching free function.
template <typename Record, void (*Free)(Record*)>
struct TarnLibRecordFree {
  void operator()(Record* record) const { Free(record); }
};

typedef std::unique_ptr<TarnInfo, TarnLibRecordFree<TarnInfo, &TarnLib_FreeTarnInfo> >
    TarnInfoOwner;
typedef std::unique_ptr<TarnSpaceStatsInfo,
                        TarnLibRecordFree<TarnSpaceStatsInfo, &TarnLib_FreeTarnSpaceStatsInfo> >
    TarnSpaceStatsOwner;
typedef std::unique_ptr<TarnMetadata, TarnLibRecordFree<TarnMetadata, &TarnLib_FreeTarnMetadata> >
    TarnMetadataOwner;

// The block of TarnLib_UnsharedChunksTarn is plain allocated memory.
struct UnsharedChunksFree {
  void operator()(void* block) const { std::free(block); }
};
typedef std::unique_ptr<void, UnsharedChunksFree> UnsharedChunksOwner;

}  // namespace TarnNamespace
}  // namespace HalvikCli
