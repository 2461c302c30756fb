// Values that the host or the daemon keeps in 32 bits while the command line
// reads them as 64-bit integers.
#pragma once

#include <cstdint>
#include <string>

#include "Fendle/CallSpec.h"

namespace HalvikCli {
namespace TarnNamespace {

// An Int parameter that the host or the daemon keeps in 32 bits. A wider value
// is refused rather than cut, which would send a different number: answers
// false with "Invalid value for parameter <name>: <value> is outside the
// range -2147483648 to 2147483647" in error, else true with narrowed set.
bool NarrowToInt32(const char* name, int64_t value, int32_t& narrowed, std::string& error);

// GetInt of the parameter name, narrowed as NarrowToInt32 does.
bool ReadInt32(const Fendle::CallSpec::Input& input, const char* name, int32_t& value,
               std::string& error);

}  // namespace TarnNamespace
}  // namespace HalvikCli
