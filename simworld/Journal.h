// The journal of host calls: one row per library operation served, written in
// the operation's own transaction, so that it holds the calls of every process
// in the order they took effect. Only the latest kJournalLimit entries stay.
#pragma once

#include <sqlite3.h>

#include <cstddef>
#include <string>
#include <vector>

namespace HyraSim {

constexpr int64_t kJournalLimit = 10000;
// Arguments and messages are cut to about this many bytes.
constexpr size_t kJournalTextLimit = 200;

// Outcomes of a call.
extern const char kPassed[];   // served as asked
extern const char kRefused[];  // the host's own refusal
extern const char kFailed[];   // failed by an armed failure
extern const char kNothing[];  // answered "nothing" by an armed failure

// Appends one entry and drops the entries older than the latest kJournalLimit.
void RecordCall(sqlite3* db, const std::string& operation, const std::vector<std::string>& args,
                const char* outcome, const std::string& message);

// text cut to kJournalTextLimit bytes at a character boundary, with "..."
// added when it was cut.
std::string CutText(const std::string& text);

}  // namespace HyraSim
