#include "Schema.h"

#include <map>
#include <string>
#include <utility>

#include "Connection.h"
#include "ContainerId.h"
#include "World.h"

namespace HyraSim {
namespace {

// 2: rows found through indexes, positions that may have gaps, the journal.
constexpr int64_t kLayoutVersion = 2;

// Child rows refer to their parent by its position, which orders the parent
// list; a removed row leaves a gap and an added one goes after the last. The
// *_key columns hold the form a look-up compares: the normal form of a
// container id (any other text unchanged), a tarn UUID in lower case.
const char* const kCreateTables = R"sql(
CREATE TABLE layout(version INTEGER NOT NULL);
CREATE TABLE daemon(running INTEGER, log_level INTEGER, dump_requests INTEGER,
  unbind_period INTEGER, fault_injection INTEGER, space_efficiency INTEGER);
CREATE TABLE fault_rule(pos INTEGER PRIMARY KEY, operation TEXT, fault TEXT,
  frequency INTEGER, time INTEGER);
CREATE INDEX fault_rule_by_key ON fault_rule(operation, fault, pos);
CREATE TABLE activation(pos INTEGER PRIMARY KEY, array_id TEXT, provider TEXT,
  active INTEGER, active_provider_url TEXT);
CREATE INDEX activation_by_key ON activation(array_id, provider, pos);
CREATE TABLE provider_fault(pos INTEGER PRIMARY KEY, provider TEXT, url TEXT, status TEXT);
CREATE INDEX provider_fault_by_provider ON provider_fault(provider, pos);
CREATE TABLE provider_fault_array(fault_pos INTEGER, pos INTEGER, array_id TEXT,
  is_active INTEGER, PRIMARY KEY(fault_pos, pos));
CREATE TABLE storage_array(pos INTEGER PRIMARY KEY, id TEXT, name TEXT, vendor_id TEXT,
  model_id TEXT);
CREATE INDEX storage_array_by_id ON storage_array(id, pos);
CREATE TABLE endpoint(array_pos INTEGER, pos INTEGER, local_uid TEXT, type INTEGER,
  lun_id TEXT, ip_address TEXT, server_mount TEXT, accessible INTEGER, configured INTEGER,
  PRIMARY KEY(array_pos, pos));
CREATE INDEX endpoint_by_uid ON endpoint(local_uid);
CREATE TABLE endpoint_address(array_pos INTEGER, endpoint_pos INTEGER, pos INTEGER,
  address TEXT, PRIMARY KEY(array_pos, endpoint_pos, pos));
CREATE TABLE container(pos INTEGER PRIMARY KEY, name TEXT, id TEXT, vp_url TEXT,
  max_tarn_size_mb INTEGER, id_key TEXT);
CREATE INDEX container_by_name ON container(name, pos);
CREATE INDEX container_by_id ON container(id_key, pos);
CREATE INDEX container_by_url ON container(vp_url, pos);
CREATE TABLE container_array(container_pos INTEGER, pos INTEGER, array_id TEXT,
  PRIMARY KEY(container_pos, pos));
CREATE TABLE tarn(container_pos INTEGER, pos INTEGER, uuid TEXT, logical_size_mb INTEGER,
  committed_size_mb INTEGER, unshared_size_mb INTEGER, storage_profile TEXT,
  block_size INTEGER, accessibility INTEGER, config_name TEXT, config_policy TEXT,
  config_vm_uuid TEXT, config_mounted INTEGER, uuid_key TEXT, PRIMARY KEY(container_pos, pos));
CREATE INDEX tarn_by_uuid ON tarn(container_pos, uuid_key, pos);
CREATE INDEX tarn_by_config_name ON tarn(container_pos, config_name, pos);
CREATE TABLE tarn_metadata(container_pos INTEGER, tarn_pos INTEGER, pos INTEGER, key TEXT,
  value TEXT, PRIMARY KEY(container_pos, tarn_pos, pos));
CREATE TABLE provider(pos INTEGER PRIMARY KEY, name TEXT, url TEXT, reserved TEXT);
CREATE INDEX provider_by_name ON provider(name, pos);
CREATE INDEX provider_by_url ON provider(url);
CREATE TABLE provider_array(provider_pos INTEGER, pos INTEGER, array_id TEXT,
  is_active INTEGER, priority INTEGER, PRIMARY KEY(provider_pos, pos));
CREATE TABLE mount(pos INTEGER PRIMARY KEY, name TEXT, id TEXT, id_key TEXT);
CREATE INDEX mount_by_name ON mount(name, pos);
CREATE INDEX mount_by_id ON mount(id_key, pos);
CREATE TABLE mount_array(mount_pos INTEGER, pos INTEGER, array_id TEXT,
  PRIMARY KEY(mount_pos, pos));
CREATE INDEX mount_array_by_array ON mount_array(array_id, mount_pos);
CREATE TABLE host(kiro_context TEXT);
CREATE TABLE failure(operation TEXT PRIMARY KEY, message TEXT, after INTEGER,
  times INTEGER, answer_null INTEGER);
CREATE TABLE journal(seq INTEGER PRIMARY KEY, operation TEXT, args TEXT,
  outcome TEXT, message TEXT);
)sql";

const char* const kTables[] = {"layout",        "daemon",          "fault_rule",
                               "activation",    "provider_fault",  "provider_fault_array",
                               "storage_array", "endpoint",        "endpoint_address",
                               "container",     "container_array", "tarn",
                               "tarn_metadata", "provider",        "provider_array",
                               "mount",         "mount_array",     "host",
                               "failure",       "journal"};

// Where each stored position of a list landed in the loaded list. Positions
// may have gaps; a child naming a position the list lacks means the database
// was changed behind the world's back.
template <typename Key>
class Positions {
 public:
  // The element at pos is at index of its list.
  void Add(const Key& pos, size_t index) { index_.emplace(pos, index); }
  size_t Of(const Key& pos, const char* table) const {
    const auto found = index_.find(pos);
    if (found == index_.end()) {
      throw WorldError(std::string("the world database is inconsistent (table ") + table + ")");
    }
    return found->second;
  }

 private:
  std::map<Key, size_t> index_;
};
using ListPositions = Positions<int64_t>;
using NestedPositions = Positions<std::pair<int64_t, int64_t> >;

int64_t Flag(bool value) { return value ? 1 : 0; }

std::optional<std::string> OptionalText(const Statement& row, int column) {
  if (row.IsNull(column)) return std::nullopt;
  return row.Text(column);
}

void LoadDaemon(sqlite3* db, Daemon& daemon) {
  Statement row(db,
                "SELECT running, log_level, dump_requests, unbind_period, fault_injection,"
                " space_efficiency FROM daemon");
  if (!row.Step()) throw WorldError("the world database is inconsistent (table daemon)");
  daemon.running = row.Int(0) != 0;
  daemon.logLevel = static_cast<int32_t>(row.Int(1));
  daemon.dumpRequests = row.Int(2);
  daemon.unbindPeriod = static_cast<int32_t>(row.Int(3));
  daemon.faultInjectionEnabled = row.Int(4) != 0;
  daemon.spaceEfficiencyManipulation = row.Int(5) != 0;

  Statement rules(db, "SELECT operation, fault, frequency, time FROM fault_rule ORDER BY pos");
  while (rules.Step()) {
    daemon.rules.push_back({rules.Text(0), rules.Text(1), static_cast<int32_t>(rules.Int(2)),
                            static_cast<int32_t>(rules.Int(3))});
  }
  Statement activations(db,
                        "SELECT array_id, provider, active, active_provider_url FROM activation"
                        " ORDER BY pos");
  while (activations.Step()) {
    daemon.activations.push_back(
        {activations.Text(0), activations.Text(1), activations.Int(2) != 0, activations.Text(3)});
  }
  ListPositions faultAt;
  Statement faults(db, "SELECT pos, provider, url, status FROM provider_fault ORDER BY pos");
  while (faults.Step()) {
    faultAt.Add(faults.Int(0), daemon.providerFaults.size());
    daemon.providerFaults.push_back({faults.Text(1), faults.Text(2), faults.Text(3), {}});
  }
  Statement faultArrays(db,
                        "SELECT fault_pos, array_id, is_active FROM provider_fault_array"
                        " ORDER BY fault_pos, pos");
  while (faultArrays.Step()) {
    daemon.providerFaults[faultAt.Of(faultArrays.Int(0), "provider_fault_array")].arrays.push_back(
        {faultArrays.Text(1), faultArrays.Int(2) != 0});
  }
}

void SaveDaemon(sqlite3* db, const Daemon& daemon) {
  Statement(db, "INSERT INTO daemon VALUES(?, ?, ?, ?, ?, ?)")
      .Bind(1, Flag(daemon.running))
      .Bind(2, int64_t{daemon.logLevel})
      .Bind(3, daemon.dumpRequests)
      .Bind(4, int64_t{daemon.unbindPeriod})
      .Bind(5, Flag(daemon.faultInjectionEnabled))
      .Bind(6, Flag(daemon.spaceEfficiencyManipulation))
      .Run();
  Statement rule(db, "INSERT INTO fault_rule VALUES(?, ?, ?, ?, ?)");
  for (size_t i = 0; i < daemon.rules.size(); ++i) {
    const FaultRule& r = daemon.rules[i];
    rule.Bind(1, int64_t(i)).Bind(2, r.operation).Bind(3, r.fault);
    rule.Bind(4, int64_t{r.frequency}).Bind(5, int64_t{r.time}).Run();
  }
  Statement activation(db, "INSERT INTO activation VALUES(?, ?, ?, ?, ?)");
  for (size_t i = 0; i < daemon.activations.size(); ++i) {
    const Activation& a = daemon.activations[i];
    activation.Bind(1, int64_t(i)).Bind(2, a.arrayId).Bind(3, a.provider);
    activation.Bind(4, Flag(a.active)).Bind(5, a.activeProviderUrl).Run();
  }
  Statement fault(db, "INSERT INTO provider_fault VALUES(?, ?, ?, ?)");
  Statement faultArray(db, "INSERT INTO provider_fault_array VALUES(?, ?, ?, ?)");
  for (size_t i = 0; i < daemon.providerFaults.size(); ++i) {
    const ProviderFault& f = daemon.providerFaults[i];
    fault.Bind(1, int64_t(i)).Bind(2, f.provider).Bind(3, f.url).Bind(4, f.status).Run();
    for (size_t j = 0; j < f.arrays.size(); ++j) {
      faultArray.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, f.arrays[j].arrayId);
      faultArray.Bind(4, Flag(f.arrays[j].isActive)).Run();
    }
  }
}

void LoadArrays(sqlite3* db, std::vector<StorageArray>& arrays) {
  ListPositions arrayAt;
  Statement array(db, "SELECT pos, id, name, vendor_id, model_id FROM storage_array ORDER BY pos");
  while (array.Step()) {
    arrayAt.Add(array.Int(0), arrays.size());
    arrays.push_back({array.Text(1), array.Text(2), array.Text(3), array.Text(4), {}});
  }
  NestedPositions endpointAt;
  Statement endpoint(db,
                     "SELECT array_pos, local_uid, type, lun_id, ip_address, server_mount,"
                     " accessible, configured, pos FROM endpoint ORDER BY array_pos, pos");
  while (endpoint.Step()) {
    ProtocolEndpoint pe = EndpointFrom(endpoint);
    auto& endpoints = arrays[arrayAt.Of(endpoint.Int(0), "endpoint")].endpoints;
    endpointAt.Add({endpoint.Int(0), endpoint.Int(8)}, endpoints.size());
    endpoints.push_back(std::move(pe));
  }
  Statement address(db,
                    "SELECT array_pos, endpoint_pos, address FROM endpoint_address"
                    " ORDER BY array_pos, endpoint_pos, pos");
  while (address.Step()) {
    auto& endpoints = arrays[arrayAt.Of(address.Int(0), "endpoint_address")].endpoints;
    endpoints[endpointAt.Of({address.Int(0), address.Int(1)}, "endpoint_address")]
        .addresses.push_back(address.Text(2));
  }
}

void SaveArrays(sqlite3* db, const std::vector<StorageArray>& arrays) {
  Statement array(db, "INSERT INTO storage_array VALUES(?, ?, ?, ?, ?)");
  Statement endpoint(db, "INSERT INTO endpoint VALUES(?, ?, ?, ?, ?, ?, ?, ?, ?)");
  Statement address(db, "INSERT INTO endpoint_address VALUES(?, ?, ?, ?)");
  for (size_t i = 0; i < arrays.size(); ++i) {
    const StorageArray& a = arrays[i];
    array.Bind(1, int64_t(i)).Bind(2, a.id).Bind(3, a.name).Bind(4, a.vendorId);
    array.Bind(5, a.modelId).Run();
    for (size_t j = 0; j < a.endpoints.size(); ++j) {
      const ProtocolEndpoint& pe = a.endpoints[j];
      endpoint.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, pe.localUid);
      endpoint.Bind(4, int64_t(pe.type)).Bind(5, pe.lunId).Bind(6, pe.ipAddress);
      endpoint.Bind(7, pe.serverMount).Bind(8, Flag(pe.accessible)).Bind(9, Flag(pe.configured));
      endpoint.Run();
      for (size_t k = 0; k < pe.addresses.size(); ++k) {
        address.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, int64_t(k));
        address.Bind(4, pe.addresses[k]).Run();
      }
    }
  }
}

void LoadContainers(sqlite3* db, std::vector<Container>& containers) {
  ListPositions containerAt;
  Statement container(db,
                      "SELECT pos, name, id, vp_url, max_tarn_size_mb FROM container ORDER BY pos");
  while (container.Step()) {
    containerAt.Add(container.Int(0), containers.size());
    containers.push_back(
        {container.Text(1), container.Text(2), container.Text(3), container.Int(4), {}, {}});
  }
  Statement array(db,
                  "SELECT container_pos, array_id FROM container_array"
                  " ORDER BY container_pos, pos");
  while (array.Step()) {
    containers[containerAt.Of(array.Int(0), "container_array")].arrays.push_back(array.Text(1));
  }
  NestedPositions tarnAt;
  Statement tarn(db,
                 "SELECT container_pos, uuid, logical_size_mb, committed_size_mb,"
                 " unshared_size_mb, storage_profile, block_size, accessibility, config_name,"
                 " config_policy, config_vm_uuid, config_mounted, pos FROM tarn"
                 " ORDER BY container_pos, pos");
  while (tarn.Step()) {
    Tarn t;
    t.uuid = tarn.Text(1);
    t.logicalSizeMB = tarn.Int(2);
    t.committedSizeMB = tarn.Int(3);
    if (!tarn.IsNull(4)) t.unsharedSizeMB = tarn.Int(4);
    t.storageProfile = OptionalText(tarn, 5);
    t.blockSize = tarn.Int(6);
    t.accessibility = static_cast<int32_t>(tarn.Int(7));
    if (!tarn.IsNull(8)) {
      t.configTarn = ConfigTarn{tarn.Text(8), tarn.Text(9), tarn.Text(10), tarn.Int(11) != 0};
    }
    auto& tarns = containers[containerAt.Of(tarn.Int(0), "tarn")].tarns;
    tarnAt.Add({tarn.Int(0), tarn.Int(12)}, tarns.size());
    tarns.push_back(std::move(t));
  }
  Statement metadata(db,
                     "SELECT container_pos, tarn_pos, key, value FROM tarn_metadata"
                     " ORDER BY container_pos, tarn_pos, pos");
  while (metadata.Step()) {
    auto& tarns = containers[containerAt.Of(metadata.Int(0), "tarn_metadata")].tarns;
    tarns[tarnAt.Of({metadata.Int(0), metadata.Int(1)}, "tarn_metadata")].metadata.emplace_back(
        metadata.Text(2), metadata.Text(3));
  }
}

void SaveContainers(sqlite3* db, const std::vector<Container>& containers) {
  Statement container(db, "INSERT INTO container VALUES(?, ?, ?, ?, ?, ?)");
  Statement array(db, "INSERT INTO container_array VALUES(?, ?, ?)");
  Statement tarn(db, "INSERT INTO tarn VALUES(?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)");
  Statement metadata(db, "INSERT INTO tarn_metadata VALUES(?, ?, ?, ?, ?)");
  for (size_t i = 0; i < containers.size(); ++i) {
    const Container& c = containers[i];
    container.Bind(1, int64_t(i)).Bind(2, c.name).Bind(3, c.id).Bind(4, c.vpUrl);
    container.Bind(5, c.maxTarnSizeMB).Bind(6, ContainerIdText(c.id)).Run();
    for (size_t j = 0; j < c.arrays.size(); ++j) {
      array.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, c.arrays[j]).Run();
    }
    for (size_t j = 0; j < c.tarns.size(); ++j) {
      const Tarn& t = c.tarns[j];
      tarn.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, t.uuid).Bind(4, t.logicalSizeMB);
      tarn.Bind(5, t.committedSizeMB).Bind(6, t.unsharedSizeMB).Bind(7, t.storageProfile);
      tarn.Bind(8, t.blockSize).Bind(9, int64_t{t.accessibility});
      const ConfigTarn* ct = t.configTarn ? &*t.configTarn : nullptr;
      tarn.Bind(10, ct ? std::optional<std::string>(ct->name) : std::nullopt);
      tarn.Bind(11, ct ? ct->policy : std::string()).Bind(12, ct ? ct->vmUuid : std::string());
      tarn.Bind(13, Flag(ct != nullptr && ct->mounted)).Bind(14, UuidKey(t.uuid)).Run();
      for (size_t k = 0; k < t.metadata.size(); ++k) {
        metadata.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, int64_t(k));
        metadata.Bind(4, t.metadata[k].first).Bind(5, t.metadata[k].second).Run();
      }
    }
  }
}

void LoadProviders(sqlite3* db, std::vector<Provider>& providers) {
  ListPositions providerAt;
  Statement provider(db, "SELECT pos, name, url, reserved FROM provider ORDER BY pos");
  while (provider.Step()) {
    providerAt.Add(provider.Int(0), providers.size());
    providers.push_back({provider.Text(1), provider.Text(2), provider.Text(3), {}});
  }
  Statement array(db,
                  "SELECT provider_pos, array_id, is_active, priority FROM provider_array"
                  " ORDER BY provider_pos, pos");
  while (array.Step()) {
    providers[providerAt.Of(array.Int(0), "provider_array")].arrays.push_back(
        {array.Text(1), array.Int(2) != 0, static_cast<int32_t>(array.Int(3))});
  }
}

void SaveProviders(sqlite3* db, const std::vector<Provider>& providers) {
  Statement provider(db, "INSERT INTO provider VALUES(?, ?, ?, ?)");
  Statement array(db, "INSERT INTO provider_array VALUES(?, ?, ?, ?, ?)");
  for (size_t i = 0; i < providers.size(); ++i) {
    const Provider& p = providers[i];
    provider.Bind(1, int64_t(i)).Bind(2, p.name).Bind(3, p.url).Bind(4, p.reserved).Run();
    for (size_t j = 0; j < p.arrays.size(); ++j) {
      array.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, p.arrays[j].arrayId);
      array.Bind(4, Flag(p.arrays[j].isActive)).Bind(5, int64_t{p.arrays[j].priority}).Run();
    }
  }
}

void LoadMounts(sqlite3* db, std::vector<Mount>& mounted) {
  ListPositions mountAt;
  Statement mount(db, "SELECT pos, name, id FROM mount ORDER BY pos");
  while (mount.Step()) {
    mountAt.Add(mount.Int(0), mounted.size());
    mounted.push_back({mount.Text(1), mount.Text(2), {}});
  }
  Statement array(db, "SELECT mount_pos, array_id FROM mount_array ORDER BY mount_pos, pos");
  while (array.Step()) {
    mounted[mountAt.Of(array.Int(0), "mount_array")].arrays.push_back(array.Text(1));
  }
}

void SaveMounts(sqlite3* db, const std::vector<Mount>& mounted) {
  Statement mount(db, "INSERT INTO mount VALUES(?, ?, ?, ?)");
  Statement array(db, "INSERT INTO mount_array VALUES(?, ?, ?)");
  for (size_t i = 0; i < mounted.size(); ++i) {
    mount.Bind(1, int64_t(i)).Bind(2, mounted[i].name).Bind(3, mounted[i].id);
    mount.Bind(4, ContainerIdText(mounted[i].id)).Run();
    for (size_t j = 0; j < mounted[i].arrays.size(); ++j) {
      array.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, mounted[i].arrays[j]).Run();
    }
  }
}

void LoadKiro(sqlite3* db, std::optional<std::string>& context) {
  Statement row(db, "SELECT kiro_context FROM host");
  if (!row.Step()) throw WorldError("the world database is inconsistent (table host)");
  context = OptionalText(row, 0);
}

void SaveKiro(sqlite3* db, const std::optional<std::string>& context) {
  Statement(db, "INSERT INTO host VALUES(?)").Bind(1, context).Run();
}

// Answers whether the database holds any table; refuses one without a world.
bool RequireWorldOrEmpty(sqlite3* db) {
  Statement tables(db, "SELECT count(*), coalesce(sum(name = 'layout'), 0) FROM sqlite_master");
  tables.Step();
  if (tables.Int(0) > 0 && tables.Int(1) == 0) throw WorldError("it holds no Hyra world");
  return tables.Int(0) > 0;
}

// The stored layout version, or -1 when there is none. One statement: this is
// all a process's first operation checks of a world that exists.
int64_t StoredLayout(sqlite3* db) {
  sqlite3_stmt* stmt = nullptr;
  if (sqlite3_prepare_v2(db, "SELECT version FROM layout", -1, &stmt, nullptr) != SQLITE_OK) {
    sqlite3_finalize(stmt);
    return -1;
  }
  const int64_t version = sqlite3_step(stmt) == SQLITE_ROW ? sqlite3_column_int64(stmt, 0) : -1;
  sqlite3_finalize(stmt);
  return version;
}

}  // namespace

ProtocolEndpoint EndpointFrom(const Statement& row) {
  ProtocolEndpoint pe;
  pe.localUid = row.Text(1);
  const int64_t type = row.Int(2);
  if (type < int64_t(EndpointType::kScsi) || type > int64_t(EndpointType::kNfs4x)) {
    throw WorldError("the world database is inconsistent (table endpoint)");
  }
  pe.type = static_cast<EndpointType>(type);
  pe.lunId = row.Text(3);
  pe.ipAddress = row.Text(4);
  pe.serverMount = row.Text(5);
  pe.accessible = row.Int(6) != 0;
  pe.configured = row.Int(7) != 0;
  return pe;
}

void RefuseForeignDatabase(sqlite3* db) {
  if (StoredLayout(db) != kLayoutVersion) RequireWorldOrEmpty(db);
}

bool HasWorld(sqlite3* db) {
  const int64_t version = StoredLayout(db);
  if (version == kLayoutVersion) return true;
  if (!RequireWorldOrEmpty(db)) return false;
  throw WorldError("the world at " + DatabasePath() + " has layout " + std::to_string(version) +
                   " but this build reads layout " + std::to_string(kLayoutVersion) +
                   "; replace it with hyrasim init --demo or hyrasim init --scenario FILE");
}

void CreateSchema(sqlite3* db) {
  for (const char* table : kTables) {
    Exec(db, (std::string("DROP TABLE IF EXISTS ") + table).c_str());
  }
  Exec(db, kCreateTables);
  Statement(db, "INSERT INTO layout VALUES(?)").Bind(1, kLayoutVersion).Run();
}

WorldState LoadWorld(sqlite3* db) {
  WorldState world;
  LoadDaemon(db, world.daemon);
  LoadArrays(db, world.arrays);
  LoadContainers(db, world.containers);
  LoadProviders(db, world.providers);
  LoadMounts(db, world.mounted);
  LoadKiro(db, world.kiroContext);
  return world;
}

void SaveWorld(sqlite3* db, const WorldState& world) {
  SaveDaemon(db, world.daemon);
  SaveArrays(db, world.arrays);
  SaveContainers(db, world.containers);
  SaveProviders(db, world.providers);
  SaveMounts(db, world.mounted);
  SaveKiro(db, world.kiroContext);
}

}  // namespace HyraSim
