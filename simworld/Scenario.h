// The scenario format: the whole world as one JSON document, read with
// validation and written so that reading it back changes nothing.
#pragma once

#include <string>

#include "Model.h"

namespace HyraSim {

// Throws WorldError naming the offending field ("containers[1].tarns[0].uuid").
WorldState ReadScenario(const std::string& json);
std::string WriteScenario(const WorldState& world);

// The demo world in the scenario format.
const char* DemoScenario();

}  // namespace HyraSim
