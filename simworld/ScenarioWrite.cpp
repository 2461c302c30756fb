#include <nlohmann/json.hpp>

#include "Scenario.h"

namespace HyraSim {
namespace {

using Json = nlohmann::ordered_json;

Json OrNull(const std::optional<std::string>& text) { return text ? Json(*text) : Json(nullptr); }

Json WriteDaemon(const Daemon& daemon) {
  Json rules = Json::array();
  for (const FaultRule& r : daemon.rules) {
    rules.push_back({{"operation", r.operation},
                     {"fault", r.fault},
                     {"frequency", r.frequency},
                     {"time", r.time}});
  }
  Json activations = Json::array();
  for (const Activation& a : daemon.activations) {
    activations.push_back({{"arrayId", a.arrayId},
                           {"provider", a.provider},
                           {"active", a.active},
                           {"activeProviderUrl", a.activeProviderUrl}});
  }
  Json faults = Json::array();
  for (const ProviderFault& f : daemon.providerFaults) {
    Json arrays = Json::array();
    for (const ProviderFaultArray& a : f.arrays) {
      arrays.push_back({{"arrayId", a.arrayId}, {"isActive", a.isActive}});
    }
    faults.push_back(
        {{"provider", f.provider}, {"url", f.url}, {"status", f.status}, {"arrays", arrays}});
  }
  Json d = Json::object();
  d["running"] = daemon.running;
  d["logLevel"] = daemon.logLevel;
  d["dumpRequests"] = daemon.dumpRequests;
  d["unbindPeriod"] = daemon.unbindPeriod;
  d["faultInjection"] = {{"enabled", daemon.faultInjectionEnabled}, {"rules", rules}};
  d["spaceEfficiencyManipulation"] = daemon.spaceEfficiencyManipulation;
  d["activations"] = activations;
  d["providerFaults"] = faults;
  return d;
}

Json WriteEndpoint(const ProtocolEndpoint& pe) {
  Json e = Json::object();
  e["localUID"] = pe.localUid;
  switch (pe.type) {
    case EndpointType::kScsi:
      e["type"] = "SCSI";
      e["lunId"] = pe.lunId;
      break;
    case EndpointType::kNfs:
      e["type"] = "NFS";
      e["ipAddress"] = pe.ipAddress;
      e["serverMount"] = pe.serverMount;
      break;
    case EndpointType::kNfs4x:
      e["type"] = "NFS4x";
      e["addresses"] = pe.addresses;
      e["serverMount"] = pe.serverMount;
      break;
  }
  e["accessible"] = pe.accessible;
  e["configured"] = pe.configured;
  return e;
}

Json WriteArrays(const std::vector<StorageArray>& arrays) {
  Json list = Json::array();
  for (const StorageArray& a : arrays) {
    Json endpoints = Json::array();
    for (const ProtocolEndpoint& pe : a.endpoints) endpoints.push_back(WriteEndpoint(pe));
    list.push_back({{"id", a.id},
                    {"name", a.name},
                    {"vendorId", a.vendorId},
                    {"modelId", a.modelId},
                    {"protocolEndpoints", endpoints}});
  }
  return list;
}

Json WriteTarn(const Tarn& t) {
  Json metadata = Json::array();
  for (const auto& pair : t.metadata) metadata.push_back(Json::array({pair.first, pair.second}));
  Json tarn = Json::object();
  tarn["uuid"] = t.uuid;
  tarn["logicalSizeMB"] = t.logicalSizeMB;
  tarn["committedSizeMB"] = t.committedSizeMB;
  tarn["unsharedSizeMB"] = t.unsharedSizeMB ? Json(*t.unsharedSizeMB) : Json(nullptr);
  tarn["storageProfile"] = OrNull(t.storageProfile);
  tarn["blockSize"] = t.blockSize;
  tarn["metadata"] = metadata;
  tarn["accessibility"] = t.accessibility;
  if (t.configTarn) {
    tarn["configTarn"] = {{"name", t.configTarn->name},
                          {"policy", t.configTarn->policy},
                          {"vmUuid", t.configTarn->vmUuid},
                          {"mounted", t.configTarn->mounted}};
  }
  return tarn;
}

Json WriteContainers(const std::vector<Container>& containers) {
  Json list = Json::array();
  for (const Container& c : containers) {
    Json tarns = Json::array();
    for (const Tarn& t : c.tarns) tarns.push_back(WriteTarn(t));
    list.push_back({{"name", c.name},
                    {"id", c.id},
                    {"vpUrl", c.vpUrl},
                    {"maxTarnSizeMB", c.maxTarnSizeMB},
                    {"arrays", c.arrays},
                    {"tarns", tarns}});
  }
  return list;
}

Json WriteHost(const WorldState& world) {
  Json providers = Json::array();
  for (const Provider& p : world.providers) {
    Json arrays = Json::array();
    for (const ProviderArray& a : p.arrays) {
      arrays.push_back(
          {{"arrayId", a.arrayId}, {"isActive", a.isActive}, {"priority", a.priority}});
    }
    Json provider = Json::object();
    provider["name"] = p.name;
    provider["url"] = p.url;
    // Nothing the commands send fills this field; it is written only when set.
    if (!p.reserved.empty()) provider["reserved"] = p.reserved;
    provider["arrays"] = arrays;
    providers.push_back(provider);
  }
  Json mounted = Json::array();
  for (const Mount& m : world.mounted) {
    mounted.push_back({{"name", m.name}, {"id", m.id}, {"arrays", m.arrays}});
  }
  return {
      {"providers", providers}, {"mounted", mounted}, {"kiroContext", OrNull(world.kiroContext)}};
}

}  // namespace

std::string WriteScenario(const WorldState& world) {
  Json document = Json::object();
  document["daemon"] = WriteDaemon(world.daemon);
  document["arrays"] = WriteArrays(world.arrays);
  document["containers"] = WriteContainers(world.containers);
  document["host"] = WriteHost(world);
  // Texts set through the libraries may hold any bytes; the document stays
  // valid JSON with U+FFFD in place of bytes that are not UTF-8.
  return document.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace HyraSim
