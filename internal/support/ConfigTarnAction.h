// What `configtarn mount`, `umount` and `remove` share: they name a config-tarn
// by UUID or directory name, find its container among the host's container
// file systems and hand the request to one operation of that file system.
#pragma once

#include <string>

#include "Fendle/CallSpec.h"
#include "HostCtl/Storage.h"
#include "support/CommandEndings.h"

namespace HalvikCli {
namespace TarnNamespace {

// Reported, followed by the container id, when no mounted container has it.
inline constexpr char kContainerNotFound[] = "Failed to find Tarn StorageContainer ";

// A file-system operation taking directory name, UUID, an always-empty text
// and the priority flag.
typedef void (HostCtl::Storage::TarnFileSystem::*ConfigTarnOperation)(const std::string& name,
                                                                      const std::string& uuid,
                                                                      const std::string& reserved,
                                                                      bool priority);

// One invocation of such a command. missingName is reported when the input
// gives neither uuid nor name.
void ExecuteConfigTarnAction(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                             ConfigTarnOperation operation, const char* missingName);

}  // namespace TarnNamespace
}  // namespace HalvikCli
