#include "Status.h"

#include <map>
#include <mutex>
#include <vector>

namespace TarnSim {
namespace {

constexpr TarnLib_Status kFirstTextCode = 1000;

// Texts that have a code of this process; never shrinks, but a text is
// entered only once.
struct TextCodes {
  std::mutex mutex;
  std::vector<std::string> texts;
  std::map<std::string, TarnLib_Status> codes;
};

TextCodes& Codes() {
  static TextCodes codes;
  return codes;
}

const char* FixedText(TarnLib_Status status) {
  switch (status) {
    case TARNLIB_OK:
      return "success";
    case kNotInitialised:
      return "TarnLib is not initialised";
    case kDaemonNotRunning:
      return "Tarnd is not running";
    case kInvalidArgument:
      return "invalid argument";
    case kNotFound:
      return "not found";
    case kAlreadyExists:
      return "already exists";
    case kOutOfMemory:
      return "out of memory";
    case kInternalError:
      return "internal error of the daemon client";
    default:
      return nullptr;
  }
}

}  // namespace

TarnLib_Status StatusForText(const std::string& text) {
  TextCodes& codes = Codes();
  const std::lock_guard<std::mutex> lock(codes.mutex);
  const auto found = codes.codes.find(text);
  if (found != codes.codes.end()) return found->second;
  const auto code = static_cast<TarnLib_Status>(kFirstTextCode + codes.texts.size());
  codes.texts.push_back(text);
  codes.codes.emplace(text, code);
  return code;
}

std::string StatusText(TarnLib_Status status) {
  if (const char* text = FixedText(status)) return text;
  TextCodes& codes = Codes();
  const std::lock_guard<std::mutex> lock(codes.mutex);
  const int64_t index = int64_t{status} - kFirstTextCode;
  if (index >= 0 && static_cast<uint64_t>(index) < codes.texts.size()) {
    return codes.texts[static_cast<size_t>(index)];
  }
  return "unknown status " + std::to_string(status);
}

}  // namespace TarnSim

extern "C" const char* TarnLib_Err2String(TarnLib_Status status) {
  // Valid until the next call on this thread, as the interface promises.
  thread_local std::string text;
  try {
    text = TarnSim::StatusText(status);
  } catch (...) {
    text.clear();
  }
  return text.c_str();
}
