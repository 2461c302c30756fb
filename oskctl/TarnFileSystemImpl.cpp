#include "HostCtl/Storage.h"
#include "HostOperation.h"
#include "OskCtl/Storage.h"
#include "Rows.h"

namespace HostCtl {
namespace Storage {

TarnFileSystem::~TarnFileSystem() = default;

}  // namespace Storage
}  // namespace HostCtl

namespace OskCtl {
namespace Storage {

using HyraSim::Access;

void TarnFileSystemImpl::SetKiroContext(const std::string& uuid) {
  RunHostOperation("SetKiroContext", Access::kWrite, {uuid},
                   [&](sqlite3* db) { HyraSim::StoreKiroContext(db, uuid); });
}

void TarnFileSystemImpl::ClearKiroContext() {
  RunHostOperation("ClearKiroContext", Access::kWrite, {},
                   [](sqlite3* db) { HyraSim::StoreKiroContext(db, std::nullopt); });
}

void TarnFileSystemImpl::UnRegisterVendorProvider(const std::string& name) {
  RunHostOperation("UnRegisterVendorProvider", Access::kWrite, {name}, [&](sqlite3* db) {
    if (!HyraSim::RemoveProviderNamed(db, name)) {
      ThrowHostError("No Kiro provider named " + name + " is registered");
    }
  });
}

}  // namespace Storage
}  // namespace OskCtl
