// One call to the simulated daemon: the opening check, armed failures, the
// daemon's running state and refusals, all turned into a status.
#pragma once

#include <sqlite3.h>

#include <exception>
#include <functional>
#include <string>

#include "Operation.h"
#include "Rows.h"
#include "TarnLib/TarnLib.h"

namespace TarnSim {

// Thrown by a call body to refuse the call with status; its text is the
// status text, which the journal records.
class Refusal : public std::exception {
 public:
  explicit Refusal(TarnLib_Status refused);
  const char* what() const noexcept override;
  TarnLib_Status status;

 private:
  std::string text_;
};

struct CallOutcome {
  TarnLib_Status status = TARNLIB_OK;
  bool nothing = false;  // an armed failure asked for an empty answer; the body did not run
  bool Succeeded() const { return status == TARNLIB_OK && !nothing; }
};

// Runs body as a call of function, journaled with args. Fails with
// kNotInitialised while this process holds no opening, with the injected text
// when an armed failure fires, with kDaemonNotRunning while the daemon is
// stopped, and with the status of a Refusal the body throws.
CallOutcome CallDaemon(const char* function, HyraSim::Access access, const HyraSim::CallArgs& args,
                       const std::function<void(sqlite3*)>& body);

// The status of an exception caught at the library's C boundary. A call made
// under a name that cannot be armed is a programming error and is thrown on.
TarnLib_Status StatusOfCurrentException();

// The container the daemon knows as containerId, which must be in normal
// form; anything else is refused.
HyraSim::ContainerRow FindKnownContainer(sqlite3* db, const char* containerId);

// The tarn uuid of the container the daemon knows as containerId, with the
// container's position; anything else is refused.
struct KnownTarn {
  int64_t containerPos = 0;
  HyraSim::TarnRow row;
};
KnownTarn FindKnownTarn(sqlite3* db, const char* containerId, const char* uuid);

// A text argument for the journal; a null pointer shows as "(null)".
std::string Arg(const char* text);

// Process-wide openings of the library.
bool IsOpen();

}  // namespace TarnSim
