#include "support/ConfigTarnAction.h"

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "support/ParameterNames.h"
#include "support/TarnFileSystemList.h"

namespace HalvikCli {
namespace TarnNamespace {

void ExecuteConfigTarnAction(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                             ConfigTarnOperation operation, const char* missingName) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  const std::string containerId = input.GetString(kContainerId);
  std::string name;
  std::string uuid;
  const bool priority = input.IsSet(kPriority);

  // A UUID names the config-tarn on its own; the name is then not even read.
  if (input.IsSet(kUuid)) {
    uuid = input.GetString(kUuid);
  } else if (input.IsSet(kName)) {
    name = input.GetString(kName);
  } else {
    EndWithErrorAndFalse(output, missingName);
    return;
  }

  const TarnFileSystemList systems = TakeTarnFileSystems(storageInfo);
  HostCtl::Storage::TarnFileSystem* container = nullptr;
  try {
    container = FindByContainerId(systems, containerId);
    if (container != nullptr) {
      (container->*operation)(name, uuid, std::string(), priority);
      EndWithTrue(output);
    }
  } catch (const HostCtl::Lib::HostCtlException& e) {
    // The host's text alone says what went wrong.
    EndWithError(output, e.GetMessage(false));
    return;
  }
  if (container == nullptr) EndWithErrorAndFalse(output, kContainerNotFound + containerId);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
