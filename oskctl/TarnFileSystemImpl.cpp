#include "HostCtl/Storage.h"
#include "HostOperation.h"
#include "OskCtl/Storage.h"

namespace HostCtl {
namespace Storage {

TarnFileSystem::~TarnFileSystem() = default;

}  // namespace Storage
}  // namespace HostCtl

namespace OskCtl {
namespace Storage {

using HyraSim::Access;
using HyraSim::WorldState;

void TarnFileSystemImpl::SetKiroContext(const std::string& uuid) {
  RunHostOperation("SetKiroContext", Access::kWrite, [&](WorldState& w) {
    w.kiroContext = uuid;
    return unsigned{HyraSim::kSectionKiro};
  });
}

void TarnFileSystemImpl::ClearKiroContext() {
  RunHostOperation("ClearKiroContext", Access::kWrite, [](WorldState& w) {
    w.kiroContext.reset();
    return unsigned{HyraSim::kSectionKiro};
  });
}

void TarnFileSystemImpl::UnRegisterVendorProvider(const std::string& name) {
  RunHostOperation("UnRegisterVendorProvider", Access::kWrite, [&](WorldState& w) {
    const HyraSim::Provider* provider = w.FindProvider(name);
    if (provider == nullptr) ThrowHostError("No Kiro provider named " + name + " is registered");
    w.providers.erase(w.providers.begin() + (provider - w.providers.data()));
    return unsigned{HyraSim::kSectionProviders};
  });
}

}  // namespace Storage
}  // namespace OskCtl
