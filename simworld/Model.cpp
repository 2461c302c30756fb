#include "Model.h"

#include <algorithm>
#include <cctype>

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

bool WorldState::IsExported(const Container& container) const {
  return std::any_of(providers.begin(), providers.end(),
                     [&](const Provider& p) { return p.url == container.vpUrl; });
}

std::string UuidKey(const std::string& uuid) {
  std::string key = uuid;
  for (char& c : key) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return key;
}

std::string MountPath(const std::string& containerName) { return "/hyra/volumes/" + containerName; }

bool IsValidMountName(const std::string& name) {
  return !name.empty() && name != "." && name != ".." &&
         name.find_first_of(std::string("/\0", 2)) == std::string::npos;
}

}  // namespace HyraSim
