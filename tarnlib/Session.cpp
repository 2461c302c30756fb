// Opening and closing the library. Openings are counted per process: every
// successful TarnLib_Init needs one TarnLib_Exit.
#include <mutex>
#include <string>

#include "DaemonCall.h"
#include "Status.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibSim.h"

namespace TarnSim {
namespace {

struct Counters {
  std::mutex mutex;
  int64_t initCalls = 0;
  int64_t exitCalls = 0;
  int64_t openings = 0;
};

Counters& TheCounters() {
  static Counters counters;
  return counters;
}

}  // namespace

bool IsOpen() {
  Counters& c = TheCounters();
  const std::lock_guard<std::mutex> lock(c.mutex);
  return c.openings > 0;
}

}  // namespace TarnSim

using TarnSim::TheCounters;

extern "C" bool TarnLib_Init(int32_t flags, int32_t options) {
  {
    const std::lock_guard<std::mutex> lock(TheCounters().mutex);
    ++TheCounters().initCalls;
  }
  // Opening is made seven times while a command tree is built, so it reads
  // the daemon's running flag alone, on the connection the process keeps.
  try {
    const HyraSim::Injection injection =
        HyraSim::RunOperation("TarnLib_Init", HyraSim::Access::kRead,
                              {std::to_string(flags), std::to_string(options)}, [](sqlite3* db) {
                                if (!HyraSim::DaemonRunning(db))
                                  throw TarnSim::Refusal{TarnSim::kDaemonNotRunning};
                              });
    if (injection.fired) return false;
  } catch (const HyraSim::UnknownOperation&) {
    throw;
  } catch (...) {
    return false;
  }
  const std::lock_guard<std::mutex> lock(TheCounters().mutex);
  ++TheCounters().openings;
  return true;
}

extern "C" void TarnLib_Exit(void) {
  const std::lock_guard<std::mutex> lock(TheCounters().mutex);
  ++TheCounters().exitCalls;
  // An Exit without an opening has nothing to release.
  if (TheCounters().openings > 0) --TheCounters().openings;
}

extern "C" int64_t TarnLibSim_InitCalls(void) {
  const std::lock_guard<std::mutex> lock(TheCounters().mutex);
  return TheCounters().initCalls;
}

extern "C" int64_t TarnLibSim_ExitCalls(void) {
  const std::lock_guard<std::mutex> lock(TheCounters().mutex);
  return TheCounters().exitCalls;
}

extern "C" int64_t TarnLibSim_Openings(void) {
  const std::lock_guard<std::mutex> lock(TheCounters().mutex);
  return TheCounters().openings;
}

extern "C" void TarnLibSim_ResetCounters(void) {
  const std::lock_guard<std::mutex> lock(TheCounters().mutex);
  TheCounters().initCalls = 0;
  TheCounters().exitCalls = 0;
  TheCounters().openings = 0;
}
