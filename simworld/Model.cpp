#include "Model.h"

#include <algorithm>
#include <cctype>

#include "ContainerId.h"

namespace HyraSim {

const StorageArray* WorldState::FindArray(const std::string& id) const {
  for (const auto& array : arrays) {
    if (array.id == id) return &array;
  }
  return nullptr;
}

Provider* WorldState::FindProvider(const std::string& name) {
  for (auto& provider : providers) {
    if (provider.name == name) return &provider;
  }
  return nullptr;
}

Mount* WorldState::FindMount(const std::string& name) {
  for (auto& mount : mounted) {
    if (mount.name == name) return &mount;
  }
  return nullptr;
}

bool WorldState::IsExported(const Container& container) const {
  return std::any_of(providers.begin(), providers.end(),
                     [&](const Provider& p) { return p.url == container.vpUrl; });
}

Container* WorldState::DaemonContainer(const std::string& normalId) {
  for (auto& container : containers) {
    if (IsExported(container) && ContainerIdText(container.id) == normalId) return &container;
  }
  return nullptr;
}

Container* WorldState::ContainerMatching(const std::string& id) {
  for (auto& container : containers) {
    if (SameContainerId(container.id, id)) return &container;
  }
  return nullptr;
}

bool SameUuid(const std::string& a, const std::string& b) {
  return a.size() == b.size() && std::equal(a.begin(), a.end(), b.begin(), [](char x, char y) {
           return std::tolower(static_cast<unsigned char>(x)) ==
                  std::tolower(static_cast<unsigned char>(y));
         });
}

Tarn* FindTarn(Container& container, const std::string& uuid) {
  for (auto& tarn : container.tarns) {
    if (SameUuid(tarn.uuid, uuid)) return &tarn;
  }
  return nullptr;
}

Tarn* FindConfigTarn(Container& container, const std::string& name) {
  for (auto& tarn : container.tarns) {
    if (tarn.configTarn && tarn.configTarn->name == name) return &tarn;
  }
  return nullptr;
}

std::string MountPath(const std::string& containerName) { return "/hyra/volumes/" + containerName; }

bool IsValidMountName(const std::string& name) {
  return !name.empty() && name != "." && name != ".." &&
         name.find_first_of(std::string("/\0", 2)) == std::string::npos;
}

}  // namespace HyraSim
