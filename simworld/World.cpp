#include "World.h"

#include "Failures.h"
#include "Operation.h"
#include "Rows.h"
#include "Scenario.h"
#include "Schema.h"

namespace HyraSim {

void InitDemo() { InitScenario(DemoScenario()); }

void InitScenario(const std::string& scenarioJson) {
  // Validate first: a bad scenario leaves the world as it was.
  const WorldState world = ReadScenario(scenarioJson);
  WithDatabase(true, false, [&](sqlite3* db) {
    CreateSchema(db);
    SaveWorld(db, world);
  });
}

std::string ExportScenario() {
  WorldState world;
  WithDatabase(false, true, [&](sqlite3* db) { world = LoadWorld(db); });
  return WriteScenario(world);
}

void SetDaemonRunning(bool running) {
  WithDatabase(true, true, [&](sqlite3* db) { StoreDaemonRunning(db, running); });
}

void ArmFailure(const std::string& operation, const FailureSpec& spec) {
  if (!IsArmableOperation(operation)) {
    throw WorldError("unknown operation \"" + operation + "\"; hyrasim fail --list names them");
  }
  if (spec.after < 0) throw WorldError("the number of calls to let pass cannot be negative");
  if (spec.times < 1) throw WorldError("the number of calls to fail must be at least 1");
  WithDatabase(true, true, [&](sqlite3* db) { StoreArming(db, operation, spec); });
}

void ClearFailures() {
  WithDatabase(true, true, [](sqlite3* db) { DeleteArmings(db); });
}

std::vector<std::pair<std::string, FailureSpec> > ArmedFailures() {
  std::vector<std::pair<std::string, FailureSpec> > armings;
  WithDatabase(false, true, [&](sqlite3* db) { armings = ReadArmings(db); });
  return armings;
}

}  // namespace HyraSim
