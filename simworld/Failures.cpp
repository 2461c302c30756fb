#include "Failures.h"

#include <algorithm>
#include <iterator>

#include "Connection.h"

namespace HyraSim {
namespace {

// The storage-control operations, then the daemon client functions that can
// report a failure. The release, free and text functions of the daemon client
// have no way to report one and cannot be armed.
const char* const kArmable[] = {
    "AddTarnFileSystem",
    "GetTarnFileSystems",
    "TarnVpExists",
    "GetTarnVendorProviders",
    "UpdateTarnVendorProvider",
    "UnRegisterVendorProvider",
    "RemoveTarnFileSystem",
    "GetTarnFileSystemByPath",
    "GetContainerName",
    "GetContainerId",
    "GetContainerIdText",
    "MatchesContainerId",
    "CheckTarnAccessibility",
    "CreateConfigTarn",
    "MountConfigTarn",
    "UnmountConfigTarn",
    "RemoveConfigTarn",
    "NotifyTarnProtocolEndpointEvent",
    "SetKiroContext",
    "ClearKiroContext",
    "TarnLib_Init",
    "TarnLib_SetFaultInjectionEnabled",
    "TarnLib_AddFaultInjectionRule",
    "TarnLib_ModifyFaultInjectionRule",
    "TarnLib_DebugCommand",
    "TarnLib_SetSPMSpaceEfficiencyManipulationEnabled",
    "TarnLib_ActivateProvider",
    "TarnLib_DeactivateProvider",
    "TarnLib_VendorProviderInjectFault",
    "TarnLib_GetStorageContainer",
    "TarnLib_QueryAllConfigTarns",
    "TarnLib_NormalizeContainerIdString",
    "TarnLib_GetTarnInfo",
    "TarnLib_SpaceStatsForTarn",
    "TarnLib_GetTarnMetadata",
    "TarnLib_UnsharedChunksTarn",
};

}  // namespace

bool IsArmableOperation(const std::string& operation) {
  return std::find(std::begin(kArmable), std::end(kArmable), operation) != std::end(kArmable);
}

std::vector<std::string> ArmableOperations() {
  return std::vector<std::string>(std::begin(kArmable), std::end(kArmable));
}

Injection ConsumeCall(sqlite3* db, const std::string& operation) {
  Statement row(db, "SELECT message, after, times, answer_null FROM failure WHERE operation = ?");
  row.Bind(1, operation);
  if (!row.Step()) return {};
  // Read the whole row before the arming is changed under the statement.
  const Injection injection{true, row.Int(3) != 0, row.Text(0)};
  const int64_t after = row.Int(1);
  const int64_t times = row.Int(2);
  if (after > 0) {
    Statement(db, "UPDATE failure SET after = after - 1 WHERE operation = ?")
        .Bind(1, operation)
        .Run();
    return {};
  }
  if (times <= 1) {
    Statement(db, "DELETE FROM failure WHERE operation = ?").Bind(1, operation).Run();
  } else {
    Statement(db, "UPDATE failure SET times = times - 1 WHERE operation = ?")
        .Bind(1, operation)
        .Run();
  }
  return injection;
}

void StoreArming(sqlite3* db, const std::string& operation, const FailureSpec& spec) {
  Statement(db, "INSERT OR REPLACE INTO failure VALUES(?, ?, ?, ?, ?)")
      .Bind(1, operation)
      .Bind(2, spec.message)
      .Bind(3, spec.after)
      .Bind(4, spec.times)
      .Bind(5, int64_t{spec.null ? 1 : 0})
      .Run();
}

void DeleteArmings(sqlite3* db) { Exec(db, "DELETE FROM failure"); }

std::vector<std::pair<std::string, FailureSpec> > ReadArmings(sqlite3* db) {
  std::vector<std::pair<std::string, FailureSpec> > armings;
  Statement row(db,
                "SELECT operation, message, after, times, answer_null FROM failure"
                " ORDER BY operation");
  while (row.Step()) {
    FailureSpec spec;
    spec.message = row.Text(1);
    spec.after = row.Int(2);
    spec.times = row.Int(3);
    spec.null = row.Int(4) != 0;
    armings.emplace_back(row.Text(0), spec);
  }
  return armings;
}

}  // namespace HyraSim
