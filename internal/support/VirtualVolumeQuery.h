// What the `virtualvolume` commands share: the volume's address as the daemon
// takes it.
#pragma once

#include <string>

#include "Fendle/CallSpec.h"
#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"

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

}  // namespace TarnNamespace
}  // namespace HalvikCli
