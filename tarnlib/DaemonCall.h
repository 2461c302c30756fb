// One call to the simulated daemon: the opening check, armed failures, the
// daemon's running state and refusals, all turned into a status.
#pragma once

#include <functional>

#include "Model.h"
#include "Operation.h"
#include "TarnLib/TarnLib.h"

namespace TarnSim {

// Thrown by a call body to refuse the call with status.
struct Refusal {
  TarnLib_Status status;
};

struct CallOutcome {
  TarnLib_Status status = TARNLIB_OK;
  bool nothing = false;  // an armed failure asked for an empty answer; the body did not run
  bool Succeeded() const { return status == TARNLIB_OK && !nothing; }
};

// Runs body as a call of function. Fails with kNotInitialised while this
// process holds no opening, with the injected text when an armed failure
// fires, with kDaemonNotRunning while the daemon is stopped, and with the
// status of a Refusal the body throws.
CallOutcome CallDaemon(const char* function, HyraSim::Access access,
                       const std::function<unsigned(HyraSim::WorldState&)>& body);

// The status of an exception caught at the library's C boundary.
TarnLib_Status StatusOfCurrentException();

// The tarn uuid of the container the daemon knows as containerId, which must
// be in normal form; anything else is refused.
HyraSim::Tarn FindKnownTarn(HyraSim::WorldState& w, const char* containerId, const char* uuid);

// Process-wide openings of the library.
bool IsOpen();

}  // namespace TarnSim
