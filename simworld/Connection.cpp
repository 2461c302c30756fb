#include "Connection.h"

#include <fcntl.h>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <cstring>
#include <thread>
#include <unordered_map>
#include <vector>

#include "World.h"

namespace HyraSim {
namespace {

// Long enough for many processes queueing for the write lock.
constexpr int kBusyTimeoutMs = 60000;
// Some steps (switching to WAL, starting a transaction while another process
// recovers the log) can answer BUSY without waiting; they are tried again.
constexpr int kBusyRetries = 200;
constexpr auto kBusyPause = std::chrono::milliseconds(25);

const char* EnvText(const char* name) {
  const char* value = std::getenv(name);
  return value != nullptr && value[0] != '\0' ? value : nullptr;
}

std::string HomeDirectory() {
  if (const char* home = EnvText("HOME")) return home;
  if (const passwd* entry = getpwuid(getuid())) {
    if (entry->pw_dir != nullptr && entry->pw_dir[0] != '\0') return entry->pw_dir;
  }
  throw WorldError("cannot find the home directory for the world database; set HYRA_SIM_DB");
}

// Creates every missing directory of path, readable by the user only.
void MakeDirectories(const std::string& path) {
  for (size_t slash = path.find('/', 1);; slash = path.find('/', slash + 1)) {
    const std::string part = path.substr(0, slash);
    if (mkdir(part.c_str(), 0700) != 0 && errno != EEXIST) {
      throw WorldError("cannot create the directory " + part + ": " + std::strerror(errno));
    }
    if (slash == std::string::npos) break;
  }
}

bool IsBusy(int rc) { return (rc & 0xff) == SQLITE_BUSY || (rc & 0xff) == SQLITE_LOCKED; }

// Runs sql, trying again while the database answers BUSY.
void ExecPatiently(sqlite3* db, const char* sql) {
  for (int attempt = 0;; ++attempt) {
    const int rc = sqlite3_exec(db, sql, nullptr, nullptr, nullptr);
    if (rc == SQLITE_OK) return;
    if (!IsBusy(rc) || attempt == kBusyRetries) ThrowSqlError(db, sql);
    std::this_thread::sleep_for(kBusyPause);
  }
}

struct FileIdentity {
  dev_t device = 0;
  ino_t inode = 0;
  bool operator==(const FileIdentity& other) const {
    return device == other.device && inode == other.inode;
  }
};

std::optional<FileIdentity> IdentityOf(const std::string& path) {
  struct stat info;
  if (stat(path.c_str(), &info) != 0) return std::nullopt;
  return FileIdentity{info.st_dev, info.st_ino};
}

// Prepared statements of the process's connection that are not in use, by
// their SQL. Only the holder's connection has a cache.
struct StatementCache {
  sqlite3* db = nullptr;
  std::unordered_map<std::string, std::vector<sqlite3_stmt*> > idle;

  void Drop() {
    for (auto& entry : idle) {
      for (sqlite3_stmt* stmt : entry.second) sqlite3_finalize(stmt);
    }
    idle.clear();
    db = nullptr;
  }
};

// The connection of this process; closed when the process ends.
class Holder {
 public:
  ~Holder() { Close(); }

  OpenedDatabase Get(void (*check)(sqlite3*)) {
    const std::string path = DatabasePath();
    if (db_ != nullptr && path == path_ && IdentityOf(path) == identity_) return {db_, false};
    Close();
    Open(path, check);
    return {db_, true};
  }

  // The statements of the connection, dropped before it closes (a member, so
  // that it lives exactly as long as the connection, at exit too).
  StatementCache cache;

 private:
  void Open(const std::string& path, void (*check)(sqlite3*)) {
    if (EnvText("HYRA_SIM_DB") == nullptr) {
      const size_t slash = path.rfind('/');
      if (slash != std::string::npos && slash > 0) MakeDirectories(path.substr(0, slash));
    }
    // Create the file ourselves so that it (and the log files SQLite derives
    // from it) is readable by the user only.
    const int fd = open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    if (fd < 0) {
      throw WorldError("cannot open the world database " + path + ": " + std::strerror(errno));
    }
    close(fd);

    sqlite3* db = nullptr;
    const int rc =
        sqlite3_open_v2(path.c_str(), &db, SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOMUTEX, nullptr);
    if (rc != SQLITE_OK) {
      const std::string text = db != nullptr ? sqlite3_errmsg(db) : sqlite3_errstr(rc);
      sqlite3_close_v2(db);
      throw WorldError("cannot open the world database " + path + ": " + text);
    }
    try {
      sqlite3_busy_timeout(db, kBusyTimeoutMs);
      check(db);
      ExecPatiently(db, "PRAGMA journal_mode=WAL");
      ExecPatiently(db, "PRAGMA synchronous=NORMAL");
      // A short-lived process (every hyracli run) would otherwise copy the
      // log into the database, sync it and delete the log as it closes; the
      // log stays for the next process, and checkpoints happen as it grows.
      sqlite3_db_config(db, SQLITE_DBCONFIG_NO_CKPT_ON_CLOSE, 1, nullptr);
    } catch (const WorldError& e) {
      sqlite3_close_v2(db);
      throw WorldError("cannot use the world database " + path + ": " + e.what());
    }
    db_ = db;
    path_ = path;
    identity_ = IdentityOf(path);
    cache.db = db;
  }

  void Close() {
    // Cached statements would keep the closed connection alive.
    cache.Drop();
    if (db_ != nullptr) sqlite3_close_v2(db_);
    db_ = nullptr;
    path_.clear();
    identity_.reset();
  }

  sqlite3* db_ = nullptr;
  std::string path_;
  std::optional<FileIdentity> identity_;
};

std::mutex& WorldMutex() {
  static std::mutex mutex;
  return mutex;
}

Holder& TheHolder() {
  static Holder holder;
  return holder;
}

StatementCache& TheCache() { return TheHolder().cache; }

}  // namespace

std::string DatabasePath() {
  if (const char* path = EnvText("HYRA_SIM_DB")) return path;
  const char* state = EnvText("XDG_STATE_HOME");
  const std::string base =
      state != nullptr && state[0] == '/' ? std::string(state) : HomeDirectory() + "/.local/state";
  return base + "/hyrasim/world.db";
}

std::unique_lock<std::mutex> LockWorld() { return std::unique_lock<std::mutex>(WorldMutex()); }

OpenedDatabase OpenDatabase(void (*check)(sqlite3*)) { return TheHolder().Get(check); }

void ThrowSqlError(sqlite3* db, const std::string& what) {
  throw WorldError("world database error (" + what + "): " + sqlite3_errmsg(db));
}

void Exec(sqlite3* db, const char* sql) {
  if (sqlite3_exec(db, sql, nullptr, nullptr, nullptr) != SQLITE_OK) ThrowSqlError(db, sql);
}

Statement::Statement(sqlite3* db, const char* sql) : db_(db), sql_(sql) {
  StatementCache& cache = TheCache();
  if (cache.db == db) {
    const auto found = cache.idle.find(sql_);
    if (found != cache.idle.end() && !found->second.empty()) {
      stmt_ = found->second.back();
      found->second.pop_back();
      return;
    }
  }
  if (sqlite3_prepare_v2(db, sql, -1, &stmt_, nullptr) != SQLITE_OK) ThrowSqlError(db, sql);
}

Statement::~Statement() {
  StatementCache& cache = TheCache();
  if (stmt_ == nullptr) return;
  if (cache.db != db_) {
    sqlite3_finalize(stmt_);
    return;
  }
  sqlite3_reset(stmt_);
  sqlite3_clear_bindings(stmt_);
  try {
    cache.idle[sql_].push_back(stmt_);
  } catch (...) {
    sqlite3_finalize(stmt_);
  }
}

Statement& Statement::Bind(int index, int64_t value) {
  sqlite3_bind_int64(stmt_, index, value);
  return *this;
}

Statement& Statement::Bind(int index, const std::string& value) {
  sqlite3_bind_text64(stmt_, index, value.data(), value.size(), SQLITE_TRANSIENT, SQLITE_UTF8);
  return *this;
}

Statement& Statement::Bind(int index, const std::optional<int64_t>& value) {
  if (value) return Bind(index, *value);
  sqlite3_bind_null(stmt_, index);
  return *this;
}

Statement& Statement::Bind(int index, const std::optional<std::string>& value) {
  if (value) return Bind(index, *value);
  sqlite3_bind_null(stmt_, index);
  return *this;
}

bool Statement::Step() {
  const int rc = sqlite3_step(stmt_);
  if (rc == SQLITE_ROW) return true;
  if (rc == SQLITE_DONE) return false;
  ThrowSqlError(db_, sqlite3_sql(stmt_));
}

void Statement::Run() {
  while (Step()) {
  }
  sqlite3_reset(stmt_);
  sqlite3_clear_bindings(stmt_);
}

int64_t Statement::Int(int column) const { return sqlite3_column_int64(stmt_, column); }

std::string Statement::Text(int column) const {
  const auto* text = static_cast<const char*>(sqlite3_column_blob(stmt_, column));
  const int size = sqlite3_column_bytes(stmt_, column);
  return text != nullptr ? std::string(text, static_cast<size_t>(size)) : std::string();
}

bool Statement::IsNull(int column) const {
  return sqlite3_column_type(stmt_, column) == SQLITE_NULL;
}

Transaction::Transaction(sqlite3* db, bool immediate) : db_(db) {
  ExecPatiently(db, immediate ? "BEGIN IMMEDIATE" : "BEGIN");
  open_ = true;
}

Transaction::~Transaction() {
  if (open_) sqlite3_exec(db_, "ROLLBACK", nullptr, nullptr, nullptr);
}

void Transaction::Commit() {
  ExecPatiently(db_, "COMMIT");
  open_ = false;
}

Savepoint::Savepoint(sqlite3* db) : db_(db) {
  Exec(db, "SAVEPOINT body");
  open_ = true;
}

Savepoint::~Savepoint() {
  if (open_) Undo();
}

void Savepoint::Keep() {
  Exec(db_, "RELEASE body");
  open_ = false;
}

void Savepoint::Undo() {
  open_ = false;
  sqlite3_exec(db_, "ROLLBACK TO body", nullptr, nullptr, nullptr);
  sqlite3_exec(db_, "RELEASE body", nullptr, nullptr, nullptr);
}

}  // namespace HyraSim
