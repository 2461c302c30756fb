#include "Operation.h"

#include <stdexcept>

#include "Connection.h"
#include "Scenario.h"
#include "Schema.h"

namespace HyraSim {
namespace {

// The connection whose contents were last checked; a new connection is
// checked once. Guarded by the world lock.
sqlite3* checkedDb = nullptr;

// The opened database, holding a world: the first use of an empty database
// puts the demo world into it. Needs the world lock.
sqlite3* ReadyDatabase(bool ensureWorld) {
  const OpenedDatabase opened = OpenDatabase(&RefuseForeignDatabase);
  if (opened.fresh) checkedDb = nullptr;
  if (ensureWorld && checkedDb != opened.db) {
    Transaction transaction(opened.db, true);
    if (!HasWorld(opened.db)) {
      CreateSchema(opened.db);
      SaveWorld(opened.db, ReadScenario(DemoScenario()), kSectionAll);
    }
    transaction.Commit();
    checkedDb = opened.db;
  }
  return opened.db;
}

}  // namespace

Injection RunOperation(const std::string& operation, Access access,
                       const std::function<unsigned(WorldState&)>& body) {
  const auto lock = LockWorld();
  sqlite3* db = ReadyDatabase(true);
  const bool armed = IsArmed(db, operation);
  Transaction transaction(db, access == Access::kWrite || armed);
  if (armed) {
    const Injection injection = ConsumeCall(db, operation);
    if (injection.fired) {
      transaction.Commit();
      return injection;
    }
  }
  WorldState world = LoadWorld(db);
  unsigned changed = 0;
  try {
    changed = body(world);
  } catch (...) {
    if (armed) transaction.Commit();
    throw;
  }
  if (changed != 0) {
    if (access != Access::kWrite) throw std::logic_error(operation + " changed a read-only world");
    SaveWorld(db, world, changed);
  }
  transaction.Commit();
  return {};
}

Injection CountCall(const std::string& operation) {
  const auto lock = LockWorld();
  sqlite3* db = ReadyDatabase(true);
  if (!IsArmed(db, operation)) return {};
  Transaction transaction(db, true);
  const Injection injection = ConsumeCall(db, operation);
  transaction.Commit();
  return injection;
}

void WithDatabase(bool write, bool ensureWorld, const std::function<void(sqlite3*)>& work) {
  const auto lock = LockWorld();
  sqlite3* db = ReadyDatabase(ensureWorld);
  Transaction transaction(db, write);
  work(db);
  transaction.Commit();
}

}  // namespace HyraSim
