// Armed failures: an operation named by hyrasim fail lets a number of calls
// pass and then fails a number of calls. The counts are rows of the world
// database, so every process sees and uses the same arming.
#pragma once

#include <sqlite3.h>

#include <string>
#include <utility>
#include <vector>

#include "World.h"

namespace HyraSim {

// How one call of an operation must end.
struct Injection {
  bool fired = false;  // the call fails (or answers nothing when null is set)
  bool null = false;
  std::string message;
};

bool IsArmableOperation(const std::string& operation);
// Counts one call of operation against its arming, if it is armed; needs a
// write transaction.
Injection ConsumeCall(sqlite3* db, const std::string& operation);

void StoreArming(sqlite3* db, const std::string& operation, const FailureSpec& spec);
void DeleteArmings(sqlite3* db);
std::vector<std::pair<std::string, FailureSpec> > ReadArmings(sqlite3* db);

}  // namespace HyraSim
