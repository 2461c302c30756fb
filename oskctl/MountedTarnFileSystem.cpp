#include "MountedTarnFileSystem.h"

#include <random>

#include "ContainerId.h"
#include "HostOperation.h"
#include "Rows.h"

namespace OskCtl {
namespace Storage {
namespace {

using HyraSim::Access;
using HyraSim::Container;
using HyraSim::Tarn;

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
  return CountHostCall("GetContainerName", {name_}) ? name_ : std::string();
}

std::string MountedTarnFileSystem::GetContainerId() const {
  return CountHostCall("GetContainerId", {name_}) ? id_ : std::string();
}

std::string MountedTarnFileSystem::GetContainerIdText() const {
  return CountHostCall("GetContainerIdText", {name_}) ? HyraSim::ContainerIdText(id_)
                                                      : std::string();
}

bool MountedTarnFileSystem::MatchesContainerId(const std::string& id) const {
  return CountHostCall("MatchesContainerId", {name_, id}) && HyraSim::SameContainerId(id_, id);
}

std::vector<HostCtl::Storage::TarnAccessibilityType> MountedTarnFileSystem::CheckTarnAccessibility(
    const std::vector<std::string>& tarnIds) {
  std::vector<HostCtl::Storage::TarnAccessibilityType> states;
  RunHostOperation(
      "CheckTarnAccessibility", Access::kRead, {name_, HyraSim::JoinedArg(tarnIds)},
      [&](sqlite3* db) {
        const auto container = HyraSim::FindContainerOf(db, id_);
        states.reserve(tarnIds.size());
        for (const std::string& id : tarnIds) {
          const auto tarn = container ? HyraSim::FindTarnIn(db, container->pos, id) : std::nullopt;
          // A world may hold any 32-bit state; the enumeration's fixed type keeps it.
          states.push_back(
              tarn ? static_cast<HostCtl::Storage::TarnAccessibilityType>(tarn->tarn.accessibility)
                   : HostCtl::Storage::TARN_NON_EXISTENT);
        }
      });
  return states;  // empty when the operation is armed to answer nothing
}

HyraSim::ContainerRow MountedTarnFileSystem::DaemonContainer(sqlite3* db) const {
  const auto mount = HyraSim::FindMountNamed(db, name_);
  if (!mount || mount->id != id_) {
    ThrowHostError("The container file system " + name_ + " is no longer mounted");
  }
  const auto normalId = HyraSim::NormalContainerId(id_);
  auto container = normalId ? HyraSim::FindExportedContainer(db, *normalId) : std::nullopt;
  if (!container) {
    ThrowHostError("Tarnd does not know the container " + id_ + " mounted as " + name_);
  }
  return *container;
}

void MountedTarnFileSystem::CreateConfigTarn(const std::string& name, const std::string& policy,
                                             int64_t sizeMB, const std::string& vmUuid,
                                             std::string& createdPath,
                                             const std::string& /*reserved*/, bool /*priority*/) {
  std::string path;
  const bool ran = RunHostOperation(
      "CreateConfigTarn", Access::kWrite, {name_, name, policy, std::to_string(sizeMB), vmUuid},
      [&](sqlite3* db) {
        const HyraSim::ContainerRow row = DaemonContainer(db);
        const Container& container = row.container;
        if (!IsValidConfigTarnName(name)) {
          ThrowHostError("\"" + name + "\" cannot be the directory name of a config-tarn");
        }
        if (HyraSim::FindConfigTarnIn(db, row.pos, name)) {
          ThrowHostError("A config-tarn named " + name + " already exists in " + container.name);
        }
        if (sizeMB < 0) ThrowHostError("The size of a config-tarn cannot be negative");
        if (sizeMB > container.maxTarnSizeMB) {
          ThrowHostError("The size " + std::to_string(sizeMB) +
                         " MB is above the largest tarn size " +
                         std::to_string(container.maxTarnSizeMB) + " MB of " + container.name);
        }
        Tarn tarn;
        do {
          tarn.uuid = NewUuid();
        } while (HyraSim::FindTarnIn(db, row.pos, tarn.uuid));
        tarn.logicalSizeMB = sizeMB;
        tarn.unsharedSizeMB = 0;
        tarn.configTarn = HyraSim::ConfigTarn{name, policy, vmUuid, false};
        HyraSim::AddTarn(db, row.pos, tarn);
        path = HyraSim::MountPath(name_) + "/" + name;
      });
  if (ran) createdPath = path;
}

void MountedTarnFileSystem::ActOnConfigTarn(
    const char* operation, const std::string& name, const std::string& uuid,
    const std::function<void(sqlite3*, int64_t, const HyraSim::TarnRow&)>& act) {
  RunHostOperation(operation, Access::kWrite, {name_, name, uuid}, [&](sqlite3* db) {
    const HyraSim::ContainerRow container = DaemonContainer(db);
    if (name.empty() && uuid.empty()) ThrowHostError("Either a config-tarn name or UUID is needed");
    const auto tarn = uuid.empty() ? HyraSim::FindConfigTarnIn(db, container.pos, name)
                                   : HyraSim::FindTarnIn(db, container.pos, uuid);
    if (!tarn) {
      ThrowHostError(uuid.empty()
                         ? "No config-tarn named " + name + " in " + container.container.name
                         : "No tarn with UUID " + uuid + " in " + container.container.name);
    }
    if (!tarn->tarn.configTarn)
      ThrowHostError("The tarn " + tarn->tarn.uuid + " is not a config-tarn");
    act(db, container.pos, *tarn);
  });
}

void MountedTarnFileSystem::MountConfigTarn(const std::string& name, const std::string& uuid,
                                            const std::string& /*reserved*/, bool /*priority*/) {
  ActOnConfigTarn("MountConfigTarn", name, uuid,
                  [](sqlite3* db, int64_t containerPos, const HyraSim::TarnRow& tarn) {
                    const HyraSim::ConfigTarn& configTarn = *tarn.tarn.configTarn;
                    if (configTarn.mounted)
                      ThrowHostError("The config-tarn " + configTarn.name + " is already mounted");
                    HyraSim::SetConfigTarnMounted(db, containerPos, tarn.pos, true);
                  });
}

void MountedTarnFileSystem::UnmountConfigTarn(const std::string& name, const std::string& uuid,
                                              const std::string& /*reserved*/, bool /*priority*/) {
  ActOnConfigTarn("UnmountConfigTarn", name, uuid,
                  [](sqlite3* db, int64_t containerPos, const HyraSim::TarnRow& tarn) {
                    const HyraSim::ConfigTarn& configTarn = *tarn.tarn.configTarn;
                    if (!configTarn.mounted)
                      ThrowHostError("The config-tarn " + configTarn.name + " is not mounted");
                    HyraSim::SetConfigTarnMounted(db, containerPos, tarn.pos, false);
                  });
}

void MountedTarnFileSystem::RemoveConfigTarn(const std::string& name, const std::string& uuid,
                                             const std::string& /*reserved*/, bool /*priority*/) {
  // Removing unmounts first, so a mounted config-tarn goes as well.
  ActOnConfigTarn("RemoveConfigTarn", name, uuid,
                  [](sqlite3* db, int64_t containerPos, const HyraSim::TarnRow& tarn) {
                    HyraSim::RemoveTarn(db, containerPos, tarn.pos);
                  });
}

}  // namespace Storage
}  // namespace OskCtl
