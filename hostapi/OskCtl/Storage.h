// The host's storage-control library: mounted container file systems, Kiro
// providers, protocol-endpoint events and the Kiro context. Failures are thrown
// as HostCtl::Lib::HostCtlException.
#pragma once

#include "HostCtl/Lib.h"
#include "HostCtl/Storage.h"

#include <memory>
#include <string>
#include <vector>

namespace OskCtl {
namespace Storage {

class StorageInfoImpl {
 public:
  StorageInfoImpl();
  virtual ~StorageInfoImpl();
  StorageInfoImpl(const StorageInfoImpl&) = delete;
  StorageInfoImpl& operator=(const StorageInfoImpl&) = delete;

  // Every mounted container file system, in mount order. The caller deletes
  // each object.
  virtual std::vector<HostCtl::Storage::TarnFileSystem*> GetTarnFileSystems();
  // Mounts a container; answers the new file system, owned by the caller, or
  // null when the host mounted nothing.
  virtual HostCtl::Storage::TarnFileSystem* AddTarnFileSystem(
      const std::string& name, std::string& id, const std::vector<std::string>& arrayIds,
      bool persist);
  // Unmounts the container with that normalised id.
  virtual void RemoveTarnFileSystem(const std::string& normalizedId);
  // The file system mounted at path, or null. The object belongs to this
  // StorageInfoImpl and lives as long as it does.
  virtual HostCtl::Storage::TarnFileSystem* GetTarnFileSystemByPath(const std::string& path);

  virtual bool TarnVpExists(const std::string& name);
  // Appends the host's records of the provider of that name to providers.
  virtual void GetTarnVendorProviders(const std::string& name,
                                      std::vector<HostCtl::Storage::VendorProviderInfo>& providers);
  // Stores each record as the host's record of its name, replacing it whole.
  virtual void UpdateTarnVendorProvider(
      const std::vector<HostCtl::Storage::VendorProviderInfo>& providers);
  // Marks the endpoint inaccessible (start) or accessible (end) and appends the
  // names of the mounted containers that it serves to containers.
  virtual void NotifyTarnProtocolEndpointEvent(const std::string& endpoint,
                                               HostCtl::Storage::ProtocolEndPointEvent event,
                                               std::vector<std::string>& containers);

 private:
  std::vector<std::unique_ptr<HostCtl::Storage::TarnFileSystem> > ownedByPath_;
};

// The host's container file system; also holds the host-wide static operations.
class TarnFileSystemImpl : public HostCtl::Storage::TarnFileSystem {
 public:
  static void SetKiroContext(const std::string& uuid);
  static void ClearKiroContext();
  // Throws when no provider of that name is registered.
  static void UnRegisterVendorProvider(const std::string& name);

 protected:
  TarnFileSystemImpl() = default;
};

}  // namespace Storage
}  // namespace OskCtl
