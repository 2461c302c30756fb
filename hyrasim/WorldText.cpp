#include "WorldText.h"

#include <nlohmann/json.hpp>

namespace HyraSim {
namespace {

const char* OnOff(bool on) { return on ? "on" : "off"; }

template <typename T, typename Show>
std::string Joined(const std::vector<T>& items, Show show) {
  std::string text;
  for (const T& item : items) text += (text.empty() ? "" : ", ") + show(item);
  return text.empty() ? "(none)" : text;
}

std::string Quoted(const std::string& text) { return "\"" + text + "\""; }

void PrintDaemon(std::ostream& out, const Daemon& d) {
  out << "Tarnd: " << (d.running ? "running" : "stopped") << ", log level " << d.logLevel
      << ", dump requests " << d.dumpRequests << ", unbind period " << d.unbindPeriod << " us\n"
      << "  space-efficiency manipulation " << OnOff(d.spaceEfficiencyManipulation)
      << ", fault injection " << OnOff(d.faultInjectionEnabled) << "\n";
  for (const FaultRule& r : d.rules) {
    out << "  rule " << r.operation << " / " << r.fault << ": frequency " << r.frequency
        << ", time " << r.time << " ms\n";
  }
  for (const Activation& a : d.activations) {
    out << "  provider " << a.provider << (a.active ? " activated" : " deactivated") << " for "
        << a.arrayId;
    if (!a.activeProviderUrl.empty()) out << " (active provider URL " << a.activeProviderUrl << ")";
    out << "\n";
  }
  for (const ProviderFault& f : d.providerFaults) {
    out << "  provider " << f.provider << " treated as " << f.status << " (URL " << Quoted(f.url)
        << "), arrays: "
        << Joined(f.arrays,
                  [](const ProviderFaultArray& a) {
                    return a.arrayId + (a.isActive ? " active" : " inactive");
                  })
        << "\n";
  }
}

std::string Describe(const ProtocolEndpoint& pe) {
  std::string text = pe.localUid;
  switch (pe.type) {
    case EndpointType::kScsi:
      text += " SCSI LUN " + pe.lunId;
      break;
    case EndpointType::kNfs:
      text += " NFS " + pe.ipAddress + ", mount " + pe.serverMount;
      break;
    case EndpointType::kNfs4x:
      text += " NFS4x " + Joined(pe.addresses, [](const std::string& a) { return a; }) +
              ", mount " + pe.serverMount;
      break;
  }
  text += pe.accessible ? ", accessible" : ", inaccessible";
  text += pe.configured ? ", configured" : ", not configured";
  return text;
}

void PrintTarn(std::ostream& out, const Tarn& t) {
  out << "    " << (t.configTarn ? "config-tarn " : "tarn ") << t.uuid << ": logical "
      << t.logicalSizeMB << " MB, committed " << t.committedSizeMB << " MB, unshared "
      << (t.unsharedSizeMB ? std::to_string(*t.unsharedSizeMB) + " MB" : "unknown")
      << ", block size " << t.blockSize << ", state " << t.accessibility << "\n";
  out << "      profile " << (t.storageProfile ? *t.storageProfile : "(none)") << ", metadata "
      << Joined(t.metadata, [](const auto& p) { return p.first + "=" + p.second; }) << "\n";
  if (t.configTarn) {
    out << "      directory " << t.configTarn->name << ", "
        << (t.configTarn->mounted ? "mounted" : "not mounted") << ", policy "
        << Quoted(t.configTarn->policy) << ", VM " << Quoted(t.configTarn->vmUuid) << "\n";
  }
}

}  // namespace

void PrintWorld(std::ostream& out, const std::string& path, const WorldState& world,
                const std::vector<std::pair<std::string, FailureSpec> >& armed) {
  out << "World: " << path << "\n";
  PrintDaemon(out, world.daemon);

  out << "Storage arrays:\n";
  for (const StorageArray& a : world.arrays) {
    out << "  " << a.id << " " << Quoted(a.name) << ", " << a.vendorId << " " << a.modelId << "\n";
    for (const ProtocolEndpoint& pe : a.endpoints) out << "    endpoint " << Describe(pe) << "\n";
  }

  out << "Storage containers:\n";
  for (const Container& c : world.containers) {
    out << "  " << c.name << " " << c.id << (world.IsExported(c) ? ", exported" : ", not exported")
        << ", provider URL " << c.vpUrl << ", largest tarn " << c.maxTarnSizeMB << " MB, arrays "
        << Joined(c.arrays, [](const std::string& a) { return a; }) << "\n";
    for (const Tarn& t : c.tarns) PrintTarn(out, t);
  }

  out << "Host:\n";
  for (const Provider& p : world.providers) {
    out << "  provider " << p.name << " " << p.url << ", arrays "
        << Joined(p.arrays,
                  [](const ProviderArray& a) {
                    return a.arrayId + " (priority " + std::to_string(a.priority) +
                           (a.isActive ? ", active)" : ", inactive)");
                  })
        << "\n";
  }
  for (const Mount& m : world.mounted) {
    out << "  mounted " << m.name << " at " << MountPath(m.name) << ", id " << m.id << ", arrays "
        << Joined(m.arrays, [](const std::string& a) { return a; }) << "\n";
  }
  out << "  Kiro context: " << (world.kiroContext ? Quoted(*world.kiroContext) : "(none)") << "\n";

  out << "Armed failures:" << (armed.empty() ? " (none)" : "") << "\n";
  for (const auto& [operation, spec] : armed) {
    out << "  " << operation << ": " << spec.after << " to pass, then " << spec.times
        << (spec.null ? " to answer nothing" : " to fail with " + Quoted(spec.message)) << "\n";
  }
}

void PrintJournal(std::ostream& out, const std::vector<JournalEntry>& journal, bool json) {
  if (!json) {
    for (const JournalEntry& e : journal) {
      std::string args;
      for (const std::string& arg : e.args) args += (args.empty() ? "" : ", ") + Quoted(arg);
      out << e.seq << " " << e.operation << " [" << args << "] " << e.outcome
          << (e.message.empty() ? "" : ": " + e.message) << "\n";
    }
    return;
  }
  // Bytes that are not UTF-8 (the host takes any text) become replacement
  // characters rather than failing the listing.
  const auto replace = nlohmann::ordered_json::error_handler_t::replace;
  out << "[";
  for (size_t i = 0; i < journal.size(); ++i) {
    const JournalEntry& e = journal[i];
    const nlohmann::ordered_json entry = {{"seq", e.seq},
                                          {"operation", e.operation},
                                          {"args", e.args},
                                          {"outcome", e.outcome},
                                          {"message", e.message}};
    out << (i == 0 ? "\n  " : ",\n  ") << entry.dump(-1, ' ', false, replace);
  }
  out << (journal.empty() ? "]\n" : "\n]\n");
}

}  // namespace HyraSim
