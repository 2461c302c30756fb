#include "MountedTarnFileSystem.h"

#include <random>

#include "ContainerId.h"
#include "HostOperation.h"

namespace OskCtl {
namespace Storage {
namespace {

using HyraSim::Access;
using HyraSim::Container;
using HyraSim::Tarn;
using HyraSim::WorldState;

// A random (version 4) UUID in lower case.
std::string NewUuid() {
  std::random_device source;
  unsigned char bytes[16];
  for (auto& byte : bytes) byte = static_cast<unsigned char>(source() & 0xff);
  bytes[6] = static_cast<unsigned char>((bytes[6] & 0x0f) | 0x40);
  bytes[8] = static_cast<unsigned char>((bytes[8] & 0x3f) | 0x80);
  std::string text;
  for (int i = 0; i < 16; ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text += '-';
    text += "0123456789abcdef"[bytes[i] >> 4];
    text += "0123456789abcdef"[bytes[i] & 0x0f];
  }
  return text;
}

// Directory names of config-tarns live inside the container's directory.
bool IsValidConfigTarnName(const std::string& name) { return HyraSim::IsValidMountName(name); }

}  // namespace

MountedTarnFileSystem::MountedTarnFileSystem(const HyraSim::Mount& mount)
    : name_(mount.name), id_(mount.id) {}

std::string MountedTarnFileSystem::GetContainerName() const {
  return CountHostCall("GetContainerName") ? name_ : std::string();
}

std::string MountedTarnFileSystem::GetContainerId() const {
  return CountHostCall("GetContainerId") ? id_ : std::string();
}

std::string MountedTarnFileSystem::GetContainerIdText() const {
  return CountHostCall("GetContainerIdText") ? HyraSim::ContainerIdText(id_) : std::string();
}

bool MountedTarnFileSystem::MatchesContainerId(const std::string& id) const {
  return CountHostCall("MatchesContainerId") && HyraSim::SameContainerId(id_, id);
}

std::vector<HostCtl::Storage::TarnAccessibilityType> MountedTarnFileSystem::CheckTarnAccessibility(
    const std::vector<std::string>& tarnIds) {
  std::vector<HostCtl::Storage::TarnAccessibilityType> states;
  RunHostOperation("CheckTarnAccessibility", Access::kRead, [&](WorldState& w) {
    Container* container = w.ContainerMatching(id_);
    for (const std::string& id : tarnIds) {
      const Tarn* tarn = container != nullptr ? HyraSim::FindTarn(*container, id) : nullptr;
      // A world may hold any 32-bit state; the enumeration's fixed type keeps it.
      states.push_back(tarn != nullptr
                           ? static_cast<HostCtl::Storage::TarnAccessibilityType>(tarn->accessibility)
                           : HostCtl::Storage::TARN_NON_EXISTENT);
    }
    return 0u;
  });
  return states;  // empty when the operation is armed to answer nothing
}

Container& MountedTarnFileSystem::DaemonContainer(WorldState& world) const {
  const HyraSim::Mount* mount = world.FindMount(name_);
  if (mount == nullptr || mount->id != id_) {
    ThrowHostError("The container file system " + name_ + " is no longer mounted");
  }
  const auto normalId = HyraSim::NormalContainerId(id_);
  Container* container = normalId ? world.DaemonContainer(*normalId) : nullptr;
  if (container == nullptr) {
    ThrowHostError("Tarnd does not know the container " + id_ + " mounted as " + name_);
  }
  return *container;
}

void MountedTarnFileSystem::CreateConfigTarn(const std::string& name, const std::string& policy,
                                             int64_t sizeMB, const std::string& vmUuid,
                                             std::string& createdPath,
                                             const std::string& /*reserved*/, bool /*priority*/) {
  std::string path;
  const bool ran = RunHostOperation("CreateConfigTarn", Access::kWrite, [&](WorldState& w) {
    Container& container = DaemonContainer(w);
    if (!IsValidConfigTarnName(name)) {
      ThrowHostError("\"" + name + "\" cannot be the directory name of a config-tarn");
    }
    if (HyraSim::FindConfigTarn(container, name) != nullptr) {
      ThrowHostError("A config-tarn named " + name + " already exists in " + container.name);
    }
    if (sizeMB < 0) ThrowHostError("The size of a config-tarn cannot be negative");
    if (sizeMB > container.maxTarnSizeMB) {
      ThrowHostError("The size " + std::to_string(sizeMB) + " MB is above the largest tarn size " +
                     std::to_string(container.maxTarnSizeMB) + " MB of " + container.name);
    }
    Tarn tarn;
    do {
      tarn.uuid = NewUuid();
    } while (HyraSim::FindTarn(container, tarn.uuid) != nullptr);
    tarn.logicalSizeMB = sizeMB;
    tarn.unsharedSizeMB = 0;
    tarn.configTarn = HyraSim::ConfigTarn{name, policy, vmUuid, false};
    container.tarns.push_back(tarn);
    path = HyraSim::MountPath(name_) + "/" + name;
    return unsigned{HyraSim::kSectionContainers};
  });
  if (ran) createdPath = path;
}

void MountedTarnFileSystem::ActOnConfigTarn(const char* operation, const std::string& name,
                                            const std::string& uuid,
                                            const std::function<void(Container&, size_t)>& act) {
  RunHostOperation(operation, Access::kWrite, [&](WorldState& w) {
    Container& container = DaemonContainer(w);
    if (name.empty() && uuid.empty()) ThrowHostError("Either a config-tarn name or UUID is needed");
    const Tarn* tarn = uuid.empty() ? HyraSim::FindConfigTarn(container, name)
                                    : HyraSim::FindTarn(container, uuid);
    if (tarn == nullptr) {
      ThrowHostError(uuid.empty() ? "No config-tarn named " + name + " in " + container.name
                                  : "No tarn with UUID " + uuid + " in " + container.name);
    }
    if (!tarn->configTarn) ThrowHostError("The tarn " + tarn->uuid + " is not a config-tarn");
    act(container, static_cast<size_t>(tarn - container.tarns.data()));
    return unsigned{HyraSim::kSectionContainers};
  });
}

void MountedTarnFileSystem::MountConfigTarn(const std::string& name, const std::string& uuid,
                                            const std::string& /*reserved*/, bool /*priority*/) {
  ActOnConfigTarn("MountConfigTarn", name, uuid, [](Container& container, size_t index) {
    HyraSim::ConfigTarn& configTarn = *container.tarns[index].configTarn;
    if (configTarn.mounted)
      ThrowHostError("The config-tarn " + configTarn.name + " is already mounted");
    configTarn.mounted = true;
  });
}

void MountedTarnFileSystem::UnmountConfigTarn(const std::string& name, const std::string& uuid,
                                              const std::string& /*reserved*/, bool /*priority*/) {
  ActOnConfigTarn("UnmountConfigTarn", name, uuid, [](Container& container, size_t index) {
    HyraSim::ConfigTarn& configTarn = *container.tarns[index].configTarn;
    if (!configTarn.mounted)
      ThrowHostError("The config-tarn " + configTarn.name + " is not mounted");
    configTarn.mounted = false;
  });
}

void MountedTarnFileSystem::RemoveConfigTarn(const std::string& name, const std::string& uuid,
                                             const std::string& /*reserved*/, bool /*priority*/) {
  // Removing unmounts first, so a mounted config-tarn goes as well.
  ActOnConfigTarn("RemoveConfigTarn", name, uuid, [](Container& container, size_t index) {
    container.tarns.erase(container.tarns.begin() + static_cast<std::ptrdiff_t>(index));
  });
}

}  // namespace Storage
}  // namespace OskCtl
