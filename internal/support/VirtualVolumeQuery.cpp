#include "support/VirtualVolumeQuery.h"

#include "support/ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

namespace {

constexpr char kInvalidContainerId[] = "Container Id is not valid.";
constexpr char kEmptyUuid[] = "Tarn UUID cannot be empty.";

}  // namespace

bool ReadVirtualVolumeAddress(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                              VirtualVolumeAddress& address) {
  address.uuid = input.GetString(kUuid);
  const std::string containerId = input.GetString(kContainerId);
  if (!TarnLib_NormalizeContainerIdString(containerId.c_str(), address.containerId)) {
    EndWithError(output, kInvalidContainerId);
    return false;
  }
  // The text is used as a C string from here on, whatever the library wrote.
  address.containerId[TARNLIB_CONTAINER_ID_TEXT_SIZE - 1] = '\0';
  if (address.uuid.empty()) {
    EndWithError(output, kEmptyUuid);
    return false;
  }
  return true;
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
