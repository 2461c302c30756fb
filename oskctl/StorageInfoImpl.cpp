#include "ContainerId.h"
#include "HostOperation.h"
#include "MountedTarnFileSystem.h"
#include "OskCtl/Storage.h"
#include "Rows.h"

namespace OskCtl {
namespace Storage {
namespace {

using HyraSim::Access;

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

std::string Flag(bool value) { return value ? "true" : "false"; }

}  // namespace

StorageInfoImpl::StorageInfoImpl() = default;

StorageInfoImpl::~StorageInfoImpl() = default;

std::vector<HostCtl::Storage::TarnFileSystem*> StorageInfoImpl::GetTarnFileSystems() {
  std::vector<HyraSim::Mount> mounts;
  if (!RunHostOperation("GetTarnFileSystems", Access::kRead, {},
                        [&](sqlite3* db) { mounts = HyraSim::ReadMounts(db); })) {
    return {};
  }
  std::vector<std::unique_ptr<HostCtl::Storage::TarnFileSystem> > owned;
  owned.reserve(mounts.size());
  for (const auto& mount : mounts) owned.push_back(std::make_unique<MountedTarnFileSystem>(mount));
  std::vector<HostCtl::Storage::TarnFileSystem*> systems;
  systems.reserve(owned.size());
  for (auto& system : owned) systems.push_back(system.release());
  return systems;
}

HostCtl::Storage::TarnFileSystem* StorageInfoImpl::AddTarnFileSystem(
    const std::string& name, std::string& id, const std::vector<std::string>& arrayIds,
    bool persist) {
  HyraSim::Mount mount{name, id, arrayIds};
  if (!RunHostOperation("AddTarnFileSystem", Access::kWrite,
                        {name, id, HyraSim::JoinedArg(arrayIds), Flag(persist)}, [&](sqlite3* db) {
                          if (!HyraSim::IsValidMountName(name)) {
                            ThrowHostError("Cannot mount a container named \"" + name +
                                           "\": the name cannot be a directory name");
                          }
                          // A mount that could never be removed again (by its normal id) is
                          // refused.
                          const auto normalId = HyraSim::NormalContainerId(id);
                          if (!normalId) {
                            ThrowHostError("Cannot mount the container " + name + ": \"" + id +
                                           "\" is not a container id");
                          }
                          if (const auto named = HyraSim::FindMountNamed(db, name)) {
                            // The same container under the same name is already what was
                            // asked for (another process may have mounted it a moment ago).
                            if (HyraSim::SameContainerId(named->id, *normalId)) {
                              mount = *named;
                              return;
                            }
                            ThrowHostError("A container file system named " + name +
                                           " is already mounted at " + HyraSim::MountPath(name));
                          }
                          if (const auto other = HyraSim::FindMountOf(db, *normalId)) {
                            ThrowHostError("The container " + id + " is already mounted as " +
                                           other->name + " at " + HyraSim::MountPath(other->name));
                          }
                          HyraSim::AddMount(db, mount);
                        })) {
    return nullptr;
  }
  return new MountedTarnFileSystem(mount);
}

void StorageInfoImpl::RemoveTarnFileSystem(const std::string& normalizedId) {
  RunHostOperation("RemoveTarnFileSystem", Access::kWrite, {normalizedId}, [&](sqlite3* db) {
    if (HyraSim::RemoveMountsOf(db, normalizedId) == 0) {
      ThrowHostError("No container file system with id " + normalizedId + " is mounted");
    }
  });
}

HostCtl::Storage::TarnFileSystem* StorageInfoImpl::GetTarnFileSystemByPath(
    const std::string& path) {
  std::optional<HyraSim::Mount> found;
  if (!RunHostOperation("GetTarnFileSystemByPath", Access::kRead, {path},
                        [&](sqlite3* db) {
                          const std::string name = NameInPath(path);
                          if (!name.empty()) found = HyraSim::FindMountNamed(db, name);
                        }) ||
      !found) {
    return nullptr;
  }
  ownedByPath_.push_back(std::make_unique<MountedTarnFileSystem>(*found));
  return ownedByPath_.back().get();
}

bool StorageInfoImpl::TarnVpExists(const std::string& name) {
  bool exists = false;
  RunHostOperation("TarnVpExists", Access::kRead, {name},
                   [&](sqlite3* db) { exists = HyraSim::FindProviderNamed(db, name).has_value(); });
  return exists;
}

void StorageInfoImpl::GetTarnVendorProviders(
    const std::string& name, std::vector<HostCtl::Storage::VendorProviderInfo>& providers) {
  std::vector<HostCtl::Storage::VendorProviderInfo> found;
  RunHostOperation("GetTarnVendorProviders", Access::kRead, {name}, [&](sqlite3* db) {
    if (const auto provider = HyraSim::FindProviderNamed(db, name))
      found.push_back(ToInfo(*provider));
  });
  providers.insert(providers.end(), found.begin(), found.end());
}

void StorageInfoImpl::UpdateTarnVendorProvider(
    const std::vector<HostCtl::Storage::VendorProviderInfo>& providers) {
  HyraSim::CallArgs args;
  for (const auto& info : providers) {
    std::vector<std::string> arrays;
    for (const auto& array : info.arrays) {
      arrays.push_back(array.arrayId + (array.isActive ? " active " : " inactive ") +
                       std::to_string(array.priority));
    }
    args.push_back(info.name + " " + info.url + " [" + HyraSim::JoinedArg(arrays) + "]");
  }
  RunHostOperation("UpdateTarnVendorProvider", Access::kWrite, args, [&](sqlite3* db) {
    for (const auto& info : providers) HyraSim::StoreProvider(db, FromInfo(info));
  });
}

void StorageInfoImpl::NotifyTarnProtocolEndpointEvent(const std::string& endpoint,
                                                      HostCtl::Storage::ProtocolEndPointEvent event,
                                                      std::vector<std::string>& containers) {
  std::vector<std::string> affected;
  RunHostOperation(
      "NotifyTarnProtocolEndpointEvent", Access::kWrite,
      {endpoint, std::to_string(static_cast<int>(event))}, [&](sqlite3* db) {
        if (event != HostCtl::Storage::PE_APD_START && event != HostCtl::Storage::PE_APD_END) {
          ThrowHostError("Unknown protocol endpoint event " +
                         std::to_string(static_cast<int>(event)));
        }
        const auto owner =
            HyraSim::SetEndpointAccessible(db, endpoint, event == HostCtl::Storage::PE_APD_END);
        if (!owner) ThrowHostError("No protocol endpoint has the local UID " + endpoint);
        affected = HyraSim::MountsOnArray(db, *owner);
      });
  containers.insert(containers.end(), affected.begin(), affected.end());
}

}  // namespace Storage
}  // namespace OskCtl
