// Targeted reads and writes of the world's rows, for the operations of the
// stand-in host libraries: each touches only the rows it names, found through
// an index, so that an operation costs what it touches and not what the world
// holds. Lists keep their order by position; an added row goes last.
//
// Container ids are looked up by their normal form (any text that is not an
// id by itself), tarn UUIDs without regard to case. Everything here runs
// inside an operation's transaction.
#pragma once

#include <sqlite3.h>

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "Model.h"

namespace HyraSim {

// Mounted container file systems. Mounts are read without their arrays.
std::vector<Mount> ReadMounts(sqlite3* db);
std::optional<Mount> FindMountNamed(sqlite3* db, const std::string& name);
std::optional<Mount> FindMountOf(sqlite3* db, const std::string& containerId);
void AddMount(sqlite3* db, const Mount& mount);
// Removes every mount of the container; answers how many there were.
int64_t RemoveMountsOf(sqlite3* db, const std::string& containerId);
// The names of the mounts backed by the array, in mount order.
std::vector<std::string> MountsOnArray(sqlite3* db, const std::string& arrayId);

// Providers registered on the host; the first of a name is the one used.
std::optional<Provider> FindProviderNamed(sqlite3* db, const std::string& name);
// Replaces the provider of that name in its place, or appends it.
void StoreProvider(sqlite3* db, const Provider& provider);
bool RemoveProviderNamed(sqlite3* db, const std::string& name);
bool ProviderServesArray(sqlite3* db, const std::string& name, const std::string& arrayId);

// Storage arrays and their protocol endpoints.
std::optional<StorageArray> FindArray(sqlite3* db, const std::string& id);
// Sets the accessibility of every endpoint with that local UID; answers the
// id of the array of the last one, or nothing when no endpoint has it.
std::optional<std::string> SetEndpointAccessible(sqlite3* db, const std::string& localUid,
                                                 bool accessible);

// A container with its place in the list, read without arrays or tarns.
struct ContainerRow {
  int64_t pos = 0;
  Container container;
};
// The first container, exported or not, whose id names the same container.
std::optional<ContainerRow> FindContainerOf(sqlite3* db, const std::string& containerId);
// The first exported container whose id has that normal form.
std::optional<ContainerRow> FindExportedContainer(sqlite3* db, const std::string& normalId);
// Hands every exported container, in order, with its array ids and no tarns.
void ForEachExportedContainer(sqlite3* db, const std::function<void(const Container&)>& visit);

// A tarn with its place in its container, read without metadata.
struct TarnRow {
  int64_t pos = 0;
  Tarn tarn;
};
std::optional<TarnRow> FindTarnIn(sqlite3* db, int64_t containerPos, const std::string& uuid);
std::optional<TarnRow> FindConfigTarnIn(sqlite3* db, int64_t containerPos, const std::string& name);
std::vector<std::pair<std::string, std::string> > ReadTarnMetadata(sqlite3* db,
                                                                   int64_t containerPos,
                                                                   int64_t tarnPos);
// The config-tarns of a container in order, skipping offset, at most limit.
std::vector<Tarn> ReadConfigTarns(sqlite3* db, int64_t containerPos, int64_t offset, int64_t limit);
void AddTarn(sqlite3* db, int64_t containerPos, const Tarn& tarn);
void SetConfigTarnMounted(sqlite3* db, int64_t containerPos, int64_t tarnPos, bool mounted);
void RemoveTarn(sqlite3* db, int64_t containerPos, int64_t tarnPos);

// What the daemon was told.
bool DaemonRunning(sqlite3* db);
void StoreDaemonRunning(sqlite3* db, bool running);
void StoreFaultInjectionEnabled(sqlite3* db, bool enabled);
void StoreSpaceEfficiencyManipulation(sqlite3* db, bool enabled);
// Null pointers leave a setting as it is; dump counts one more dump request.
void StoreDebugSettings(sqlite3* db, const int32_t* logLevel, bool dump,
                        const int32_t* unbindPeriod);
// The position of the rule for that operation and fault.
std::optional<int64_t> FindRule(sqlite3* db, const std::string& operation,
                                const std::string& fault);
void AddRule(sqlite3* db, const FaultRule& rule);
void UpdateRule(sqlite3* db, int64_t pos, int32_t frequency, int32_t time);
void RemoveRule(sqlite3* db, int64_t pos);
// Updates the activation of that array and provider, or appends it.
void RecordActivation(sqlite3* db, const Activation& activation);
// The latest injection for a provider replaces its earlier ones.
void ReplaceProviderFault(sqlite3* db, const ProviderFault& fault);

void StoreKiroContext(sqlite3* db, const std::optional<std::string>& context);

}  // namespace HyraSim
