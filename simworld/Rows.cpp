#include "Rows.h"

#include <map>

#include "Connection.h"
#include "ContainerId.h"
#include "Schema.h"
#include "World.h"

namespace HyraSim {
namespace {

int64_t Flag(bool value) { return value ? 1 : 0; }

// The position after the last one of a list (0 for an empty list).
int64_t NextPos(sqlite3* db, const char* sql, std::optional<int64_t> parent = std::nullopt) {
  Statement row(db, sql);
  if (parent) row.Bind(1, *parent);
  row.Step();
  return row.Int(0);
}

std::optional<Mount> MountFrom(Statement& row) {
  if (!row.Step()) return std::nullopt;
  return Mount{row.Text(0), row.Text(1), {}};
}

// The columns of a tarn read without metadata, in Tarn order.
constexpr char kTarnColumns[] =
    "pos, uuid, logical_size_mb, committed_size_mb, unshared_size_mb, storage_profile,"
    " block_size, accessibility, config_name, config_policy, config_vm_uuid, config_mounted";

TarnRow TarnFrom(const Statement& row) {
  TarnRow found;
  found.pos = row.Int(0);
  Tarn& t = found.tarn;
  t.uuid = row.Text(1);
  t.logicalSizeMB = row.Int(2);
  t.committedSizeMB = row.Int(3);
  if (!row.IsNull(4)) t.unsharedSizeMB = row.Int(4);
  if (!row.IsNull(5)) t.storageProfile = row.Text(5);
  t.blockSize = row.Int(6);
  // Held to the scenario's rule: a row edited by hand must not reach a
  // division by a block size of zero or less.
  if (t.blockSize < 1) {
    throw WorldError("the tarn " + t.uuid + " of the world has block size " +
                     std::to_string(t.blockSize) + ", and a block size is 1 or more");
  }
  t.accessibility = static_cast<int32_t>(row.Int(7));
  if (!row.IsNull(8))
    t.configTarn = ConfigTarn{row.Text(8), row.Text(9), row.Text(10), row.Int(11) != 0};
  return found;
}

std::optional<TarnRow> OneTarn(sqlite3* db, const std::string& sql, int64_t containerPos,
                               const std::string& key) {
  Statement row(db, sql.c_str());
  row.Bind(1, containerPos).Bind(2, key);
  if (!row.Step()) return std::nullopt;
  return TarnFrom(row);
}

std::optional<ContainerRow> OneContainer(Statement& row) {
  if (!row.Step()) return std::nullopt;
  return ContainerRow{row.Int(0), {row.Text(1), row.Text(2), row.Text(3), row.Int(4), {}, {}}};
}

}  // namespace

std::vector<Mount> ReadMounts(sqlite3* db) {
  std::vector<Mount> mounts;
  Statement row(db, "SELECT name, id FROM mount ORDER BY pos");
  while (row.Step()) mounts.push_back({row.Text(0), row.Text(1), {}});
  return mounts;
}

std::optional<Mount> FindMountNamed(sqlite3* db, const std::string& name) {
  Statement row(db, "SELECT name, id FROM mount WHERE name = ? ORDER BY pos LIMIT 1");
  row.Bind(1, name);
  return MountFrom(row);
}

std::optional<Mount> FindMountOf(sqlite3* db, const std::string& containerId) {
  Statement row(db, "SELECT name, id FROM mount WHERE id_key = ? ORDER BY pos LIMIT 1");
  row.Bind(1, ContainerIdText(containerId));
  return MountFrom(row);
}

void AddMount(sqlite3* db, const Mount& mount) {
  const int64_t pos = NextPos(db, "SELECT coalesce(max(pos) + 1, 0) FROM mount");
  Statement(db, "INSERT INTO mount VALUES(?, ?, ?, ?)")
      .Bind(1, pos)
      .Bind(2, mount.name)
      .Bind(3, mount.id)
      .Bind(4, ContainerIdText(mount.id))
      .Run();
  Statement array(db, "INSERT INTO mount_array VALUES(?, ?, ?)");
  for (size_t i = 0; i < mount.arrays.size(); ++i) {
    array.Bind(1, pos).Bind(2, int64_t(i)).Bind(3, mount.arrays[i]).Run();
  }
}

int64_t RemoveMountsOf(sqlite3* db, const std::string& containerId) {
  const std::string key = ContainerIdText(containerId);
  Statement(db,
            "DELETE FROM mount_array WHERE mount_pos IN (SELECT pos FROM mount WHERE id_key = ?)")
      .Bind(1, key)
      .Run();
  Statement(db, "DELETE FROM mount WHERE id_key = ?").Bind(1, key).Run();
  return sqlite3_changes(db);
}

std::vector<std::string> MountsOnArray(sqlite3* db, const std::string& arrayId) {
  std::vector<std::string> names;
  Statement row(db,
                "SELECT name FROM mount WHERE pos IN"
                " (SELECT mount_pos FROM mount_array WHERE array_id = ?) ORDER BY pos");
  row.Bind(1, arrayId);
  while (row.Step()) names.push_back(row.Text(0));
  return names;
}

std::optional<Provider> FindProviderNamed(sqlite3* db, const std::string& name) {
  Statement row(
      db, "SELECT pos, name, url, reserved FROM provider WHERE name = ? ORDER BY pos LIMIT 1");
  row.Bind(1, name);
  if (!row.Step()) return std::nullopt;
  Provider provider{row.Text(1), row.Text(2), row.Text(3), {}};
  Statement array(db,
                  "SELECT array_id, is_active, priority FROM provider_array"
                  " WHERE provider_pos = ? ORDER BY pos");
  array.Bind(1, row.Int(0));
  while (array.Step()) {
    provider.arrays.push_back(
        {array.Text(0), array.Int(1) != 0, static_cast<int32_t>(array.Int(2))});
  }
  return provider;
}

namespace {

std::optional<int64_t> ProviderPos(sqlite3* db, const std::string& name) {
  Statement row(db, "SELECT pos FROM provider WHERE name = ? ORDER BY pos LIMIT 1");
  row.Bind(1, name);
  if (!row.Step()) return std::nullopt;
  return row.Int(0);
}

void DeleteProviderArrays(sqlite3* db, int64_t pos) {
  Statement(db, "DELETE FROM provider_array WHERE provider_pos = ?").Bind(1, pos).Run();
}

}  // namespace

void StoreProvider(sqlite3* db, const Provider& provider) {
  std::optional<int64_t> pos = ProviderPos(db, provider.name);
  if (pos) {
    DeleteProviderArrays(db, *pos);
    Statement(db, "UPDATE provider SET url = ?, reserved = ? WHERE pos = ?")
        .Bind(1, provider.url)
        .Bind(2, provider.reserved)
        .Bind(3, *pos)
        .Run();
  } else {
    pos = NextPos(db, "SELECT coalesce(max(pos) + 1, 0) FROM provider");
    Statement(db, "INSERT INTO provider VALUES(?, ?, ?, ?)")
        .Bind(1, *pos)
        .Bind(2, provider.name)
        .Bind(3, provider.url)
        .Bind(4, provider.reserved)
        .Run();
  }
  Statement array(db, "INSERT INTO provider_array VALUES(?, ?, ?, ?, ?)");
  for (size_t i = 0; i < provider.arrays.size(); ++i) {
    const ProviderArray& a = provider.arrays[i];
    array.Bind(1, *pos).Bind(2, int64_t(i)).Bind(3, a.arrayId).Bind(4, Flag(a.isActive));
    array.Bind(5, int64_t{a.priority}).Run();
  }
}

bool RemoveProviderNamed(sqlite3* db, const std::string& name) {
  const std::optional<int64_t> pos = ProviderPos(db, name);
  if (!pos) return false;
  DeleteProviderArrays(db, *pos);
  Statement(db, "DELETE FROM provider WHERE pos = ?").Bind(1, *pos).Run();
  return true;
}

bool ProviderServesArray(sqlite3* db, const std::string& name, const std::string& arrayId) {
  const std::optional<int64_t> pos = ProviderPos(db, name);
  if (!pos) return false;
  Statement row(db, "SELECT 1 FROM provider_array WHERE provider_pos = ? AND array_id = ?");
  row.Bind(1, *pos).Bind(2, arrayId);
  return row.Step();
}

std::optional<StorageArray> FindArray(sqlite3* db, const std::string& id) {
  Statement row(db,
                "SELECT pos, id, name, vendor_id, model_id FROM storage_array WHERE id = ?"
                " ORDER BY pos LIMIT 1");
  row.Bind(1, id);
  if (!row.Step()) return std::nullopt;
  const int64_t arrayPos = row.Int(0);
  StorageArray array{row.Text(1), row.Text(2), row.Text(3), row.Text(4), {}};
  std::map<int64_t, size_t> endpointAt;
  Statement endpoint(db,
                     "SELECT pos, local_uid, type, lun_id, ip_address, server_mount, accessible,"
                     " configured FROM endpoint WHERE array_pos = ? ORDER BY pos");
  endpoint.Bind(1, arrayPos);
  while (endpoint.Step()) {
    ProtocolEndpoint pe = EndpointFrom(endpoint);
    endpointAt[endpoint.Int(0)] = array.endpoints.size();
    array.endpoints.push_back(std::move(pe));
  }
  Statement address(db,
                    "SELECT endpoint_pos, address FROM endpoint_address WHERE array_pos = ?"
                    " ORDER BY endpoint_pos, pos");
  address.Bind(1, arrayPos);
  while (address.Step()) {
    const auto found = endpointAt.find(address.Int(0));
    if (found == endpointAt.end()) {
      throw WorldError("the world database is inconsistent (table endpoint_address)");
    }
    array.endpoints[found->second].addresses.push_back(address.Text(1));
  }
  return array;
}

std::optional<std::string> SetEndpointAccessible(sqlite3* db, const std::string& localUid,
                                                 bool accessible) {
  Statement owner(db,
                  "SELECT a.id FROM endpoint e JOIN storage_array a ON a.pos = e.array_pos"
                  " WHERE e.local_uid = ? ORDER BY e.array_pos DESC, e.pos DESC LIMIT 1");
  owner.Bind(1, localUid);
  if (!owner.Step()) return std::nullopt;
  const std::string arrayId = owner.Text(0);
  Statement(db, "UPDATE endpoint SET accessible = ? WHERE local_uid = ?")
      .Bind(1, Flag(accessible))
      .Bind(2, localUid)
      .Run();
  return arrayId;
}

std::optional<ContainerRow> FindContainerOf(sqlite3* db, const std::string& containerId) {
  Statement row(db,
                "SELECT pos, name, id, vp_url, max_tarn_size_mb FROM container"
                " WHERE id_key = ? ORDER BY pos LIMIT 1");
  row.Bind(1, ContainerIdText(containerId));
  return OneContainer(row);
}

std::optional<ContainerRow> FindExportedContainer(sqlite3* db, const std::string& normalId) {
  // The daemon learns of a container through a provider registered on the
  // host whose URL is the container's provider URL.
  Statement row(db,
                "SELECT pos, name, id, vp_url, max_tarn_size_mb FROM container c"
                " WHERE id_key = ? AND EXISTS(SELECT 1 FROM provider p WHERE p.url = c.vp_url)"
                " ORDER BY pos LIMIT 1");
  row.Bind(1, normalId);
  return OneContainer(row);
}

void ForEachExportedContainer(sqlite3* db, const std::function<void(const Container&)>& visit) {
  Statement row(db,
                "SELECT c.pos, c.name, c.id, c.vp_url, c.max_tarn_size_mb, a.array_id"
                " FROM container c LEFT JOIN container_array a ON a.container_pos = c.pos"
                " WHERE EXISTS(SELECT 1 FROM provider p WHERE p.url = c.vp_url)"
                " ORDER BY c.pos, a.pos");
  std::optional<int64_t> pos;
  Container current;
  while (row.Step()) {
    if (pos != row.Int(0)) {
      if (pos) visit(current);
      pos = row.Int(0);
      current = Container{row.Text(1), row.Text(2), row.Text(3), row.Int(4), {}, {}};
    }
    if (!row.IsNull(5)) current.arrays.push_back(row.Text(5));
  }
  if (pos) visit(current);
}

std::optional<TarnRow> FindTarnIn(sqlite3* db, int64_t containerPos, const std::string& uuid) {
  static const std::string sql = std::string("SELECT ") + kTarnColumns +
                                 " FROM tarn WHERE container_pos = ? AND uuid_key = ?"
                                 " ORDER BY pos LIMIT 1";
  return OneTarn(db, sql, containerPos, UuidKey(uuid));
}

std::optional<TarnRow> FindConfigTarnIn(sqlite3* db, int64_t containerPos,
                                        const std::string& name) {
  static const std::string sql = std::string("SELECT ") + kTarnColumns +
                                 " FROM tarn WHERE container_pos = ? AND config_name = ?"
                                 " ORDER BY pos LIMIT 1";
  return OneTarn(db, sql, containerPos, name);
}

std::vector<std::pair<std::string, std::string> > ReadTarnMetadata(sqlite3* db,
                                                                   int64_t containerPos,
                                                                   int64_t tarnPos) {
  std::vector<std::pair<std::string, std::string> > metadata;
  Statement row(db,
                "SELECT key, value FROM tarn_metadata WHERE container_pos = ? AND tarn_pos = ?"
                " ORDER BY pos");
  row.Bind(1, containerPos).Bind(2, tarnPos);
  while (row.Step()) metadata.emplace_back(row.Text(0), row.Text(1));
  return metadata;
}

std::vector<Tarn> ReadConfigTarns(sqlite3* db, int64_t containerPos, int64_t offset,
                                  int64_t limit) {
  static const std::string sql = std::string("SELECT ") + kTarnColumns +
                                 " FROM tarn WHERE container_pos = ? AND config_name IS NOT NULL"
                                 " ORDER BY pos LIMIT ? OFFSET ?";
  std::vector<Tarn> tarns;
  Statement row(db, sql.c_str());
  row.Bind(1, containerPos).Bind(2, limit).Bind(3, offset);
  while (row.Step()) tarns.push_back(TarnFrom(row).tarn);
  return tarns;
}

void AddTarn(sqlite3* db, int64_t containerPos, const Tarn& t) {
  const int64_t pos = NextPos(
      db, "SELECT coalesce(max(pos) + 1, 0) FROM tarn WHERE container_pos = ?", containerPos);
  const ConfigTarn* ct = t.configTarn ? &*t.configTarn : nullptr;
  Statement(db, "INSERT INTO tarn VALUES(?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)")
      .Bind(1, containerPos)
      .Bind(2, pos)
      .Bind(3, t.uuid)
      .Bind(4, t.logicalSizeMB)
      .Bind(5, t.committedSizeMB)
      .Bind(6, t.unsharedSizeMB)
      .Bind(7, t.storageProfile)
      .Bind(8, t.blockSize)
      .Bind(9, int64_t{t.accessibility})
      .Bind(10, ct ? std::optional<std::string>(ct->name) : std::nullopt)
      .Bind(11, ct ? ct->policy : std::string())
      .Bind(12, ct ? ct->vmUuid : std::string())
      .Bind(13, Flag(ct != nullptr && ct->mounted))
      .Bind(14, UuidKey(t.uuid))
      .Run();
  Statement metadata(db, "INSERT INTO tarn_metadata VALUES(?, ?, ?, ?, ?)");
  for (size_t i = 0; i < t.metadata.size(); ++i) {
    metadata.Bind(1, containerPos).Bind(2, pos).Bind(3, int64_t(i));
    metadata.Bind(4, t.metadata[i].first).Bind(5, t.metadata[i].second).Run();
  }
}

void SetConfigTarnMounted(sqlite3* db, int64_t containerPos, int64_t tarnPos, bool mounted) {
  Statement(db, "UPDATE tarn SET config_mounted = ? WHERE container_pos = ? AND pos = ?")
      .Bind(1, Flag(mounted))
      .Bind(2, containerPos)
      .Bind(3, tarnPos)
      .Run();
}

void RemoveTarn(sqlite3* db, int64_t containerPos, int64_t tarnPos) {
  Statement(db, "DELETE FROM tarn_metadata WHERE container_pos = ? AND tarn_pos = ?")
      .Bind(1, containerPos)
      .Bind(2, tarnPos)
      .Run();
  Statement(db, "DELETE FROM tarn WHERE container_pos = ? AND pos = ?")
      .Bind(1, containerPos)
      .Bind(2, tarnPos)
      .Run();
}

bool DaemonRunning(sqlite3* db) {
  Statement row(db, "SELECT running FROM daemon");
  if (!row.Step()) throw WorldError("the world database is inconsistent (table daemon)");
  return row.Int(0) != 0;
}

void StoreDaemonRunning(sqlite3* db, bool running) {
  Statement(db, "UPDATE daemon SET running = ?").Bind(1, Flag(running)).Run();
}

void StoreFaultInjectionEnabled(sqlite3* db, bool enabled) {
  Statement(db, "UPDATE daemon SET fault_injection = ?").Bind(1, Flag(enabled)).Run();
}

void StoreSpaceEfficiencyManipulation(sqlite3* db, bool enabled) {
  Statement(db, "UPDATE daemon SET space_efficiency = ?").Bind(1, Flag(enabled)).Run();
}

void StoreDebugSettings(sqlite3* db, const int32_t* logLevel, bool dump,
                        const int32_t* unbindPeriod) {
  Statement(db,
            "UPDATE daemon SET log_level = coalesce(?, log_level),"
            " dump_requests = dump_requests + ?, unbind_period = coalesce(?, unbind_period)")
      .Bind(1, logLevel ? std::optional<int64_t>(*logLevel) : std::nullopt)
      .Bind(2, Flag(dump))
      .Bind(3, unbindPeriod ? std::optional<int64_t>(*unbindPeriod) : std::nullopt)
      .Run();
}

std::optional<int64_t> FindRule(sqlite3* db, const std::string& operation,
                                const std::string& fault) {
  Statement row(
      db, "SELECT pos FROM fault_rule WHERE operation = ? AND fault = ? ORDER BY pos LIMIT 1");
  row.Bind(1, operation).Bind(2, fault);
  if (!row.Step()) return std::nullopt;
  return row.Int(0);
}

void AddRule(sqlite3* db, const FaultRule& rule) {
  Statement(db,
            "INSERT INTO fault_rule SELECT coalesce(max(pos) + 1, 0), ?, ?, ?, ? FROM fault_rule")
      .Bind(1, rule.operation)
      .Bind(2, rule.fault)
      .Bind(3, int64_t{rule.frequency})
      .Bind(4, int64_t{rule.time})
      .Run();
}

void UpdateRule(sqlite3* db, int64_t pos, int32_t frequency, int32_t time) {
  Statement(db, "UPDATE fault_rule SET frequency = ?, time = ? WHERE pos = ?")
      .Bind(1, int64_t{frequency})
      .Bind(2, int64_t{time})
      .Bind(3, pos)
      .Run();
}

void RemoveRule(sqlite3* db, int64_t pos) {
  Statement(db, "DELETE FROM fault_rule WHERE pos = ?").Bind(1, pos).Run();
}

void RecordActivation(sqlite3* db, const Activation& a) {
  Statement found(db,
                  "SELECT pos FROM activation WHERE array_id = ? AND provider = ?"
                  " ORDER BY pos LIMIT 1");
  found.Bind(1, a.arrayId).Bind(2, a.provider);
  if (found.Step()) {
    Statement(db, "UPDATE activation SET active = ?, active_provider_url = ? WHERE pos = ?")
        .Bind(1, Flag(a.active))
        .Bind(2, a.activeProviderUrl)
        .Bind(3, found.Int(0))
        .Run();
    return;
  }
  Statement(db,
            "INSERT INTO activation SELECT coalesce(max(pos) + 1, 0), ?, ?, ?, ? FROM activation")
      .Bind(1, a.arrayId)
      .Bind(2, a.provider)
      .Bind(3, Flag(a.active))
      .Bind(4, a.activeProviderUrl)
      .Run();
}

void ReplaceProviderFault(sqlite3* db, const ProviderFault& fault) {
  Statement(db,
            "DELETE FROM provider_fault_array WHERE fault_pos IN"
            " (SELECT pos FROM provider_fault WHERE provider = ?)")
      .Bind(1, fault.provider)
      .Run();
  Statement(db, "DELETE FROM provider_fault WHERE provider = ?").Bind(1, fault.provider).Run();
  const int64_t pos = NextPos(db, "SELECT coalesce(max(pos) + 1, 0) FROM provider_fault");
  Statement(db, "INSERT INTO provider_fault VALUES(?, ?, ?, ?)")
      .Bind(1, pos)
      .Bind(2, fault.provider)
      .Bind(3, fault.url)
      .Bind(4, fault.status)
      .Run();
  Statement array(db, "INSERT INTO provider_fault_array VALUES(?, ?, ?, ?)");
  for (size_t i = 0; i < fault.arrays.size(); ++i) {
    array.Bind(1, pos).Bind(2, int64_t(i)).Bind(3, fault.arrays[i].arrayId);
    array.Bind(4, Flag(fault.arrays[i].isActive)).Run();
  }
}

void StoreKiroContext(sqlite3* db, const std::optional<std::string>& context) {
  Statement(db, "UPDATE host SET kiro_context = ?").Bind(1, context).Run();
}

}  // namespace HyraSim
