#include <algorithm>

#include "ContainerId.h"
#include "HostOperation.h"
#include "MountedTarnFileSystem.h"
#include "OskCtl/Storage.h"

namespace OskCtl {
namespace Storage {
namespace {

using HyraSim::Access;
using HyraSim::WorldState;

const char kVolumesDirectory[] = "/hyra/volumes/";

HostCtl::Storage::VendorProviderInfo ToInfo(const HyraSim::Provider& provider) {
  HostCtl::Storage::VendorProviderInfo info;
  info.name = provider.name;
  info.url = provider.url;
  info.reserved = provider.reserved;
  for (const auto& array : provider.arrays) {
    HostCtl::Storage::RelatedStorageArrayInfo related;
    related.arrayId = array.arrayId;
    related.isActive = array.isActive;
    related.priority = array.priority;
    info.arrays.push_back(related);
  }
  return info;
}

HyraSim::Provider FromInfo(const HostCtl::Storage::VendorProviderInfo& info) {
  HyraSim::Provider provider{info.name, info.url, info.reserved, {}};
  for (const auto& related : info.arrays) {
    provider.arrays.push_back({related.arrayId, related.isActive, related.priority});
  }
  return provider;
}

// The container name in a mount path, or an empty text for any other path.
std::string NameInPath(std::string path) {
  if (path.size() > 1 && path.back() == '/') path.pop_back();
  const std::string prefix = kVolumesDirectory;
  if (path.compare(0, prefix.size(), prefix) != 0) return std::string();
  const std::string name = path.substr(prefix.size());
  return HyraSim::IsValidMountName(name) ? name : std::string();
}

}  // namespace

StorageInfoImpl::StorageInfoImpl() = default;

StorageInfoImpl::~StorageInfoImpl() = default;

std::vector<HostCtl::Storage::TarnFileSystem*> StorageInfoImpl::GetTarnFileSystems() {
  std::vector<HyraSim::Mount> mounts;
  if (!RunHostOperation("GetTarnFileSystems", Access::kRead, [&](WorldState& w) {
        mounts = w.mounted;
        return 0u;
      })) {
    return {};
  }
  std::vector<std::unique_ptr<HostCtl::Storage::TarnFileSystem> > owned;
  for (const auto& mount : mounts) owned.push_back(std::make_unique<MountedTarnFileSystem>(mount));
  std::vector<HostCtl::Storage::TarnFileSystem*> systems;
  for (auto& system : owned) systems.push_back(system.release());
  return systems;
}

HostCtl::Storage::TarnFileSystem* StorageInfoImpl::AddTarnFileSystem(
    const std::string& name, std::string& id, const std::vector<std::string>& arrayIds,
    bool /*persist*/) {
  const HyraSim::Mount mount{name, id, arrayIds};
  if (!RunHostOperation("AddTarnFileSystem", Access::kWrite, [&](WorldState& w) {
        if (!HyraSim::IsValidMountName(name)) {
          ThrowHostError("Cannot mount a container named \"" + name +
                         "\": the name cannot be a directory name");
        }
        if (w.FindMount(name) != nullptr) {
          ThrowHostError("A container file system named " + name + " is already mounted at " +
                         HyraSim::MountPath(name));
        }
        w.mounted.push_back(mount);
        return unsigned{HyraSim::kSectionMounts};
      })) {
    return nullptr;
  }
  return new MountedTarnFileSystem(mount);
}

void StorageInfoImpl::RemoveTarnFileSystem(const std::string& normalizedId) {
  RunHostOperation("RemoveTarnFileSystem", Access::kWrite, [&](WorldState& w) {
    const auto removed = std::remove_if(w.mounted.begin(), w.mounted.end(), [&](const auto& m) {
      return HyraSim::SameContainerId(m.id, normalizedId);
    });
    if (removed == w.mounted.end()) {
      ThrowHostError("No container file system with id " + normalizedId + " is mounted");
    }
    w.mounted.erase(removed, w.mounted.end());
    return unsigned{HyraSim::kSectionMounts};
  });
}

HostCtl::Storage::TarnFileSystem* StorageInfoImpl::GetTarnFileSystemByPath(
    const std::string& path) {
  std::optional<HyraSim::Mount> found;
  if (!RunHostOperation("GetTarnFileSystemByPath", Access::kRead,
                        [&](WorldState& w) {
                          const std::string name = NameInPath(path);
                          if (const HyraSim::Mount* mount =
                                  name.empty() ? nullptr : w.FindMount(name)) {
                            found = *mount;
                          }
                          return 0u;
                        }) ||
      !found) {
    return nullptr;
  }
  ownedByPath_.push_back(std::make_unique<MountedTarnFileSystem>(*found));
  return ownedByPath_.back().get();
}

bool StorageInfoImpl::TarnVpExists(const std::string& name) {
  bool exists = false;
  RunHostOperation("TarnVpExists", Access::kRead, [&](WorldState& w) {
    exists = w.FindProvider(name) != nullptr;
    return 0u;
  });
  return exists;
}

void StorageInfoImpl::GetTarnVendorProviders(
    const std::string& name, std::vector<HostCtl::Storage::VendorProviderInfo>& providers) {
  std::vector<HostCtl::Storage::VendorProviderInfo> found;
  RunHostOperation("GetTarnVendorProviders", Access::kRead, [&](WorldState& w) {
    if (const HyraSim::Provider* provider = w.FindProvider(name))
      found.push_back(ToInfo(*provider));
    return 0u;
  });
  providers.insert(providers.end(), found.begin(), found.end());
}

void StorageInfoImpl::UpdateTarnVendorProvider(
    const std::vector<HostCtl::Storage::VendorProviderInfo>& providers) {
  RunHostOperation("UpdateTarnVendorProvider", Access::kWrite, [&](WorldState& w) {
    for (const auto& info : providers) {
      if (HyraSim::Provider* existing = w.FindProvider(info.name)) {
        *existing = FromInfo(info);
      } else {
        w.providers.push_back(FromInfo(info));
      }
    }
    return unsigned{HyraSim::kSectionProviders};
  });
}

void StorageInfoImpl::NotifyTarnProtocolEndpointEvent(const std::string& endpoint,
                                                      HostCtl::Storage::ProtocolEndPointEvent event,
                                                      std::vector<std::string>& containers) {
  std::vector<std::string> affected;
  RunHostOperation("NotifyTarnProtocolEndpointEvent", Access::kWrite, [&](WorldState& w) {
    if (event != HostCtl::Storage::PE_APD_START && event != HostCtl::Storage::PE_APD_END) {
      ThrowHostError("Unknown protocol endpoint event " + std::to_string(static_cast<int>(event)));
    }
    const HyraSim::StorageArray* owner = nullptr;
    for (auto& array : w.arrays) {
      for (auto& pe : array.endpoints) {
        if (pe.localUid == endpoint) {
          pe.accessible = event == HostCtl::Storage::PE_APD_END;
          owner = &array;
        }
      }
    }
    if (owner == nullptr) ThrowHostError("No protocol endpoint has the local UID " + endpoint);
    for (const auto& mount : w.mounted) {
      if (std::find(mount.arrays.begin(), mount.arrays.end(), owner->id) != mount.arrays.end()) {
        affected.push_back(mount.name);
      }
    }
    return unsigned{HyraSim::kSectionArrays};
  });
  containers.insert(containers.end(), affected.begin(), affected.end());
}

}  // namespace Storage
}  // namespace OskCtl
