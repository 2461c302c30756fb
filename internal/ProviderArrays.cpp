#include "ProviderArrays.h"

#include <cstdint>
#include <limits>
#include <sstream>

#include "ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

using HostCtl::Storage::RelatedStorageArrayInfo;

namespace {

// The host keeps a priority as a signed 32-bit integer; a wider value is
// refused rather than cut, which would store a different priority.
bool FitsPriority(int64_t value) {
  return value >= std::numeric_limits<int32_t>::min() &&
         value <= std::numeric_limits<int32_t>::max();
}

std::string PriorityOutOfRange(int64_t value) {
  std::ostringstream text;
  text << "Invalid value for parameter " << kPriority << ": " << value << " is outside the range "
       << std::numeric_limits<int32_t>::min() << " to " << std::numeric_limits<int32_t>::max();
  return text.str();
}

}  // namespace

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
  for (int64_t priority : priorities) {
    if (!FitsPriority(priority)) {
      error = PriorityOutOfRange(priority);
      return false;
    }
  }
  arrays.reserve(ids.size());
  for (std::size_t i = 0; i < ids.size(); ++i) {
    RelatedStorageArrayInfo array;
    array.arrayId = ids[i];
    array.isActive = flags[i];
    array.priority = static_cast<int32_t>(priorities[i]);
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

}  // namespace TarnNamespace
}  // namespace HalvikCli
