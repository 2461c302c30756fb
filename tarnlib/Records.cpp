#include "Records.h"

#include <cstring>
#include <limits>

#include "DaemonCall.h"
#include "Status.h"

namespace TarnSim {

char* CopyText(const std::string& text) {
  char* copy = Allocate<char>(text.size() + 1);
  std::memcpy(copy, text.c_str(), text.size());
  return copy;
}

int32_t Count32(size_t count) {
  if (count > static_cast<size_t>(std::numeric_limits<int32_t>::max())) {
    throw Refusal{kInternalError};
  }
  return static_cast<int32_t>(count);
}

}  // namespace TarnSim
