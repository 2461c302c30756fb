#include "support/ProviderArrays.h"

#include <cstdint>
#include <sstream>

#include "support/Int32Values.h"
#include "support/ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

using HostCtl::Storage::RelatedStorageArrayInfo;

bool ReadProviderArrays(const Fendle::CallSpec::Input& input,
                        std::vector<RelatedStorageArrayInfo>& arrays, std::string& error) {
  arrays.clear();
  const std::vector<std::string> ids = input.GetStringList(kArrayId);
  const std::vector<int64_t> priorities = input.GetIntList(kPriority);
  const std::vector<bool> flags = input.GetBoolList(kIsActive);
  if (ids.size() != priorities.size() || ids.size() != flags.size()) {
    error = kArrayListMismatch;
    return false;
  }
  // The host keeps a priority in 32 bits.
  std::vector<int32_t> narrowed(priorities.size());
  for (std::size_t i = 0; i < priorities.size(); ++i) {
    if (!NarrowToInt32(kPriority, priorities[i], narrowed[i], error)) {
      return false;
    }
  }
  arrays.reserve(ids.size());
  for (std::size_t i = 0; i < ids.size(); ++i) {
    RelatedStorageArrayInfo array;
    array.arrayId = ids[i];
    array.isActive = flags[i];
    array.priority = narrowed[i];
    arrays.push_back(array);
  }
  return true;
}

HostCtl::Storage::VendorProviderInfo MakeProviderRecord(
    const std::string& name, const std::string& url,
    const std::vector<RelatedStorageArrayInfo>& arrays) {
  HostCtl::Storage::VendorProviderInfo provider;
  provider.name = name;
  provider.url = url;
  provider.arrays = arrays;
  return provider;
}

bool LookUpStoredProviderUrl(OskCtl::Storage::StorageInfoImpl& storageInfo, const std::string& name,
                             std::string& url) {
  std::vector<HostCtl::Storage::VendorProviderInfo> known;
  storageInfo.GetTarnVendorProviders(name, known);
  if (known.empty()) return false;
  url = known.front().url;
  return true;
}

void EndWithUnknownProvider(const OutputPtr& output, const char* prefix, const std::string& name) {
  std::ostringstream text;
  text << prefix << name << " does not exist" << std::endl;
  EndWithError(output, text.str());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
