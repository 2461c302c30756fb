// The world as hyrasim show prints it for a reader.
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

}  // namespace HyraSim
