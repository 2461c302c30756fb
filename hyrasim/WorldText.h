// The world and the journal of host calls as hyrasim prints them.
#pragma once

#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "Model.h"
#include "World.h"

namespace HyraSim {

void PrintWorld(std::ostream& out, const std::string& path, const WorldState& world,
                const std::vector<std::pair<std::string, FailureSpec> >& armed);

// The journal of host calls, one call a line; with json as a JSON array of
// {"seq", "operation", "args", "outcome", "message"} objects, one a line.
void PrintJournal(std::ostream& out, const std::vector<JournalEntry>& journal, bool json);

}  // namespace HyraSim
