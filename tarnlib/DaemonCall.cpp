#include "DaemonCall.h"

#include <new>

#include "Status.h"
#include "World.h"

namespace TarnSim {

CallOutcome CallDaemon(const char* function, HyraSim::Access access,
                       const std::function<unsigned(HyraSim::WorldState&)>& body) {
  if (!IsOpen()) return {kNotInitialised, false};
  try {
    const HyraSim::Injection injection =
        HyraSim::RunOperation(function, access, [&](HyraSim::WorldState& w) {
          if (!w.daemon.running) throw Refusal{kDaemonNotRunning};
          return body(w);
        });
    if (!injection.fired) return {TARNLIB_OK, false};
    if (injection.null) return {TARNLIB_OK, true};
    return {StatusForText(injection.message), false};
  } catch (...) {
    return {StatusOfCurrentException(), false};
  }
}

TarnLib_Status StatusOfCurrentException() {
  try {
    throw;
  } catch (const Refusal& refusal) {
    return refusal.status;
  } catch (const HyraSim::WorldError& e) {
    try {
      return StatusForText(std::string("Tarnd cannot reach its state: ") + e.what());
    } catch (...) {
      return kInternalError;
    }
  } catch (const std::bad_alloc&) {
    return kOutOfMemory;
  } catch (...) {
    return kInternalError;
  }
}

}  // namespace TarnSim
