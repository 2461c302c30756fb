#include <algorithm>
#include <cctype>
#include <cmath>
#include <cstdint>
#include <iterator>
#include <limits>
#include <nlohmann/json.hpp>
#include <set>
#include <string>
#include <unordered_set>

#include "ContainerId.h"
#include "Scenario.h"
#include "World.h"

namespace HyraSim {
namespace {

using Json = nlohmann::ordered_json;

constexpr int64_t kInt32Min = std::numeric_limits<int32_t>::min();
constexpr int64_t kInt32Max = std::numeric_limits<int32_t>::max();
constexpr int64_t kInt64Max = std::numeric_limits<int64_t>::max();

const char* const kProviderStatuses[] = {"online", "offline", "syncError", "unknown", "default"};

// Keys and texts of the document reach refusals; a long one is cut, so that
// a refusal stays a line, not a copy of the input.
constexpr size_t kMaxShown = 160;

std::string Cut(const std::string& text) {
  return text.size() <= kMaxShown ? text : text.substr(0, kMaxShown) + "...";
}

[[noreturn]] void Refuse(const std::string& path, const std::string& what) {
  throw WorldError("scenario: " + (path.empty() ? std::string("document") : Cut(path)) + ": " +
                   Cut(what));
}

std::string Join(const std::string& path, const std::string& key) {
  return path.empty() ? key : path + "." + key;
}

std::string Index(const std::string& path, size_t i) {
  return path + "[" + std::to_string(i) + "]";
}

std::string AsText(const Json& value, const std::string& path) {
  if (!value.is_string()) Refuse(path, "must be a text");
  const auto& text = value.get_ref<const std::string&>();
  // The daemon client hands texts out NUL-terminated; a NUL would cut them.
  if (text.find('\0') != std::string::npos) Refuse(path, "must not contain a NUL character");
  return text;
}

[[noreturn]] void RefuseRange(const std::string& path, int64_t min, int64_t max) {
  Refuse(path, "must be between " + std::to_string(min) + " and " + std::to_string(max));
}

int64_t AsInteger(const Json& value, const std::string& path, int64_t min, int64_t max) {
  // A whole number past 64 bits reaches us as a floating-point one; it is out
  // of range rather than not whole.
  if (value.is_number_float() && std::abs(value.get<double>()) >= 0x1p63) {
    RefuseRange(path, min, max);
  }
  if (!value.is_number_integer()) Refuse(path, "must be a whole number");
  const bool tooLarge =
      value.is_number_unsigned() && value.get<uint64_t>() > static_cast<uint64_t>(kInt64Max);
  const int64_t number = tooLarge ? kInt64Max : value.get<int64_t>();
  if (tooLarge || number < min || number > max) RefuseRange(path, min, max);
  return number;
}

// Deeper than any scenario record goes; a document nested further is refused
// before it costs more than this much.
constexpr size_t kMaxDepth = 64;

// Builds the document while keeping the path to the value being read, so that
// what the parser refuses names its field too, and refuses a key given twice
// in one object (a plain parse keeps the last and loses the others silently).
class DocumentBuilder : public nlohmann::json_sax<Json> {
 public:
  Json TakeDocument() { return std::move(document_); }

  bool null() override { return Put(nullptr); }
  bool boolean(bool value) override { return Put(value); }
  bool number_integer(number_integer_t value) override { return Put(value); }
  bool number_unsigned(number_unsigned_t value) override { return Put(value); }
  bool number_float(number_float_t value, const string_t&) override { return Put(value); }
  bool string(string_t& value) override { return Put(std::move(value)); }
  bool binary(binary_t&) override { Refuse(Here(), "must not be binary data"); }
  bool start_object(std::size_t) override { return Open(Json::object()); }
  bool start_array(std::size_t) override { return Open(Json::array()); }
  bool end_object() override { return Close(); }
  bool end_array() override { return Close(); }

  bool key(string_t& key) override {
    Frame& frame = open_.back();
    if (!frame.keys.insert(key).second) Refuse(Join(frame.path, key), "is given more than once");
    frame.key = std::move(key);
    return true;
  }

  bool parse_error(std::size_t, const std::string&,
                   const nlohmann::detail::exception& error) override {
    // 406: a number beyond what a double holds, such as 1e400 or a
    // 100,000-digit integer.
    if (error.id == 406) Refuse(Here(), "is a number too large for any field");
    // The parser's message quotes the token it stopped at, which may be the
    // whole file.
    throw WorldError("scenario: not valid JSON: " + Cut(error.what()));
  }

 private:
  // An object or list being read; value points into its parent, which gains
  // no element while this one is open, so the pointer stays valid.
  struct Frame {
    Json* value;
    std::string path;
    std::string key;            // of the value being read, in an object
    std::set<std::string> keys;  // given so far, in an object
  };

  // Where the next value goes.
  std::string Here() const {
    if (open_.empty()) return "";
    const Frame& frame = open_.back();
    return frame.value->is_object() ? Join(frame.path, frame.key)
                                    : Index(frame.path, frame.value->size());
  }

  Json* Place(Json value) {
    if (open_.empty()) {
      document_ = std::move(value);
      return &document_;
    }
    Json& parent = *open_.back().value;
    if (parent.is_object()) return &(parent[open_.back().key] = std::move(value));
    parent.push_back(std::move(value));
    return &parent.back();
  }

  bool Put(Json value) {
    Place(std::move(value));
    return true;
  }

  bool Open(Json empty) {
    std::string path = Here();
    if (open_.size() >= kMaxDepth) Refuse(path, "is nested too deeply");
    open_.push_back({Place(std::move(empty)), std::move(path), {}, {}});
    return true;
  }

  bool Close() {
    open_.pop_back();
    return true;
  }

  Json document_;
  std::vector<Frame> open_;
};

// One JSON object being read. Every field it has must be read, so that a
// misspelt field is reported instead of being silently ignored.
class Record {
 public:
  Record(const Json& value, std::string path) : value_(value), path_(std::move(path)) {
    if (!value.is_object()) Refuse(path_, "must be an object");
  }

  const std::string& Path() const { return path_; }
  std::string PathOf(const char* key) const { return Join(path_, key); }

  // The field, or null when it is absent.
  const Json* Find(const char* key) {
    used_.insert(key);
    const auto it = value_.find(key);
    return it == value_.end() ? nullptr : &*it;
  }

  const Json& Need(const char* key) {
    const Json* value = Find(key);
    if (value == nullptr) Refuse(PathOf(key), "is missing");
    return *value;
  }

  std::string Text(const char* key) { return AsText(Need(key), PathOf(key)); }

  std::string Text(const char* key, const std::string& fallback) {
    const Json* value = Find(key);
    return value != nullptr ? AsText(*value, PathOf(key)) : fallback;
  }

  // Absent and null both mean no text.
  std::optional<std::string> TextOrNull(const char* key) {
    const Json* value = Find(key);
    if (value == nullptr || value->is_null()) return std::nullopt;
    return AsText(*value, PathOf(key));
  }

  int64_t Integer(const char* key, int64_t min, int64_t max) {
    return AsInteger(Need(key), PathOf(key), min, max);
  }

  int64_t Integer(const char* key, int64_t min, int64_t max, int64_t fallback) {
    const Json* value = Find(key);
    return value != nullptr ? AsInteger(*value, PathOf(key), min, max) : fallback;
  }

  // Null means unknown; absent means fallback.
  std::optional<int64_t> IntegerOrNull(const char* key, int64_t min, int64_t max,
                                       int64_t fallback) {
    const Json* value = Find(key);
    if (value == nullptr) return fallback;
    if (value->is_null()) return std::nullopt;
    return AsInteger(*value, PathOf(key), min, max);
  }

  bool Boolean(const char* key, bool fallback) {
    const Json* value = Find(key);
    if (value == nullptr) return fallback;
    if (!value->is_boolean()) Refuse(PathOf(key), "must be true or false");
    return value->get<bool>();
  }

  // The elements of a list field; an absent field is an empty list.
  const Json& List(const char* key) {
    static const Json empty = Json::array();
    const Json* value = Find(key);
    if (value == nullptr) return empty;
    if (!value->is_array()) Refuse(PathOf(key), "must be a list");
    return *value;
  }

  std::vector<std::string> Texts(const char* key) {
    const Json& list = List(key);
    std::vector<std::string> texts;
    for (size_t i = 0; i < list.size(); ++i)
      texts.push_back(AsText(list[i], Index(PathOf(key), i)));
    return texts;
  }

  // Refuses any field that was not read.
  void Finish() const {
    for (const auto& item : value_.items()) {
      if (used_.count(item.key()) == 0) {
        Refuse(Join(path_, item.key()), "is not a field of this record");
      }
    }
  }

 private:
  const Json& value_;
  std::string path_;
  std::set<std::string> used_;
};

// Refuses the second occurrence of a key that must be unique.
class UniqueKeys {
 public:
  explicit UniqueKeys(std::string what) : what_(std::move(what)) {}
  void Add(const std::string& key, const std::string& path, const std::string& shown) {
    if (!seen_.insert(key).second) Refuse(path, "duplicate " + what_ + " \"" + shown + "\"");
  }
  void Add(const std::string& key, const std::string& path) { Add(key, path, key); }

 private:
  std::string what_;
  std::set<std::string> seen_;
};

std::string Lower(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return text;
}

// Calls read(record) for each object of the list field key.
template <typename Read>
void ForEach(Record& parent, const char* key, Read read) {
  const Json& list = parent.List(key);
  for (size_t i = 0; i < list.size(); ++i) {
    Record record(list[i], Index(parent.PathOf(key), i));
    read(record);
    record.Finish();
  }
}

void ReadFaultInjection(Record& faultInjection, Daemon& daemon) {
  daemon.faultInjectionEnabled = faultInjection.Boolean("enabled", false);
  UniqueKeys keys("rule");
  ForEach(faultInjection, "rules", [&](Record& r) {
    FaultRule rule;
    rule.operation = r.Text("operation", "*");
    rule.fault = r.Text("fault");
    rule.frequency = static_cast<int32_t>(r.Integer("frequency", kInt32Min, kInt32Max, -1));
    rule.time = static_cast<int32_t>(r.Integer("time", kInt32Min, kInt32Max, -1));
    keys.Add(rule.operation + '\0' + rule.fault, r.Path(), rule.operation + ", " + rule.fault);
    daemon.rules.push_back(rule);
  });
}

void ReadDaemon(Record& d, Daemon& daemon) {
  daemon.running = d.Boolean("running", true);
  daemon.logLevel = static_cast<int32_t>(d.Integer("logLevel", kInt32Min, kInt32Max, 4));
  daemon.dumpRequests = d.Integer("dumpRequests", 0, kInt64Max, 0);
  daemon.unbindPeriod = static_cast<int32_t>(d.Integer("unbindPeriod", 0, kInt32Max, 300000000));
  if (const Json* value = d.Find("faultInjection")) {
    Record faultInjection(*value, d.PathOf("faultInjection"));
    ReadFaultInjection(faultInjection, daemon);
    faultInjection.Finish();
  }
  daemon.spaceEfficiencyManipulation = d.Boolean("spaceEfficiencyManipulation", true);

  UniqueKeys activationKeys("activation");
  ForEach(d, "activations", [&](Record& r) {
    Activation activation;
    activation.arrayId = r.Text("arrayId");
    activation.provider = r.Text("provider");
    activation.active = r.Boolean("active", true);
    activation.activeProviderUrl = r.Text("activeProviderUrl", "");
    activationKeys.Add(activation.arrayId + '\0' + activation.provider, r.Path(),
                       activation.arrayId + ", " + activation.provider);
    daemon.activations.push_back(activation);
  });

  UniqueKeys faultProviders("provider");
  ForEach(d, "providerFaults", [&](Record& r) {
    ProviderFault fault;
    fault.provider = r.Text("provider");
    faultProviders.Add(fault.provider, r.PathOf("provider"));
    fault.url = r.Text("url", "");
    fault.status = r.Text("status");
    if (std::find(std::begin(kProviderStatuses), std::end(kProviderStatuses), fault.status) ==
        std::end(kProviderStatuses)) {
      Refuse(r.PathOf("status"), "must be online, offline, syncError, unknown or default");
    }
    ForEach(r, "arrays", [&](Record& a) {
      fault.arrays.push_back({a.Text("arrayId"), a.Boolean("isActive", true)});
    });
    daemon.providerFaults.push_back(fault);
  });
}

ProtocolEndpoint ReadEndpoint(Record& r) {
  ProtocolEndpoint pe;
  pe.localUid = r.Text("localUID");
  const std::string type = r.Text("type");
  if (type == "SCSI") {
    pe.type = EndpointType::kScsi;
    pe.lunId = r.Text("lunId", "");
  } else if (type == "NFS") {
    pe.type = EndpointType::kNfs;
    pe.ipAddress = r.Text("ipAddress", "");
    pe.serverMount = r.Text("serverMount", "");
  } else if (type == "NFS4x") {
    pe.type = EndpointType::kNfs4x;
    pe.addresses = r.Texts("addresses");
    pe.serverMount = r.Text("serverMount", "");
  } else {
    Refuse(r.PathOf("type"), "must be SCSI, NFS or NFS4x");
  }
  pe.accessible = r.Boolean("accessible", true);
  pe.configured = r.Boolean("configured", true);
  return pe;
}

void ReadArrays(Record& top, std::vector<StorageArray>& arrays) {
  UniqueKeys ids("array id");
  UniqueKeys uids("endpoint localUID");
  ForEach(top, "arrays", [&](Record& r) {
    StorageArray array;
    array.id = r.Text("id");
    ids.Add(array.id, r.PathOf("id"));
    array.name = r.Text("name", "");
    array.vendorId = r.Text("vendorId", "");
    array.modelId = r.Text("modelId", "");
    ForEach(r, "protocolEndpoints", [&](Record& e) {
      array.endpoints.push_back(ReadEndpoint(e));
      uids.Add(array.endpoints.back().localUid, e.PathOf("localUID"));
    });
    arrays.push_back(std::move(array));
  });
}

Tarn ReadTarn(Record& r, UniqueKeys& configNames) {
  Tarn tarn;
  tarn.uuid = r.Text("uuid");
  if (tarn.uuid.empty()) Refuse(r.PathOf("uuid"), "must not be empty");
  tarn.logicalSizeMB = r.Integer("logicalSizeMB", 0, kInt64Max, 0);
  tarn.committedSizeMB = r.Integer("committedSizeMB", 0, kInt64Max, 0);
  tarn.unsharedSizeMB = r.IntegerOrNull("unsharedSizeMB", 0, kInt64Max, 0);
  tarn.storageProfile = r.TextOrNull("storageProfile");
  tarn.blockSize = r.Integer("blockSize", 1, kInt64Max, 4096);
  const Json& metadata = r.List("metadata");
  for (size_t i = 0; i < metadata.size(); ++i) {
    const std::string path = Index(r.PathOf("metadata"), i);
    if (!metadata[i].is_array() || metadata[i].size() != 2) {
      Refuse(path, "must be a pair [key, value]");
    }
    tarn.metadata.emplace_back(AsText(metadata[i][0], Index(path, 0)),
                               AsText(metadata[i][1], Index(path, 1)));
  }
  tarn.accessibility = static_cast<int32_t>(r.Integer("accessibility", kInt32Min, kInt32Max, 3));
  if (const Json* value = r.Find("configTarn")) {
    Record c(*value, r.PathOf("configTarn"));
    ConfigTarn configTarn;
    configTarn.name = c.Text("name");
    if (configTarn.name.empty()) Refuse(c.PathOf("name"), "must not be empty");
    configNames.Add(configTarn.name, c.PathOf("name"));
    configTarn.policy = c.Text("policy", "");
    configTarn.vmUuid = c.Text("vmUuid", "");
    configTarn.mounted = c.Boolean("mounted", false);
    c.Finish();
    tarn.configTarn = configTarn;
  }
  return tarn;
}

void ReadContainers(Record& top, const std::vector<StorageArray>& arrays,
                    std::vector<Container>& containers) {
  UniqueKeys names("container name");
  UniqueKeys ids("container id");
  // A set, so that a world of many arrays is not scanned once per reference.
  std::unordered_set<std::string> arrayIdsKnown;
  for (const StorageArray& a : arrays) arrayIdsKnown.insert(a.id);
  ForEach(top, "containers", [&](Record& r) {
    Container container;
    container.name = r.Text("name");
    names.Add(container.name, r.PathOf("name"));
    container.id = r.Text("id");
    const auto normalId = NormalContainerId(container.id);
    if (!normalId) Refuse(r.PathOf("id"), "\"" + container.id + "\" is not a valid container id");
    ids.Add(*normalId, r.PathOf("id"), container.id);
    container.vpUrl = r.Text("vpUrl", "");
    container.maxTarnSizeMB = r.Integer("maxTarnSizeMB", 0, kInt64Max, 2097152);
    container.arrays = r.Texts("arrays");
    UniqueKeys arrayIds("array");
    for (size_t i = 0; i < container.arrays.size(); ++i) {
      const std::string path = Index(r.PathOf("arrays"), i);
      const std::string& id = container.arrays[i];
      if (arrayIdsKnown.count(id) == 0) {
        Refuse(path, "no array has the id \"" + id + "\"");
      }
      arrayIds.Add(id, path);
    }
    UniqueKeys uuids("tarn uuid");
    UniqueKeys configNames("config-tarn name");
    ForEach(r, "tarns", [&](Record& t) {
      container.tarns.push_back(ReadTarn(t, configNames));
      uuids.Add(Lower(container.tarns.back().uuid), t.PathOf("uuid"), container.tarns.back().uuid);
    });
    containers.push_back(std::move(container));
  });
}

void ReadHost(Record& host, WorldState& world) {
  UniqueKeys providerNames("provider name");
  ForEach(host, "providers", [&](Record& r) {
    Provider provider;
    provider.name = r.Text("name");
    // The host finds a provider by its name; an empty one names none.
    if (provider.name.empty()) Refuse(r.PathOf("name"), "must not be empty");
    providerNames.Add(provider.name, r.PathOf("name"));
    provider.url = r.Text("url", "");
    provider.reserved = r.Text("reserved", "");
    ForEach(r, "arrays", [&](Record& a) {
      ProviderArray array;
      array.arrayId = a.Text("arrayId");
      array.isActive = a.Boolean("isActive", true);
      array.priority = static_cast<int32_t>(a.Integer("priority", kInt32Min, kInt32Max, 0));
      provider.arrays.push_back(array);
    });
    world.providers.push_back(std::move(provider));
  });
  UniqueKeys mountNames("mounted name");
  UniqueKeys mountIds("mounted container id");
  ForEach(host, "mounted", [&](Record& r) {
    Mount mount;
    mount.name = r.Text("name");
    if (!IsValidMountName(mount.name)) {
      Refuse(r.PathOf("name"), "\"" + mount.name + "\" cannot be a directory name");
    }
    mountNames.Add(mount.name, r.PathOf("name"));
    mount.id = r.Text("id");
    // The host unmounts by the normal form of the id, so a mount whose id has
    // none could never go, and two mounts of one container would go together.
    const auto normalId = NormalContainerId(mount.id);
    if (!normalId) Refuse(r.PathOf("id"), "\"" + mount.id + "\" is not a valid container id");
    mountIds.Add(*normalId, r.PathOf("id"), mount.id);
    mount.arrays = r.Texts("arrays");
    world.mounted.push_back(std::move(mount));
  });
  world.kiroContext = host.TextOrNull("kiroContext");
}

}  // namespace

WorldState ReadScenario(const std::string& json) {
  DocumentBuilder builder;
  Json::sax_parse(json, &builder);
  const Json document = builder.TakeDocument();
  WorldState world;
  Record top(document, "");
  if (const Json* value = top.Find("daemon")) {
    Record daemon(*value, "daemon");
    ReadDaemon(daemon, world.daemon);
    daemon.Finish();
  }
  ReadArrays(top, world.arrays);
  ReadContainers(top, world.arrays, world.containers);
  if (const Json* value = top.Find("host")) {
    Record host(*value, "host");
    ReadHost(host, world);
    host.Finish();
  }
  top.Finish();
  return world;
}

}  // namespace HyraSim
