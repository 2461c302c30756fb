// How the stand-in host libraries act on the world: each library operation is
// one transaction that counts the call against an armed failure, does its
// work with targeted statements, and writes one journal entry.
#pragma once

#include <sqlite3.h>

#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "Failures.h"

namespace HyraSim {

enum class Access { kRead, kWrite };

// What one call was given, as the journal shows it.
using CallArgs = std::vector<std::string>;

// An operation run under a name that cannot be armed: a programming error of
// the stand-in libraries (its failures could never be caused on purpose).
class UnknownOperation : public std::logic_error {
 public:
  using std::logic_error::logic_error;
};

// Runs one library operation in one write transaction. When an armed failure
// of operation fires, the body is not run and the returned injection says how
// to fail. Otherwise the body reads and changes the rows it needs (a kRead
// operation may change nothing). When the body throws, nothing it changed is
// kept, but the call stays counted and journaled as refused.
Injection RunOperation(const std::string& operation, Access access, const CallArgs& args,
                       const std::function<void(sqlite3*)>& body);

// Only counts and journals one call of operation, for operations that answer
// from what the caller already holds.
Injection CountCall(const std::string& operation, const CallArgs& args);

// Runs work on the opened database inside one transaction. With ensureWorld
// an empty database first receives the demo world.
void WithDatabase(bool write, bool ensureWorld, const std::function<void(sqlite3*)>& work);

// A list argument as one journal argument: the items joined by commas.
std::string JoinedArg(const std::vector<std::string>& items);

}  // namespace HyraSim
