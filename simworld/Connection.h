// The process's connection to the world database and the SQLite wrappers the
// world code uses. All of it is used with the world lock held.
#pragma once

#include <sqlite3.h>

#include <cstdint>
#include <mutex>
#include <optional>
#include <string>

namespace HyraSim {

// Serialises this process's use of its one connection.
std::unique_lock<std::mutex> LockWorld();

struct OpenedDatabase {
  sqlite3* db = nullptr;
  bool fresh = false;  // opened by this call: the caller checks its contents
};

// The connection to DatabasePath(), opened on first use and opened again when
// the path changes or the file at it was replaced. A new connection is handed
// to check before anything is changed in the file (it switches to WAL); when
// check throws, the connection is dropped. Needs the world lock.
OpenedDatabase OpenDatabase(void (*check)(sqlite3*));

// Throws WorldError with what and SQLite's last error text.
[[noreturn]] void ThrowSqlError(sqlite3* db, const std::string& what);

void Exec(sqlite3* db, const char* sql);

// One prepared statement, borrowed for the scope from the connection's cache
// of prepared statements (so that an operation run many times parses its SQL
// once per process) and given back reset. Bind indexes count from 1, column
// indexes from 0.
class Statement {
 public:
  Statement(sqlite3* db, const char* sql);
  ~Statement();
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;

  Statement& Bind(int index, int64_t value);
  Statement& Bind(int index, const std::string& value);
  Statement& Bind(int index, const std::optional<int64_t>& value);
  Statement& Bind(int index, const std::optional<std::string>& value);
  // Answers true while there is a row to read.
  bool Step();
  // Steps to the end and makes the statement ready for new bindings.
  void Run();

  int64_t Int(int column) const;
  std::string Text(int column) const;
  bool IsNull(int column) const;

 private:
  sqlite3* db_;
  std::string sql_;
  sqlite3_stmt* stmt_ = nullptr;
};

// One transaction, rolled back when it is left without Commit. An immediate
// one takes the write lock at once, so that no other writer can slip in
// between its reads and writes.
class Transaction {
 public:
  Transaction(sqlite3* db, bool immediate);
  ~Transaction();
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  void Commit();

 private:
  sqlite3* db_;
  bool open_ = false;
};

// A nested transaction inside an open one: what it changed is undone by
// Undo (or when it is left without Keep), while the outer transaction and
// what it did before stay.
class Savepoint {
 public:
  explicit Savepoint(sqlite3* db);
  ~Savepoint();
  Savepoint(const Savepoint&) = delete;
  Savepoint& operator=(const Savepoint&) = delete;
  void Keep();
  void Undo();

 private:
  sqlite3* db_;
  bool open_ = false;
};

}  // namespace HyraSim
