// Records and objects of the host's storage-control layer.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace HostCtl {
namespace Storage {

// One storage array served by a Kiro provider.
struct RelatedStorageArrayInfo {
  std::string arrayId;
  bool isActive = true;   // whether the provider is the active one for this array
  int32_t priority = 0;   // the provider's priority for this array
};

// One Kiro provider known to the host.
struct VendorProviderInfo {
  std::string name;
  std::string url;
  std::string reserved;  // kept by the host; commands neither set nor read it
  std::vector<RelatedStorageArrayInfo> arrays;
};

// The start (0) or the end (1) of an all-paths-down (APD) condition of a
// protocol endpoint.
enum ProtocolEndPointEvent : int32_t { PE_APD_START = 0, PE_APD_END = 1 };

// Whether the host can reach a tarn of a container. The fixed 32-bit type lets
// a host answer a state this list does not name.
enum TarnAccessibilityType : int32_t {
  TARN_NON_EXISTENT = 0,
  TARN_UNCONFIRMED = 1,
  TARN_INACCESSIBLE = 2,
  TARN_ACCESSIBLE = 3,
};

// One mounted container file system. Every operation may throw
// HostCtl::Lib::HostCtlException.
class TarnFileSystem {
 public:
  virtual ~TarnFileSystem();

  virtual std::string GetContainerName() const = 0;
  // The container id as it was given when the container was mounted.
  virtual std::string GetContainerId() const = 0;
  // The text that names the container to the daemon.
  virtual std::string GetContainerIdText() const = 0;
  // True when id names this container (ids compare by their normal form).
  virtual bool MatchesContainerId(const std::string& id) const = 0;
  // One state per id, in the order of the ids.
  virtual std::vector<TarnAccessibilityType> CheckTarnAccessibility(
      const std::vector<std::string>& tarnIds) = 0;

  // Creates a config-tarn (a directory object) in this container. createdPath
  // receives where the new object lives; reserved is passed empty.
  virtual void CreateConfigTarn(const std::string& name, const std::string& policy,
                                int64_t sizeMB, const std::string& vmUuid,
                                std::string& createdPath, const std::string& reserved,
                                bool priority) = 0;
  // The next three name the config-tarn by directory name or by UUID (the
  // other one empty); reserved is passed empty.
  virtual void MountConfigTarn(const std::string& name, const std::string& uuid,
                               const std::string& reserved, bool priority) = 0;
  virtual void UnmountConfigTarn(const std::string& name, const std::string& uuid,
                                 const std::string& reserved, bool priority) = 0;
  virtual void RemoveConfigTarn(const std::string& name, const std::string& uuid,
                                const std::string& reserved, bool priority) = 0;

 protected:
  TarnFileSystem() = default;
  TarnFileSystem(const TarnFileSystem&) = default;
  TarnFileSystem& operator=(const TarnFileSystem&) = default;
};

}  // namespace Storage
}  // namespace HostCtl
