#include "Operation.h"

#include <optional>

#include "Connection.h"
#include "Journal.h"
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
    // A world of this layout needs no transaction; an empty one is filled
    // under the write lock, so that two processes never both fill it.
    if (!HasWorld(opened.db)) {
      Transaction transaction(opened.db, true);
      if (!HasWorld(opened.db)) {
        CreateSchema(opened.db);
        SaveWorld(opened.db, ReadScenario(DemoScenario()));
      }
      transaction.Commit();
    }
    checkedDb = opened.db;
  }
  return opened.db;
}

// The text of the exception being handled, for the journal.
std::string CurrentExceptionText() {
  try {
    throw;
  } catch (const std::exception& e) {
    return e.what();
  } catch (...) {
    return "unknown failure";
  }
}

}  // namespace

Injection RunOperation(const std::string& operation, Access access, const CallArgs& args,
                       const std::function<void(sqlite3*)>& body) {
  if (!IsArmableOperation(operation)) {
    throw UnknownOperation("the host operation \"" + operation + "\" is not armable");
  }
  const auto lock = LockWorld();
  sqlite3* db = ReadyDatabase(true);
  // Every call writes its journal entry, so every operation is a writer.
  Transaction transaction(db, true);
  const Injection injection = ConsumeCall(db, operation);
  if (injection.fired) {
    RecordCall(db, operation, args, injection.null ? kNothing : kFailed, injection.message);
    transaction.Commit();
    return injection;
  }
  if (body) {
    const int changesBefore = sqlite3_total_changes(db);
    // A writer that fails half way must leave nothing of what it changed.
    std::optional<Savepoint> savepoint;
    if (access == Access::kWrite) savepoint.emplace(db);
    try {
      body(db);
    } catch (...) {
      if (savepoint) savepoint->Undo();
      RecordCall(db, operation, args, kRefused, CurrentExceptionText());
      transaction.Commit();
      throw;
    }
    if (access == Access::kRead && sqlite3_total_changes(db) != changesBefore) {
      throw std::logic_error(operation + " changed a read-only world");
    }
    if (savepoint) savepoint->Keep();
  }
  RecordCall(db, operation, args, kPassed, std::string());
  transaction.Commit();
  return {};
}

Injection CountCall(const std::string& operation, const CallArgs& args) {
  return RunOperation(operation, Access::kRead, args, nullptr);
}

void WithDatabase(bool write, bool ensureWorld, const std::function<void(sqlite3*)>& work) {
  const auto lock = LockWorld();
  sqlite3* db = ReadyDatabase(ensureWorld);
  Transaction transaction(db, write);
  work(db);
  transaction.Commit();
}

std::string JoinedArg(const std::vector<std::string>& items) {
  std::string joined;
  for (const std::string& item : items) {
    if (!joined.empty()) joined += ',';
    joined += item;
    // The journal cuts it anyway; a long list is not copied whole.
    if (joined.size() > kJournalTextLimit) break;
  }
  return joined;
}

}  // namespace HyraSim
