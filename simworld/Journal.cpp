#include "Journal.h"

#include <nlohmann/json.hpp>

#include "Connection.h"
#include "Operation.h"
#include "World.h"

namespace HyraSim {

const char kPassed[] = "passed";
const char kRefused[] = "refused";
const char kFailed[] = "failed";
const char kNothing[] = "nothing";

std::string CutText(const std::string& text) {
  if (text.size() <= kJournalTextLimit) return text;
  size_t length = kJournalTextLimit;
  // Never end inside a multi-byte UTF-8 sequence.
  while (length > 0 && (static_cast<unsigned char>(text[length]) & 0xC0) == 0x80) --length;
  return text.substr(0, length) + "...";
}

namespace {

// Arguments are stored as one JSON array; bytes that are not UTF-8 become
// replacement characters rather than refusing the call.
std::string ArgsText(const std::vector<std::string>& args) {
  nlohmann::json list = nlohmann::json::array();
  for (const std::string& arg : args) list.push_back(CutText(arg));
  return list.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

}  // namespace

void RecordCall(sqlite3* db, const std::string& operation, const std::vector<std::string>& args,
                const char* outcome, const std::string& message) {
  Statement(db, "INSERT INTO journal(operation, args, outcome, message) VALUES(?, ?, ?, ?)")
      .Bind(1, operation)
      .Bind(2, ArgsText(args))
      .Bind(3, std::string(outcome))
      .Bind(4, CutText(message))
      .Run();
  // Only the oldest entries are ever dropped, so a new entry's number is one
  // above the last one's, and the entries to drop are a range of the key.
  Statement(db, "DELETE FROM journal WHERE seq <= ?")
      .Bind(1, int64_t{sqlite3_last_insert_rowid(db)} - kJournalLimit)
      .Run();
}

std::vector<JournalEntry> ReadJournal() {
  std::vector<JournalEntry> entries;
  WithDatabase(false, true, [&](sqlite3* db) {
    Statement row(db, "SELECT seq, operation, args, outcome, message FROM journal ORDER BY seq");
    while (row.Step()) {
      JournalEntry entry;
      entry.seq = row.Int(0);
      entry.operation = row.Text(1);
      for (const auto& arg : nlohmann::json::parse(row.Text(2), nullptr, false)) {
        if (arg.is_string()) entry.args.push_back(arg.get<std::string>());
      }
      entry.outcome = row.Text(3);
      entry.message = row.Text(4);
      entries.push_back(std::move(entry));
    }
  });
  return entries;
}

void ClearJournal() {
  WithDatabase(true, true, [](sqlite3* db) { Exec(db, "DELETE FROM journal"); });
}

}  // namespace HyraSim
