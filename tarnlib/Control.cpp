// The daemon's switches: fault injection, debug settings, provider activation
// and injected provider faults. The daemon records what it was told.
#include <algorithm>
#include <cstring>
#include <iterator>
#include <string>

#include "DaemonCall.h"
#include "Status.h"
#include "TarnLib/TarnLib.h"

using HyraSim::Access;
using HyraSim::WorldState;
using TarnSim::CallDaemon;
using TarnSim::Refusal;

namespace {

constexpr unsigned kDaemon = HyraSim::kSectionDaemon;

const int32_t kLogLevels[] = {1, 2, 4, 8, 16, 32, 64};
const char* const kProviderStatuses[] = {"online", "offline", "syncError", "unknown", "default"};

void Require(bool condition) {
  if (!condition) throw Refusal{TarnSim::kInvalidArgument};
}

std::vector<HyraSim::FaultRule>::iterator FindRule(WorldState& w, const char* operation,
                                                   const char* fault) {
  return std::find_if(w.daemon.rules.begin(), w.daemon.rules.end(), [&](const auto& rule) {
    return rule.operation == operation && rule.fault == fault;
  });
}

// The provider must be registered on the host and serve the array.
void RequireServedArray(WorldState& w, const char* arrayId, const char* providerName) {
  Require(arrayId != nullptr && providerName != nullptr);
  const HyraSim::Provider* provider = w.FindProvider(providerName);
  if (provider == nullptr ||
      std::none_of(provider->arrays.begin(), provider->arrays.end(),
                   [&](const auto& array) { return array.arrayId == arrayId; })) {
    throw Refusal{TarnSim::kNotFound};
  }
}

void RecordActivation(WorldState& w, const char* arrayId, const char* providerName, bool active,
                      const std::string& activeProviderUrl) {
  auto& activations = w.daemon.activations;
  auto found = std::find_if(activations.begin(), activations.end(), [&](const auto& a) {
    return a.arrayId == arrayId && a.provider == providerName;
  });
  if (found == activations.end()) {
    activations.push_back({arrayId, providerName, active, activeProviderUrl});
  } else {
    found->active = active;
    found->activeProviderUrl = activeProviderUrl;
  }
}

}  // namespace

extern "C" bool TarnLib_SetFaultInjectionEnabled(bool enabled) {
  return CallDaemon("TarnLib_SetFaultInjectionEnabled", Access::kWrite,
                    [&](WorldState& w) {
                      w.daemon.faultInjectionEnabled = enabled;
                      return kDaemon;
                    })
      .Succeeded();
}

extern "C" bool TarnLib_AddFaultInjectionRule(const char* operation, const char* fault,
                                              int32_t frequency, int32_t maxTimeMs) {
  return CallDaemon("TarnLib_AddFaultInjectionRule", Access::kWrite,
                    [&](WorldState& w) {
                      Require(operation != nullptr && fault != nullptr && fault[0] != '\0');
                      // A rule with neither a frequency nor a time would never fire.
                      Require(frequency != -1 || maxTimeMs != -1);
                      if (FindRule(w, operation, fault) != w.daemon.rules.end()) {
                        throw Refusal{TarnSim::kAlreadyExists};
                      }
                      w.daemon.rules.push_back({operation, fault, frequency, maxTimeMs});
                      return kDaemon;
                    })
      .Succeeded();
}

extern "C" bool TarnLib_ModifyFaultInjectionRule(const char* operation, const char* fault,
                                                 int32_t frequency, int32_t maxTimeMs) {
  return CallDaemon("TarnLib_ModifyFaultInjectionRule", Access::kWrite,
                    [&](WorldState& w) {
                      Require(operation != nullptr && fault != nullptr);
                      const auto rule = FindRule(w, operation, fault);
                      if (rule == w.daemon.rules.end()) throw Refusal{TarnSim::kNotFound};
                      if (frequency == -1 && maxTimeMs == -1) {
                        w.daemon.rules.erase(rule);
                      } else {
                        rule->frequency = frequency;
                        rule->time = maxTimeMs;
                      }
                      return kDaemon;
                    })
      .Succeeded();
}

extern "C" TarnLib_Status TarnLib_DebugCommand(const int32_t* logLevel, const int32_t* dumpObjects,
                                               const int32_t* unbindPeriodUs) {
  return CallDaemon("TarnLib_DebugCommand", Access::kWrite,
                    [&](WorldState& w) {
                      Require(logLevel == nullptr ||
                              std::find(std::begin(kLogLevels), std::end(kLogLevels), *logLevel) !=
                                  std::end(kLogLevels));
                      Require(unbindPeriodUs == nullptr || *unbindPeriodUs >= 0);
                      if (logLevel != nullptr) w.daemon.logLevel = *logLevel;
                      if (dumpObjects != nullptr && *dumpObjects != 0) ++w.daemon.dumpRequests;
                      if (unbindPeriodUs != nullptr) w.daemon.unbindPeriod = *unbindPeriodUs;
                      return kDaemon;
                    })
      .status;
}

extern "C" TarnLib_Status TarnLib_SetSPMSpaceEfficiencyManipulationEnabled(bool enabled) {
  return CallDaemon("TarnLib_SetSPMSpaceEfficiencyManipulationEnabled", Access::kWrite,
                    [&](WorldState& w) {
                      w.daemon.spaceEfficiencyManipulation = enabled;
                      return kDaemon;
                    })
      .status;
}

extern "C" TarnLib_Status TarnLib_ActivateProvider(const char* arrayId, const char* providerName,
                                                   const char* activeProviderUrl,
                                                   void* activation) {
  return CallDaemon("TarnLib_ActivateProvider", Access::kWrite,
                    [&](WorldState& w) {
                      Require(activeProviderUrl != nullptr && activation != nullptr);
                      RequireServedArray(w, arrayId, providerName);
                      RecordActivation(w, arrayId, providerName, true, activeProviderUrl);
                      return kDaemon;
                    })
      .status;
}

extern "C" TarnLib_Status TarnLib_DeactivateProvider(const char* arrayId,
                                                     const char* providerName) {
  return CallDaemon("TarnLib_DeactivateProvider", Access::kWrite,
                    [&](WorldState& w) {
                      RequireServedArray(w, arrayId, providerName);
                      RecordActivation(w, arrayId, providerName, false, std::string());
                      return kDaemon;
                    })
      .status;
}

extern "C" TarnLib_Status TarnLib_VendorProviderInjectFault(const char* providerName,
                                                            const char* url, const char* status,
                                                            int32_t arrayCount,
                                                            const KiroFaultArrayEntry* arrays) {
  return CallDaemon("TarnLib_VendorProviderInjectFault", Access::kWrite,
                    [&](WorldState& w) {
                      Require(providerName != nullptr && url != nullptr && status != nullptr);
                      // Status words compare exactly; anything else is refused.
                      Require(std::any_of(
                          std::begin(kProviderStatuses), std::end(kProviderStatuses),
                          [&](const char* word) { return std::strcmp(word, status) == 0; }));
                      Require(arrayCount >= 0 && (arrayCount == 0 || arrays != nullptr));
                      HyraSim::ProviderFault fault{providerName, url, status, {}};
                      for (int32_t i = 0; i < arrayCount; ++i) {
                        Require(arrays[i].arrayId != nullptr);
                        fault.arrays.push_back({arrays[i].arrayId, arrays[i].isActive});
                      }
                      // The latest injection for a provider replaces the earlier one.
                      auto& faults = w.daemon.providerFaults;
                      faults.erase(
                          std::remove_if(faults.begin(), faults.end(),
                                         [&](const auto& f) { return f.provider == providerName; }),
                          faults.end());
                      faults.push_back(fault);
                      return kDaemon;
                    })
      .status;
}
