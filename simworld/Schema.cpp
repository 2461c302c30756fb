#include "Schema.h"

#include <string>

#include "Connection.h"
#include "World.h"

namespace HyraSim {
namespace {

constexpr int64_t kLayoutVersion = 1;

// Child rows refer to their parent by its position in the parent list.
const char* const kCreateTables = R"sql(
CREATE TABLE layout(version INTEGER NOT NULL);
CREATE TABLE daemon(running INTEGER, log_level INTEGER, dump_requests INTEGER,
  unbind_period INTEGER, fault_injection INTEGER, space_efficiency INTEGER);
CREATE TABLE fault_rule(pos INTEGER PRIMARY KEY, operation TEXT, fault TEXT,
  frequency INTEGER, time INTEGER);
CREATE TABLE activation(pos INTEGER PRIMARY KEY, array_id TEXT, provider TEXT,
  active INTEGER, active_provider_url TEXT);
CREATE TABLE provider_fault(pos INTEGER PRIMARY KEY, provider TEXT, url TEXT, status TEXT);
CREATE TABLE provider_fault_array(fault_pos INTEGER, pos INTEGER, array_id TEXT,
  is_active INTEGER, PRIMARY KEY(fault_pos, pos));
CREATE TABLE storage_array(pos INTEGER PRIMARY KEY, id TEXT, name TEXT, vendor_id TEXT,
  model_id TEXT);
CREATE TABLE endpoint(array_pos INTEGER, pos INTEGER, local_uid TEXT, type INTEGER,
  lun_id TEXT, ip_address TEXT, server_mount TEXT, accessible INTEGER, configured INTEGER,
  PRIMARY KEY(array_pos, pos));
CREATE TABLE endpoint_address(array_pos INTEGER, endpoint_pos INTEGER, pos INTEGER,
  address TEXT, PRIMARY KEY(array_pos, endpoint_pos, pos));
CREATE TABLE container(pos INTEGER PRIMARY KEY, name TEXT, id TEXT, vp_url TEXT,
  max_tarn_size_mb INTEGER);
CREATE TABLE container_array(container_pos INTEGER, pos INTEGER, array_id TEXT,
  PRIMARY KEY(container_pos, pos));
CREATE TABLE tarn(container_pos INTEGER, pos INTEGER, uuid TEXT, logical_size_mb INTEGER,
  committed_size_mb INTEGER, unshared_size_mb INTEGER, storage_profile TEXT,
  block_size INTEGER, accessibility INTEGER, config_name TEXT, config_policy TEXT,
  config_vm_uuid TEXT, config_mounted INTEGER, PRIMARY KEY(container_pos, pos));
CREATE TABLE tarn_metadata(container_pos INTEGER, tarn_pos INTEGER, pos INTEGER, key TEXT,
  value TEXT, PRIMARY KEY(container_pos, tarn_pos, pos));
CREATE TABLE provider(pos INTEGER PRIMARY KEY, name TEXT, url TEXT, reserved TEXT);
CREATE TABLE provider_array(provider_pos INTEGER, pos INTEGER, array_id TEXT,
  is_active INTEGER, priority INTEGER, PRIMARY KEY(provider_pos, pos));
CREATE TABLE mount(pos INTEGER PRIMARY KEY, name TEXT, id TEXT);
CREATE TABLE mount_array(mount_pos INTEGER, pos INTEGER, array_id TEXT,
  PRIMARY KEY(mount_pos, pos));
CREATE TABLE host(kiro_context TEXT);
CREATE TABLE failure(operation TEXT PRIMARY KEY, message TEXT, after INTEGER,
  times INTEGER, answer_null INTEGER);
)sql";

const char* const kTables[] = {"layout",        "daemon",          "fault_rule",
                               "activation",    "provider_fault",  "provider_fault_array",
                               "storage_array", "endpoint",        "endpoint_address",
                               "container",     "container_array", "tarn",
                               "tarn_metadata", "provider",        "provider_array",
                               "mount",         "mount_array",     "host",
                               "failure"};

// The element at a stored position; a position outside the list means the
// database was changed behind the world's back.
template <typename T>
T& At(std::vector<T>& list, int64_t pos, const char* table) {
  if (pos < 0 || static_cast<uint64_t>(pos) >= list.size()) {
    throw WorldError(std::string("the world database is inconsistent (table ") + table + ")");
  }
  return list[static_cast<size_t>(pos)];
}

void ClearTables(sqlite3* db, std::initializer_list<const char*> tables) {
  for (const char* table : tables) Exec(db, (std::string("DELETE FROM ") + table).c_str());
}

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
  Statement faults(db, "SELECT provider, url, status FROM provider_fault ORDER BY pos");
  while (faults.Step()) {
    daemon.providerFaults.push_back({faults.Text(0), faults.Text(1), faults.Text(2), {}});
  }
  Statement faultArrays(db,
                        "SELECT fault_pos, array_id, is_active FROM provider_fault_array"
                        " ORDER BY fault_pos, pos");
  while (faultArrays.Step()) {
    At(daemon.providerFaults, faultArrays.Int(0), "provider_fault_array")
        .arrays.push_back({faultArrays.Text(1), faultArrays.Int(2) != 0});
  }
}

void SaveDaemon(sqlite3* db, const Daemon& daemon) {
  ClearTables(db, {"daemon", "fault_rule", "activation", "provider_fault", "provider_fault_array"});
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
  Statement array(db, "SELECT id, name, vendor_id, model_id FROM storage_array ORDER BY pos");
  while (array.Step()) {
    arrays.push_back({array.Text(0), array.Text(1), array.Text(2), array.Text(3), {}});
  }
  Statement endpoint(db,
                     "SELECT array_pos, local_uid, type, lun_id, ip_address, server_mount,"
                     " accessible, configured FROM endpoint ORDER BY array_pos, pos");
  while (endpoint.Step()) {
    ProtocolEndpoint pe;
    pe.localUid = endpoint.Text(1);
    const int64_t type = endpoint.Int(2);
    if (type < int64_t(EndpointType::kScsi) || type > int64_t(EndpointType::kNfs4x)) {
      throw WorldError("the world database is inconsistent (table endpoint)");
    }
    pe.type = static_cast<EndpointType>(type);
    pe.lunId = endpoint.Text(3);
    pe.ipAddress = endpoint.Text(4);
    pe.serverMount = endpoint.Text(5);
    pe.accessible = endpoint.Int(6) != 0;
    pe.configured = endpoint.Int(7) != 0;
    At(arrays, endpoint.Int(0), "endpoint").endpoints.push_back(std::move(pe));
  }
  Statement address(db,
                    "SELECT array_pos, endpoint_pos, address FROM endpoint_address"
                    " ORDER BY array_pos, endpoint_pos, pos");
  while (address.Step()) {
    auto& endpoints = At(arrays, address.Int(0), "endpoint_address").endpoints;
    At(endpoints, address.Int(1), "endpoint_address").addresses.push_back(address.Text(2));
  }
}

void SaveArrays(sqlite3* db, const std::vector<StorageArray>& arrays) {
  ClearTables(db, {"storage_array", "endpoint", "endpoint_address"});
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
  Statement container(db, "SELECT name, id, vp_url, max_tarn_size_mb FROM container ORDER BY pos");
  while (container.Step()) {
    containers.push_back(
        {container.Text(0), container.Text(1), container.Text(2), container.Int(3), {}, {}});
  }
  Statement array(db,
                  "SELECT container_pos, array_id FROM container_array"
                  " ORDER BY container_pos, pos");
  while (array.Step()) {
    At(containers, array.Int(0), "container_array").arrays.push_back(array.Text(1));
  }
  Statement tarn(db,
                 "SELECT container_pos, uuid, logical_size_mb, committed_size_mb,"
                 " unshared_size_mb, storage_profile, block_size, accessibility, config_name,"
                 " config_policy, config_vm_uuid, config_mounted FROM tarn"
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
    At(containers, tarn.Int(0), "tarn").tarns.push_back(std::move(t));
  }
  Statement metadata(db,
                     "SELECT container_pos, tarn_pos, key, value FROM tarn_metadata"
                     " ORDER BY container_pos, tarn_pos, pos");
  while (metadata.Step()) {
    auto& tarns = At(containers, metadata.Int(0), "tarn_metadata").tarns;
    At(tarns, metadata.Int(1), "tarn_metadata")
        .metadata.emplace_back(metadata.Text(2), metadata.Text(3));
  }
}

void SaveContainers(sqlite3* db, const std::vector<Container>& containers) {
  ClearTables(db, {"container", "container_array", "tarn", "tarn_metadata"});
  Statement container(db, "INSERT INTO container VALUES(?, ?, ?, ?, ?)");
  Statement array(db, "INSERT INTO container_array VALUES(?, ?, ?)");
  Statement tarn(db, "INSERT INTO tarn VALUES(?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)");
  Statement metadata(db, "INSERT INTO tarn_metadata VALUES(?, ?, ?, ?, ?)");
  for (size_t i = 0; i < containers.size(); ++i) {
    const Container& c = containers[i];
    container.Bind(1, int64_t(i)).Bind(2, c.name).Bind(3, c.id).Bind(4, c.vpUrl);
    container.Bind(5, c.maxTarnSizeMB).Run();
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
      tarn.Bind(13, Flag(ct != nullptr && ct->mounted)).Run();
      for (size_t k = 0; k < t.metadata.size(); ++k) {
        metadata.Bind(1, int64_t(i)).Bind(2, int64_t(j)).Bind(3, int64_t(k));
        metadata.Bind(4, t.metadata[k].first).Bind(5, t.metadata[k].second).Run();
      }
    }
  }
}

void LoadProviders(sqlite3* db, std::vector<Provider>& providers) {
  Statement provider(db, "SELECT name, url, reserved FROM provider ORDER BY pos");
  while (provider.Step()) {
    providers.push_back({provider.Text(0), provider.Text(1), provider.Text(2), {}});
  }
  Statement array(db,
                  "SELECT provider_pos, array_id, is_active, priority FROM provider_array"
                  " ORDER BY provider_pos, pos");
  while (array.Step()) {
    At(providers, array.Int(0), "provider_array")
        .arrays.push_back({array.Text(1), array.Int(2) != 0, static_cast<int32_t>(array.Int(3))});
  }
}

void SaveProviders(sqlite3* db, const std::vector<Provider>& providers) {
  ClearTables(db, {"provider", "provider_array"});
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
  Statement mount(db, "SELECT name, id FROM mount ORDER BY pos");
  while (mount.Step()) mounted.push_back({mount.Text(0), mount.Text(1), {}});
  Statement array(db, "SELECT mount_pos, array_id FROM mount_array ORDER BY mount_pos, pos");
  while (array.Step()) At(mounted, array.Int(0), "mount_array").arrays.push_back(array.Text(1));
}

void SaveMounts(sqlite3* db, const std::vector<Mount>& mounted) {
  ClearTables(db, {"mount", "mount_array"});
  Statement mount(db, "INSERT INTO mount VALUES(?, ?, ?)");
  Statement array(db, "INSERT INTO mount_array VALUES(?, ?, ?)");
  for (size_t i = 0; i < mounted.size(); ++i) {
    mount.Bind(1, int64_t(i)).Bind(2, mounted[i].name).Bind(3, mounted[i].id).Run();
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
  ClearTables(db, {"host"});
  Statement(db, "INSERT INTO host VALUES(?)").Bind(1, context).Run();
}

// Answers whether the database holds any table; refuses one without a world.
bool RequireWorldOrEmpty(sqlite3* db) {
  Statement tables(db, "SELECT count(*), coalesce(sum(name = 'layout'), 0) FROM sqlite_master");
  tables.Step();
  if (tables.Int(0) > 0 && tables.Int(1) == 0) throw WorldError("it holds no Hyra world");
  return tables.Int(0) > 0;
}

}  // namespace

void RefuseForeignDatabase(sqlite3* db) { RequireWorldOrEmpty(db); }

bool HasWorld(sqlite3* db) {
  if (!RequireWorldOrEmpty(db)) return false;
  Statement layout(db, "SELECT version FROM layout");
  const int64_t version = layout.Step() ? layout.Int(0) : -1;
  if (version != kLayoutVersion) {
    throw WorldError("the world at " + DatabasePath() + " has layout " + std::to_string(version) +
                     " but this build reads layout " + std::to_string(kLayoutVersion) +
                     "; replace it with hyrasim init");
  }
  return true;
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

void SaveWorld(sqlite3* db, const WorldState& world, unsigned sections) {
  if (sections & kSectionDaemon) SaveDaemon(db, world.daemon);
  if (sections & kSectionArrays) SaveArrays(db, world.arrays);
  if (sections & kSectionContainers) SaveContainers(db, world.containers);
  if (sections & kSectionProviders) SaveProviders(db, world.providers);
  if (sections & kSectionMounts) SaveMounts(db, world.mounted);
  if (sections & kSectionKiro) SaveKiro(db, world.kiroContext);
}

}  // namespace HyraSim
