#include "WorldGenerator.h"

#include <cstdio>
#include <nlohmann/json.hpp>

namespace HyraBench {

const char kMetadataTarn[] = "00000000-1111-4222-8333-444444444444";
const char kProviderUrl[] = "https://vp-bench.example.test:8443/kiro";

namespace {

using nlohmann::ordered_json;

std::string Uuid(unsigned prefix, int i) {
  char text[40];
  std::snprintf(text, sizeof(text), "%08x-0000-4000-8000-%012x", prefix, static_cast<unsigned>(i));
  return text;
}

// Four endpoints of the three kinds, as a real array may carry them.
ordered_json Array(const std::string& id) {
  ordered_json endpoints = ordered_json::array();
  for (int e = 0; e < 4; ++e) {
    const std::string uid = id + "-pe" + std::to_string(e);
    ordered_json pe = {{"localUID", uid}};
    if (e % 3 == 0) {
      pe["type"] = "NFS";
      pe["ipAddress"] = "192.0.2." + std::to_string(e + 10);
      pe["serverMount"] = "/exports/" + uid;
    } else if (e % 3 == 1) {
      pe["type"] = "SCSI";
      pe["lunId"] = "lun-" + uid;
    } else {
      pe["type"] = "NFS4x";
      pe["addresses"] = {"192.0.2.20", "192.0.2.21"};
      pe["serverMount"] = "/exports/" + uid;
    }
    pe["accessible"] = true;
    pe["configured"] = true;
    endpoints.push_back(pe);
  }
  return {{"id", id},
          {"name", "Array " + id},
          {"vendorId", "ACME"},
          {"modelId", "M100"},
          {"protocolEndpoints", endpoints}};
}

ordered_json Tarn(const std::string& uuid) {
  return {{"uuid", uuid},
          {"logicalSizeMB", 1024},
          {"committedSizeMB", 128},
          {"unsharedSizeMB", 64},
          {"storageProfile", "bench"},
          {"blockSize", 4096},
          {"metadata", ordered_json::array()},
          {"accessibility", 3}};
}

}  // namespace

std::string ContainerId(int i) { return Uuid(0xc0000000u, i); }

std::string GenerateScenario(const WorldShape& shape) {
  ordered_json arrays = ordered_json::array();
  ordered_json providerArrays = ordered_json::array();
  auto addArray = [&](const std::string& id) {
    arrays.push_back(Array(id));
    providerArrays.push_back({{"arrayId", id}, {"isActive", true}, {"priority", 1}});
  };
  if (!shape.distinctArrays) {
    addArray("array-0");
    addArray("array-1");
  }
  ordered_json containers = ordered_json::array();
  ordered_json mounted = ordered_json::array();
  for (int i = 0; i < shape.containers; ++i) {
    const std::string name = "c-" + std::to_string(i);
    ordered_json ids = {"array-0", "array-1"};
    if (shape.distinctArrays) {
      ids = {"array-" + std::to_string(2 * i), "array-" + std::to_string(2 * i + 1)};
      addArray(ids[0]);
      addArray(ids[1]);
    }
    ordered_json tarns = ordered_json::array();
    if (i == 0) {
      ordered_json plain = Tarn(kMetadataTarn);
      for (int m = 0; m < shape.metadataPairs; ++m) {
        plain["metadata"].push_back({"key-" + std::to_string(m), "value-" + std::to_string(m)});
      }
      tarns.push_back(plain);
      for (int t = 0; t < shape.configTarns; ++t) {
        ordered_json config = Tarn(Uuid(0xcf000000u, t));
        config["configTarn"] = {{"name", "config-" + std::to_string(t)},
                                {"policy", ""},
                                {"vmUuid", Uuid(0x0e000000u, t)},
                                {"mounted", false}};
        tarns.push_back(config);
      }
    }
    containers.push_back({{"name", name},
                          {"id", ContainerId(i)},
                          {"vpUrl", kProviderUrl},
                          {"maxTarnSizeMB", 1048576},
                          {"arrays", ids},
                          {"tarns", tarns}});
    if (shape.mounted) mounted.push_back({{"name", name}, {"id", ContainerId(i)}, {"arrays", ids}});
  }
  const ordered_json world = {
      {"daemon",
       {{"running", true},
        {"logLevel", 4},
        {"dumpRequests", 0},
        {"unbindPeriod", 300000000},
        {"faultInjection", {{"enabled", false}, {"rules", ordered_json::array()}}},
        {"spaceEfficiencyManipulation", true},
        {"activations", ordered_json::array()},
        {"providerFaults", ordered_json::array()}}},
      {"arrays", arrays},
      {"containers", containers},
      {"host",
       {{"providers", {{{"name", "vp-bench"}, {"url", kProviderUrl}, {"arrays", providerArrays}}}},
        {"mounted", mounted},
        {"kiroContext", nullptr}}}};
  return world.dump() + "\n";
}

}  // namespace HyraBench
