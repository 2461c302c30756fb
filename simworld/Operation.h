// How the stand-in host libraries act on the world: each library operation is
// one transaction that first counts the call against an armed failure.
#pragma once

#include <sqlite3.h>

#include <functional>
#include <string>

#include "Failures.h"
#include "Model.h"

namespace HyraSim {

enum class Access { kRead, kWrite };

// Runs one library operation. When an armed failure of operation fires, the
// body is not run and the returned injection says how to fail. Otherwise the
// body works on the loaded world and answers the Section bits it changed,
// which are stored (only a kWrite operation may change anything). When the
// body throws, nothing it changed is stored, but the call stays counted.
Injection RunOperation(const std::string& operation, Access access,
                       const std::function<unsigned(WorldState&)>& body);

// Only counts one call of operation, for operations that answer from what the
// caller already holds.
Injection CountCall(const std::string& operation);

// Runs work on the opened database inside one transaction. With ensureWorld
// an empty database first receives the demo world.
void WithDatabase(bool write, bool ensureWorld, const std::function<void(sqlite3*)>& work);

}  // namespace HyraSim
