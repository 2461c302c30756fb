// Texts in the daemon's records are C strings that a record may lack; a
// missing one reads as an empty text instead of being dereferenced.
#pragma once

#include <string>

namespace HalvikCli {
namespace TarnNamespace {

// text, or an empty text when it is null.
inline std::string TextOf(const char* text) {
  return text != nullptr ? std::string(text) : std::string();
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
