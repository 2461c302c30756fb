// The container file systems the host hands out belong to the caller, who
// must delete each one. This list owns them from the moment they arrive, so
// none outlives the command by any path out of it, exceptions included.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"

namespace HalvikCli {
namespace TarnNamespace {

typedef std::vector<std::unique_ptr<HostCtl::Storage::TarnFileSystem> > TarnFileSystemList;

// GetTarnFileSystems of storageInfo, every object owned by the answer.
TarnFileSystemList TakeTarnFileSystems(OskCtl::Storage::StorageInfoImpl& storageInfo);

// The first file system, in list order, whose MatchesContainerId(id) answers
// true, or null. Asks no further once one matched.
HostCtl::Storage::TarnFileSystem* FindByContainerId(const TarnFileSystemList& systems,
                                                    const std::string& id);

}  // namespace TarnNamespace
}  // namespace HalvikCli
