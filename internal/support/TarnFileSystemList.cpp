#include "support/TarnFileSystemList.h"

namespace HalvikCli {
namespace TarnNamespace {

using HostCtl::Storage::TarnFileSystem;

TarnFileSystemList TakeTarnFileSystems(OskCtl::Storage::StorageInfoImpl& storageInfo) {
  const std::vector<TarnFileSystem*> handedOut = storageInfo.GetTarnFileSystems();
  TarnFileSystemList owned;
  try {
    owned.reserve(handedOut.size());
  } catch (...) {
    for (TarnFileSystem* system : handedOut) delete system;
    throw;
  }
  // Cannot throw once the room is reserved.
  for (TarnFileSystem* system : handedOut) owned.emplace_back(system);
  return owned;
}

TarnFileSystem* FindByContainerId(const TarnFileSystemList& systems, const std::string& id) {
  for (const auto& system : systems) {
    if (system->MatchesContainerId(id)) return system.get();
  }
  return nullptr;
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
