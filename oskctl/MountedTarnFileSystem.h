// A container file system as the host hands it out: the name and id it was
// mounted with; the config-tarn operations act on the daemon's container of
// that id.
#pragma once

#include <sqlite3.h>

#include <functional>
#include <string>
#include <vector>

#include "Model.h"
#include "OskCtl/Storage.h"
#include "Rows.h"

namespace OskCtl {
namespace Storage {

class MountedTarnFileSystem : public TarnFileSystemImpl {
 public:
  explicit MountedTarnFileSystem(const HyraSim::Mount& mount);

  std::string GetContainerName() const override;
  std::string GetContainerId() const override;
  std::string GetContainerIdText() const override;
  bool MatchesContainerId(const std::string& id) const override;
  std::vector<HostCtl::Storage::TarnAccessibilityType> CheckTarnAccessibility(
      const std::vector<std::string>& tarnIds) override;

  void CreateConfigTarn(const std::string& name, const std::string& policy, int64_t sizeMB,
                        const std::string& vmUuid, std::string& createdPath,
                        const std::string& reserved, bool priority) override;
  void MountConfigTarn(const std::string& name, const std::string& uuid,
                       const std::string& reserved, bool priority) override;
  void UnmountConfigTarn(const std::string& name, const std::string& uuid,
                         const std::string& reserved, bool priority) override;
  void RemoveConfigTarn(const std::string& name, const std::string& uuid,
                        const std::string& reserved, bool priority) override;

 private:
  // The daemon's container behind this file system; throws when the file
  // system is no longer mounted or the daemon does not know the container.
  HyraSim::ContainerRow DaemonContainer(sqlite3* db) const;
  // Finds the config-tarn named by uuid (when given) or name and hands it,
  // with its container's position, to act, all as one operation.
  void ActOnConfigTarn(const char* operation, const std::string& name, const std::string& uuid,
                       const std::function<void(sqlite3*, int64_t, const HyraSim::TarnRow&)>& act);

  std::string name_;
  std::string id_;
};

}  // namespace Storage
}  // namespace OskCtl
