// bench_world: prints a benchmark world in the scenario format, for
// hyrasim init --scenario.
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <string>

#include "WorldGenerator.h"

int main(int argc, char** argv) {
  HyraBench::WorldShape shape;
  for (int i = 1; i < argc; ++i) {
    const std::string option = argv[i];
    const bool hasValue = i + 1 < argc;
    if (option == "--containers" && hasValue) {
      shape.containers = std::atoi(argv[++i]);
    } else if (option == "--distinct-arrays") {
      shape.distinctArrays = true;
    } else if (option == "--config-tarns" && hasValue) {
      shape.configTarns = std::atoi(argv[++i]);
    } else if (option == "--metadata" && hasValue) {
      shape.metadataPairs = std::atoi(argv[++i]);
    } else if (option == "--mounted") {
      shape.mounted = true;
    } else {
      std::cerr << "usage: bench_world [--containers N] [--distinct-arrays] [--config-tarns N]"
                   " [--metadata N] [--mounted]\n";
      return 2;
    }
  }
  std::cout << HyraBench::GenerateScenario(shape);
  return 0;
}
