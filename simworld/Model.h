// The simulated host as records: the whole world when it is shown, exported or
// replaced, the rows an operation reads otherwise. What the daemon knows, what
// the host has registered and mounted. Lists keep the world's
// order (the scenario's order, later additions at the end).
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace HyraSim {

enum class EndpointType { kScsi, kNfs, kNfs4x };

struct ProtocolEndpoint {
  std::string localUid;
  EndpointType type = EndpointType::kScsi;
  std::string lunId;                   // SCSI only
  std::string ipAddress;               // NFS only
  std::string serverMount;             // NFS and NFS4x
  std::vector<std::string> addresses;  // NFS4x only; may be empty
  bool accessible = true;
  bool configured = true;
};

struct StorageArray {
  std::string id;
  std::string name;
  std::string vendorId;
  std::string modelId;
  std::vector<ProtocolEndpoint> endpoints;
};

struct ConfigTarn {
  std::string name;  // directory name, unique within its container
  std::string policy;
  std::string vmUuid;
  bool mounted = false;
};

struct Tarn {
  std::string uuid;
  int64_t logicalSizeMB = 0;
  int64_t committedSizeMB = 0;
  std::optional<int64_t> unsharedSizeMB;  // empty: unknown
  std::optional<std::string> storageProfile;
  int64_t blockSize = 4096;
  std::vector<std::pair<std::string, std::string> > metadata;
  int32_t accessibility = 3;  // a TarnAccessibilityType, or any other number a test wants
  std::optional<ConfigTarn> configTarn;
};

struct Container {
  std::string name;
  std::string id;  // a valid container id, kept as given
  std::string vpUrl;
  int64_t maxTarnSizeMB = 0;
  std::vector<std::string> arrays;  // ids of the arrays that back it
  std::vector<Tarn> tarns;
};

struct FaultRule {
  std::string operation;
  std::string fault;
  int32_t frequency = -1;
  int32_t time = -1;
};

struct Activation {
  std::string arrayId;
  std::string provider;
  bool active = true;
  std::string activeProviderUrl;
};

struct ProviderFaultArray {
  std::string arrayId;
  bool isActive = true;
};

struct ProviderFault {
  std::string provider;
  std::string url;
  std::string status;
  std::vector<ProviderFaultArray> arrays;
};

// What the daemon was told, and whether it runs.
struct Daemon {
  bool running = true;
  int32_t logLevel = 4;
  int64_t dumpRequests = 0;
  int32_t unbindPeriod = 300000000;
  bool faultInjectionEnabled = false;
  std::vector<FaultRule> rules;
  bool spaceEfficiencyManipulation = true;
  std::vector<Activation> activations;
  std::vector<ProviderFault> providerFaults;
};

struct ProviderArray {
  std::string arrayId;
  bool isActive = true;
  int32_t priority = 0;
};

struct Provider {
  std::string name;
  std::string url;
  std::string reserved;
  std::vector<ProviderArray> arrays;
};

// A mounted container file system; the id is kept exactly as given at mount.
struct Mount {
  std::string name;
  std::string id;
  std::vector<std::string> arrays;
};

struct WorldState {
  Daemon daemon;
  std::vector<StorageArray> arrays;
  std::vector<Container> containers;
  std::vector<Provider> providers;
  std::vector<Mount> mounted;
  std::optional<std::string> kiroContext;

  const StorageArray* FindArray(const std::string& id) const;
  Provider* FindProvider(const std::string& name);
  // The daemon learns of a container through a provider registered on the host
  // whose URL is the container's provider URL; only those are exported.
  bool IsExported(const Container& container) const;
};

// Tarn UUIDs compare without regard to case: two are the same when their keys
// are.
std::string UuidKey(const std::string& uuid);

// The mount path of a container file system.
std::string MountPath(const std::string& containerName);
// A name that can be a directory below the volumes directory.
bool IsValidMountName(const std::string& name);

}  // namespace HyraSim
