#include "support/Int32Values.h"

#include <limits>
#include <sstream>

namespace HalvikCli {
namespace TarnNamespace {

bool NarrowToInt32(const char* name, int64_t value, int32_t& narrowed, std::string& error) {
  constexpr int64_t kMin = std::numeric_limits<int32_t>::min();
  constexpr int64_t kMax = std::numeric_limits<int32_t>::max();
  if (value < kMin || value > kMax) {
    std::ostringstream text;
    text << "Invalid value for parameter " << name << ": " << value << " is outside the range "
         << kMin << " to " << kMax;
    error = text.str();
    return false;
  }
  narrowed = static_cast<int32_t>(value);
  return true;
}

bool ReadInt32(const Fendle::CallSpec::Input& input, const char* name, int32_t& value,
               std::string& error) {
  return NarrowToInt32(name, input.GetInt(name), value, error);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
