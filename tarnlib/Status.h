// Status codes of the daemon client library. Failures with a text of their own
// (an injected failure, a world that cannot be read) get a code of this
// process whose TarnLib_Err2String text is that text.
#pragma once

#include <string>

#include "TarnLib/TarnLib.h"

namespace TarnSim {

enum : TarnLib_Status {
  kNotInitialised = 1,
  kDaemonNotRunning = 2,
  kInvalidArgument = 3,
  kNotFound = 4,
  kAlreadyExists = 5,
  kOutOfMemory = 6,
  kInternalError = 7,
};

// The code of a failure described by text; the same text gives the same code.
TarnLib_Status StatusForText(const std::string& text);
// The text of any status.
std::string StatusText(TarnLib_Status status);

}  // namespace TarnSim
