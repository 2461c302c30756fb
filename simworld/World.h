// The simulated Hyra host: one SQLite database that holds the storage arrays,
// containers, tarns, the daemon's state and the host's providers, mounts and
// Kiro context. The stand-in host libraries and hyrasim read and change it
// through this interface; every operation is one transaction.
//
// The database is HYRA_SIM_DB when that is set, else
// $XDG_STATE_HOME/hyrasim/world.db (XDG_STATE_HOME defaulting to
// ~/.local/state). The first use creates it, holding the demo world. The path
// is looked up again on every operation, so a process may switch worlds by
// changing HYRA_SIM_DB.
#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace HyraSim {

// A world that cannot be read or written, or a scenario that is not valid (the
// text names the offending field).
class WorldError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The database path in use.
std::string DatabasePath();

// Replace the whole world.
void InitDemo();
void InitScenario(const std::string& scenarioJson);
// The world in the scenario format; InitScenario(ExportScenario()) changes nothing.
std::string ExportScenario();

void SetDaemonRunning(bool running);

// How an armed operation fails.
struct FailureSpec {
  std::string message = "injected failure";
  int64_t after = 0;  // calls that pass first
  int64_t times = 1;  // calls that then fail
  bool null = false;  // answer "nothing" instead of an error
};

// Arms an operation by its name (a storage-control operation such as
// "AddTarnFileSystem", or a daemon client function such as "TarnLib_Init"),
// replacing an earlier arming of it. Throws WorldError for an unknown name.
void ArmFailure(const std::string& operation, const FailureSpec& spec);
void ClearFailures();
// The names ArmFailure accepts.
std::vector<std::string> ArmableOperations();
// The armed operations in name order, with the calls still to pass and fail.
std::vector<std::pair<std::string, FailureSpec> > ArmedFailures();

// One host call as the journal keeps it. outcome is "passed", "refused" (the
// host's own refusal, message saying why), "failed" (an armed failure,
// message being its text) or "nothing" (an armed failure answering nothing).
struct JournalEntry {
  int64_t seq = 0;  // grows with every call, across processes; 1 again after a clear
  std::string operation;
  std::vector<std::string> args;  // each cut to about 200 bytes
  std::string outcome;
  std::string message;
};

// The latest host calls (at most 10,000), oldest first.
std::vector<JournalEntry> ReadJournal();
void ClearJournal();

}  // namespace HyraSim
