// Worlds of a chosen size for the benchmarks, in the scenario format: one
// provider exporting every container, arrays shared by all containers or two
// of their own per container, and the first container holding the
// config-tarns and the metadata pairs that the queries read.
#pragma once

#include <string>

namespace HyraBench {

struct WorldShape {
  int containers = 1;
  bool distinctArrays = false;  // two arrays per container instead of two shared ones
  int configTarns = 0;          // config-tarns of the first container
  int metadataPairs = 0;        // metadata of the first container's plain tarn
  bool mounted = false;         // every container mounted already (else only none)
};

// The id of container i: a valid container id in normal form.
std::string ContainerId(int i);
// The first container's plain tarn, which holds the metadata.
extern const char kMetadataTarn[];
// The provider URL that exports every container.
extern const char kProviderUrl[];

std::string GenerateScenario(const WorldShape& shape);

}  // namespace HyraBench
