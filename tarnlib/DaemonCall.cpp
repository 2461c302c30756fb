#include "DaemonCall.h"

#include <new>

#include "ContainerId.h"
#include "Status.h"
#include "World.h"

namespace TarnSim {

Refusal::Refusal(TarnLib_Status refused) : status(refused), text_(StatusText(refused)) {}

const char* Refusal::what() const noexcept { return text_.c_str(); }

CallOutcome CallDaemon(const char* function, HyraSim::Access access, const HyraSim::CallArgs& args,
                       const std::function<void(sqlite3*)>& body) {
  if (!IsOpen()) return {kNotInitialised, false};
  try {
    const HyraSim::Injection injection =
        HyraSim::RunOperation(function, access, args, [&](sqlite3* db) {
          if (!HyraSim::DaemonRunning(db)) throw Refusal{kDaemonNotRunning};
          body(db);
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
  } catch (const HyraSim::UnknownOperation&) {
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

HyraSim::ContainerRow FindKnownContainer(sqlite3* db, const char* containerId) {
  if (containerId == nullptr) throw Refusal{kInvalidArgument};
  const auto normal = HyraSim::NormalContainerId(containerId);
  if (!normal || *normal != containerId) throw Refusal{kInvalidArgument};
  auto container = HyraSim::FindExportedContainer(db, *normal);
  if (!container) throw Refusal{kNotFound};
  return *container;
}

KnownTarn FindKnownTarn(sqlite3* db, const char* containerId, const char* uuid) {
  const HyraSim::ContainerRow container = FindKnownContainer(db, containerId);
  if (uuid == nullptr) throw Refusal{kInvalidArgument};
  auto tarn = HyraSim::FindTarnIn(db, container.pos, uuid);
  if (!tarn) throw Refusal{kNotFound};
  return {container.pos, *tarn};
}

std::string Arg(const char* text) { return text != nullptr ? text : "(null)"; }

}  // namespace TarnSim
