// Feeds the scenario reader arbitrary documents. A refusal is a WorldError;
// anything else escaping, a crash or a sanitizer report is a fault. What the
// reader accepts must be written back as a scenario that reads again to the
// same text, as hyrasim's show --json and init --scenario rely on.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "Scenario.h"
#include "World.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  HyraSim::WorldState world;
  try {
    world = HyraSim::ReadScenario(std::string(reinterpret_cast<const char*>(data), size));
  } catch (const HyraSim::WorldError&) {
    return 0;
  }
  const std::string written = HyraSim::WriteScenario(world);
  if (HyraSim::WriteScenario(HyraSim::ReadScenario(written)) != written) std::abort();
  return 0;
}
