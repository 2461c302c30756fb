// In-process costs of the simulated host and the plug-in: building the
// command tree, and each library operation against worlds of 1,000, 10,000
// and 100,000 rows. An operation that costs what it touches shows the same
// time per row (or per call) at every size.
#include <benchmark/benchmark.h>
#include <stdlib.h>
#include <unistd.h>

#include <filesystem>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"
#include "OskCtl/Storage.h"
#include "TarnLib/TarnLib.h"
#include "TarnNamespace.h"
#include "World.h"
#include "WorldGenerator.h"

namespace {

using HyraBench::WorldShape;

// A directory of worlds for this run, removed at exit.
class WorldDirectory {
 public:
  WorldDirectory() {
    char pattern[] = "/tmp/hyrabench-XXXXXX";
    if (mkdtemp(pattern) == nullptr) std::abort();
    path_ = pattern;
  }
  ~WorldDirectory() { std::filesystem::remove_all(path_); }
  const std::string& Path() const { return path_; }

 private:
  std::string path_;
};

WorldDirectory& Directory() {
  static WorldDirectory directory;
  return directory;
}

// Points the process at a world of that shape, made the first time it is asked for.
void UseWorld(const WorldShape& shape) {
  static std::map<std::string, std::string> made;
  const std::string key = std::to_string(shape.containers) + (shape.distinctArrays ? "d" : "s") +
                          std::to_string(shape.configTarns) + "-" +
                          std::to_string(shape.metadataPairs) + (shape.mounted ? "m" : "u");
  const std::string path = Directory().Path() + "/" + key + ".db";
  setenv("HYRA_SIM_DB", path.c_str(), 1);
  if (made.emplace(key, path).second) HyraSim::InitScenario(HyraBench::GenerateScenario(shape));
}

// Holds the daemon library open while a benchmark runs.
struct Opened {
  Opened() { ok = TarnLib_Init(0, 0); }
  ~Opened() {
    if (ok) TarnLib_Exit();
  }
  bool ok = false;
};

void BuildTree(benchmark::State& state) {
  UseWorld({});
  for (auto _ : state) {
    boost::shared_ptr<Fendle::AutoCli::Namespace> root = Fendle::AutoCli::Namespace::New();
    root->RegisterNamespaceNode(Fendle::AutoCli::Namespace::New(), "storage");
    AutoCli_RegisterNamespaces(root);
    benchmark::DoNotOptimize(root);
  }
}
BENCHMARK(BuildTree)->Unit(benchmark::kMillisecond);

void GetStorageContainer(benchmark::State& state) {
  WorldShape shape;
  shape.containers = static_cast<int>(state.range(0));
  shape.distinctArrays = state.range(1) != 0;
  UseWorld(shape);
  Opened opened;
  for (auto _ : state) {
    StorageContainerResult* result = nullptr;
    const TarnLib_ErrorEx error = TarnLib_GetStorageContainer(1, nullptr, &result);
    if (!TarnLib_ErrorExIsSuccess(&error)) state.SkipWithError(TarnLib_ErrorExStr(&error));
    TarnLib_FreeStorageContainerResult(result);
  }
  state.SetComplexityN(state.range(0));
}
BENCHMARK(GetStorageContainer)
    ->ArgsProduct({{1000, 10000, 100000}, {0, 1}})
    ->Unit(benchmark::kMillisecond);

// One mount more in a world that has many already: the cost stays flat.
void AddTarnFileSystem(benchmark::State& state) {
  WorldShape shape;
  shape.containers = static_cast<int>(state.range(0));
  shape.mounted = true;
  UseWorld(shape);
  OskCtl::Storage::StorageInfoImpl host;
  int next = 0;
  for (auto _ : state) {
    std::string id = HyraBench::ContainerId(1000000 + next);
    std::unique_ptr<HostCtl::Storage::TarnFileSystem> mounted(host.AddTarnFileSystem(
        "extra-" + std::to_string(state.range(0)) + "-" + std::to_string(next++), id, {"array-0"},
        true));
    benchmark::DoNotOptimize(mounted);
  }
}
BENCHMARK(AddTarnFileSystem)->Arg(1000)->Arg(10000)->Arg(100000)->Unit(benchmark::kMicrosecond);

void GetTarnFileSystems(benchmark::State& state) {
  WorldShape shape;
  shape.containers = static_cast<int>(state.range(0));
  shape.mounted = true;
  UseWorld(shape);
  OskCtl::Storage::StorageInfoImpl host;
  for (auto _ : state) {
    for (HostCtl::Storage::TarnFileSystem* system : host.GetTarnFileSystems()) delete system;
  }
}
BENCHMARK(GetTarnFileSystems)->Arg(1000)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

void QueryAllConfigTarns(benchmark::State& state) {
  WorldShape shape;
  shape.configTarns = static_cast<int>(state.range(0));
  UseWorld(shape);
  Opened opened;
  const std::string id = HyraBench::ContainerId(0);
  for (auto _ : state) {
    QueryResult* result = nullptr;
    TarnLib_QueryAllConfigTarns(id.c_str(), 2147483647, 0, &result, 0);
    TarnLib_FreeQueryResult(result);
  }
}
BENCHMARK(QueryAllConfigTarns)->Arg(1000)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

void CheckTarnAccessibility(benchmark::State& state) {
  WorldShape shape;
  shape.configTarns = static_cast<int>(state.range(0));
  shape.mounted = true;
  UseWorld(shape);
  OskCtl::Storage::StorageInfoImpl host;
  HostCtl::Storage::TarnFileSystem* system = host.GetTarnFileSystemByPath("/hyra/volumes/c-0");
  std::vector<std::string> ids;
  Opened opened;
  QueryResult* result = nullptr;
  TarnLib_QueryAllConfigTarns(HyraBench::ContainerId(0).c_str(), 2147483647, 0, &result, 0);
  for (int32_t i = 0; result != nullptr && i < result->entryCount; ++i) {
    ids.push_back(result->entries[i]->tarnId);
  }
  TarnLib_FreeQueryResult(result);
  for (auto _ : state) benchmark::DoNotOptimize(system->CheckTarnAccessibility(ids));
}
BENCHMARK(CheckTarnAccessibility)
    ->Arg(1000)
    ->Arg(10000)
    ->Arg(100000)
    ->Unit(benchmark::kMillisecond);

void GetTarnMetadata(benchmark::State& state) {
  WorldShape shape;
  shape.metadataPairs = static_cast<int>(state.range(0));
  UseWorld(shape);
  Opened opened;
  const std::string id = HyraBench::ContainerId(0);
  for (auto _ : state) {
    TarnMetadata* metadata = nullptr;
    TarnLib_GetTarnMetadata(id.c_str(), HyraBench::kMetadataTarn, &metadata);
    TarnLib_FreeTarnMetadata(metadata);
  }
}
BENCHMARK(GetTarnMetadata)->Arg(1000)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

// Look-ups that touch one row cost the same in a small and a large world.
void TarnVpExistsAndGetTarnInfo(benchmark::State& state) {
  WorldShape shape;
  shape.containers = static_cast<int>(state.range(0));
  UseWorld(shape);
  Opened opened;
  OskCtl::Storage::StorageInfoImpl host;
  const std::string id = HyraBench::ContainerId(static_cast<int>(state.range(0)) - 1);
  for (auto _ : state) {
    benchmark::DoNotOptimize(host.TarnVpExists("vp-bench"));
    TarnInfo* info = nullptr;
    TarnLib_GetTarnInfo(id.c_str(), HyraBench::kMetadataTarn, &info);
    TarnLib_FreeTarnInfo(info);
  }
}
BENCHMARK(TarnVpExistsAndGetTarnInfo)
    ->Arg(1000)
    ->Arg(10000)
    ->Arg(100000)
    ->Unit(benchmark::kMicrosecond);

}  // namespace

BENCHMARK_MAIN();
