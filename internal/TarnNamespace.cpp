#include "TarnNamespace.h"

#include <boost/pointer_cast.hpp>
#include <string>

#include "CGAdd.h"
#include "CGCreate.h"
#include "CGDelete.h"
#include "CGList.h"
#include "CGSync.h"
#include "ConfigTarnAdd.h"
#include "ConfigTarnMountdir.h"
#include "ConfigTarnRemove.h"
#include "ConfigTarnUmountdir.h"
#include "DaemonCommand.h"
#include "FaultInjectionEnable.h"
#include "FaultInjectionRuleAdd.h"
#include "FaultInjectionRuleRemove.h"
#include "FaultInjectionRuleSet.h"
#include "HostCtl/Lib.h"
#include "KiroContextSet.h"
#include "StorageContainerAdd.h"
#include "StorageContainerCheckTarns.h"
#include "StorageContainerLoad.h"
#include "StorageContainerRemove.h"
#include "VendorProviderActivate.h"
#include "VendorProviderAdd.h"
#include "VendorProviderDeactivate.h"
#include "VendorProviderInjectFault.h"
#include "VendorProviderRemove.h"
#include "VendorProviderSet.h"
#include "VirtualVolumeGet.h"
#include "VirtualVolumeMetaDataList.h"

namespace HalvikCli {
namespace TarnNamespace {
namespace {

using Fendle::AutoCli::Namespace;
typedef boost::shared_ptr<Namespace> NamespacePtr;

constexpr char kStorage[] = "storage";
constexpr char kInternal[] = "internal";
constexpr char kInternalDescription[] = "Halvik internal storage commands.";

NamespacePtr NewNamespace() { return Namespace::New(); }

NamespacePtr NewNamespace(const char* description) {
  NamespacePtr space = Namespace::New();
  space->SetDescription(description);
  return space;
}

[[noreturn]] void ThrowNotANamespace(const std::string& child, const std::string& parent) {
  throw HostCtl::Lib::HostCtlException(
      "Node '" + child + "' in namespace '" + parent + "' is not a namespace",
      HostCtl::Lib::KelmMessage());
}

// The existing child namespace of that name.
NamespacePtr ChildNamespace(const NamespacePtr& parent, const std::string& name) {
  NamespacePtr child = boost::dynamic_pointer_cast<Namespace>(parent->GetNamespaceNode(name));
  if (!child) {
    ThrowNotANamespace(name, parent->GetName());
  }
  return child;
}

// Builds `tarn` bottom-up and hangs it under internal as the very last step,
// so that nothing of it shows in the host's tree unless every command was
// created.
void BuildTarnTree(const NamespacePtr& internal) {
  NamespacePtr tarn = NewNamespace("Operations pertaining to Virtual Volumes");

  NamespacePtr kiroprovider = NewNamespace("Manage Tarn Kiro Provider Operations.");
  kiroprovider->RegisterNamespaceNode(VendorProviderAdd::New(), "add");
  kiroprovider->RegisterNamespaceNode(VendorProviderSet::New(), "set");
  kiroprovider->RegisterNamespaceNode(VendorProviderRemove::New(), "remove");
  kiroprovider->RegisterNamespaceNode(VendorProviderActivate::New(), "activate");
  kiroprovider->RegisterNamespaceNode(VendorProviderDeactivate::New(), "deactivate");
  kiroprovider->RegisterNamespaceNode(VendorProviderInjectFault::New(), "injectfault");
  tarn->RegisterNamespaceNode(kiroprovider, "kiroprovider");

  NamespacePtr faultInjection = NewNamespace("Manage fault injection.");
  faultInjection->RegisterNamespaceNode(FaultInjectionEnable::New(), "enable");
  NamespacePtr rule = NewNamespace();
  rule->RegisterNamespaceNode(FaultInjectionRuleAdd::New(), "add");
  rule->RegisterNamespaceNode(FaultInjectionRuleSet::New(), "set");
  rule->RegisterNamespaceNode(FaultInjectionRuleRemove::New(), "remove");
  faultInjection->RegisterNamespaceNode(rule, "rule");
  tarn->RegisterNamespaceNode(faultInjection, "faultInjection");

  NamespacePtr storagecontainer =
      NewNamespace("Operations to create, manage, remove and restore Tarn StorageContainers.");
  storagecontainer->RegisterNamespaceNode(StorageContainerLoad::New(), "load");
  storagecontainer->RegisterNamespaceNode(StorageContainerAdd::New(), "add");
  storagecontainer->RegisterNamespaceNode(StorageContainerRemove::New(), "remove");
  storagecontainer->RegisterNamespaceNode(StorageContainerCheckTarns::New(), "checktarns");
  tarn->RegisterNamespaceNode(storagecontainer, "storagecontainer");

  NamespacePtr configtarn = NewNamespace("Operations pertaining to config-tarns.");
  configtarn->RegisterNamespaceNode(ConfigTarnAdd::New(), "add");
  configtarn->RegisterNamespaceNode(ConfigTarnRemove::New(), "remove");
  configtarn->RegisterNamespaceNode(ConfigTarnUmountdir::New(), "umount");
  configtarn->RegisterNamespaceNode(ConfigTarnMountdir::New(), "mount");
  tarn->RegisterNamespaceNode(configtarn, "configtarn");

  NamespacePtr daemon = NewNamespace(
      "Operations pertaining to Tarn daemon to  set LogLevel,unbind timer and dump objects.");
  daemon->RegisterNamespaceNode(DaemonCommand::New(), "set");
  tarn->RegisterNamespaceNode(daemon, "daemon");

  NamespacePtr kirocontext = NewNamespace("Operations on the Tarn Kiro context.");
  kirocontext->RegisterNamespaceNode(KiroContextSet::New(), "set");
  tarn->RegisterNamespaceNode(kirocontext, "kirocontext");

  NamespacePtr virtualvolume = NewNamespace("Operations on a specific virtual volume.");
  virtualvolume->RegisterNamespaceNode(VirtualVolumeGet::New(), "get");
  NamespacePtr metadata = NewNamespace("Operations on the metadata for a specific virtual volume.");
  metadata->RegisterNamespaceNode(VirtualVolumeMetaDataList::New(), "list");
  virtualvolume->RegisterNamespaceNode(metadata, "metadata");
  tarn->RegisterNamespaceNode(virtualvolume, "virtualvolume");

  internal->RegisterNamespaceNode(tarn, "tarn");
}

}  // namespace
}  // namespace TarnNamespace
}  // namespace HalvikCli

extern "C" void AutoCli_RegisterNamespaces(boost::shared_ptr<Fendle::AutoCli::Namespace>& root) {
  using HalvikCli::TarnNamespace::ChildNamespace;
  using HalvikCli::TarnNamespace::kInternal;
  using HalvikCli::TarnNamespace::kInternalDescription;
  using HalvikCli::TarnNamespace::kStorage;
  using HalvikCli::TarnNamespace::NamespacePtr;
  using HalvikCli::TarnNamespace::NewNamespace;

  if (!root) {
    throw HostCtl::Lib::HostCtlException("No root namespace to register 'storage internal tarn' in",
                                         HostCtl::Lib::KelmMessage());
  }
  if (!root->HasNamespaceNode(kStorage)) {
    throw HostCtl::Lib::HostCtlException(
        std::string("Unable to find 'storage' namespace in namespace '") + root->GetName() + "'",
        HostCtl::Lib::KelmMessage());
  }
  const NamespacePtr storage = ChildNamespace(root, kStorage);

  NamespacePtr internal;
  if (storage->HasNamespaceNode(kInternal)) {
    internal = ChildNamespace(storage, kInternal);
  } else {
    // Registered before the subtree is built, so it stays even when the
    // build fails.
    internal = NewNamespace(kInternalDescription);
    storage->RegisterNamespaceNode(internal, kInternal);
  }
  HalvikCli::TarnNamespace::BuildTarnTree(internal);
}
