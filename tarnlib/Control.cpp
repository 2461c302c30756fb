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
using TarnSim::Arg;
using TarnSim::CallDaemon;
using TarnSim::Refusal;

namespace {

const int32_t kLogLevels[] = {1, 2, 4, 8, 16, 32, 64};
const char* const kProviderStatuses[] = {"online", "offline", "syncError", "unknown", "default"};

void Require(bool condition) {
  if (!condition) throw Refusal{TarnSim::kInvalidArgument};
}

// The provider must be registered on the host and serve the array.
void RequireServedArray(sqlite3* db, const char* arrayId, const char* providerName) {
  Require(arrayId != nullptr && providerName != nullptr);
  if (!HyraSim::ProviderServesArray(db, providerName, arrayId)) throw Refusal{TarnSim::kNotFound};
}

std::string Flag(bool value) { return value ? "true" : "false"; }

// An optional 32-bit setting for the journal.
std::string OptionalArg(const int32_t* value) {
  return value != nullptr ? std::to_string(*value) : "(null)";
}

}  // namespace

extern "C" bool TarnLib_SetFaultInjectionEnabled(bool enabled) {
  return CallDaemon("TarnLib_SetFaultInjectionEnabled", Access::kWrite, {Flag(enabled)},
                    [&](sqlite3* db) { HyraSim::StoreFaultInjectionEnabled(db, enabled); })
      .Succeeded();
}

extern "C" bool TarnLib_AddFaultInjectionRule(const char* operation, const char* fault,
                                              int32_t frequency, int32_t maxTimeMs) {
  return CallDaemon(
             "TarnLib_AddFaultInjectionRule", Access::kWrite,
             {Arg(operation), Arg(fault), std::to_string(frequency), std::to_string(maxTimeMs)},
             [&](sqlite3* db) {
               Require(operation != nullptr && fault != nullptr && fault[0] != '\0');
               // A rule with neither a frequency nor a time would never fire.
               Require(frequency != -1 || maxTimeMs != -1);
               if (HyraSim::FindRule(db, operation, fault)) {
                 throw Refusal{TarnSim::kAlreadyExists};
               }
               HyraSim::AddRule(db, {operation, fault, frequency, maxTimeMs});
             })
      .Succeeded();
}

extern "C" bool TarnLib_ModifyFaultInjectionRule(const char* operation, const char* fault,
                                                 int32_t frequency, int32_t maxTimeMs) {
  return CallDaemon(
             "TarnLib_ModifyFaultInjectionRule", Access::kWrite,
             {Arg(operation), Arg(fault), std::to_string(frequency), std::to_string(maxTimeMs)},
             [&](sqlite3* db) {
               Require(operation != nullptr && fault != nullptr);
               const auto rule = HyraSim::FindRule(db, operation, fault);
               if (!rule) throw Refusal{TarnSim::kNotFound};
               if (frequency == -1 && maxTimeMs == -1) {
                 HyraSim::RemoveRule(db, *rule);
               } else {
                 HyraSim::UpdateRule(db, *rule, frequency, maxTimeMs);
               }
             })
      .Succeeded();
}

extern "C" TarnLib_Status TarnLib_DebugCommand(const int32_t* logLevel, const int32_t* dumpObjects,
                                               const int32_t* unbindPeriodUs) {
  return CallDaemon("TarnLib_DebugCommand", Access::kWrite,
                    {OptionalArg(logLevel), OptionalArg(dumpObjects), OptionalArg(unbindPeriodUs)},
                    [&](sqlite3* db) {
                      Require(logLevel == nullptr ||
                              std::find(std::begin(kLogLevels), std::end(kLogLevels), *logLevel) !=
                                  std::end(kLogLevels));
                      Require(unbindPeriodUs == nullptr || *unbindPeriodUs >= 0);
                      HyraSim::StoreDebugSettings(db, logLevel,
                                                  dumpObjects != nullptr && *dumpObjects != 0,
                                                  unbindPeriodUs);
                    })
      .status;
}

extern "C" TarnLib_Status TarnLib_SetSPMSpaceEfficiencyManipulationEnabled(bool enabled) {
  return CallDaemon("TarnLib_SetSPMSpaceEfficiencyManipulationEnabled", Access::kWrite,
                    {Flag(enabled)},
                    [&](sqlite3* db) { HyraSim::StoreSpaceEfficiencyManipulation(db, enabled); })
      .status;
}

extern "C" TarnLib_Status TarnLib_ActivateProvider(const char* arrayId, const char* providerName,
                                                   const char* activeProviderUrl,
                                                   void* activation) {
  return CallDaemon(
             "TarnLib_ActivateProvider", Access::kWrite,
             {Arg(arrayId), Arg(providerName), Arg(activeProviderUrl)},
             [&](sqlite3* db) {
               Require(activeProviderUrl != nullptr && activation != nullptr);
               RequireServedArray(db, arrayId, providerName);
               HyraSim::RecordActivation(db, {arrayId, providerName, true, activeProviderUrl});
             })
      .status;
}

extern "C" TarnLib_Status TarnLib_DeactivateProvider(const char* arrayId,
                                                     const char* providerName) {
  return CallDaemon("TarnLib_DeactivateProvider", Access::kWrite, {Arg(arrayId), Arg(providerName)},
                    [&](sqlite3* db) {
                      RequireServedArray(db, arrayId, providerName);
                      HyraSim::RecordActivation(db, {arrayId, providerName, false, std::string()});
                    })
      .status;
}

extern "C" TarnLib_Status TarnLib_VendorProviderInjectFault(const char* providerName,
                                                            const char* url, const char* status,
                                                            int32_t arrayCount,
                                                            const KiroFaultArrayEntry* arrays) {
  HyraSim::CallArgs args{Arg(providerName), Arg(url), Arg(status), std::to_string(arrayCount)};
  for (int32_t i = 0; arrays != nullptr && i < arrayCount && i < 16; ++i) {
    args.push_back(Arg(arrays[i].arrayId) + (arrays[i].isActive ? " active" : " inactive"));
  }
  return CallDaemon("TarnLib_VendorProviderInjectFault", Access::kWrite, args,
                    [&](sqlite3* db) {
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
                      HyraSim::ReplaceProviderFault(db, fault);
                    })
      .status;
}
