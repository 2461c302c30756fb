// What the plug-in declares to the host: the tree in registration order with
// every namespace's description and, for each command, its class, metadata,
// formatter, hints, result prototype and parameters; then the classes that are
// not in the tree. Compared as one text, so that help and formatters can rely
// on every blank of it.
#include <boost/core/demangle.hpp>
#include <sstream>
#include <typeinfo>

#include "CGAdd.h"
#include "CGCreate.h"
#include "CGDelete.h"
#include "CGList.h"
#include "CGSync.h"
#include "DaemonCommand.h"
#include "PluginTestSupport.h"
#include "TarnLibSim.h"
#include "TarnNamespace.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using Fendle::AutoCli::Command;
using Fendle::AutoCli::Namespace;
using Fendle::AutoCli::NamespaceNode;
typedef boost::shared_ptr<NamespaceNode> NodePtr;

void DumpCommand(const std::string& where, Command& command, std::ostream& out) {
  const std::string cls = boost::core::demangle(typeid(command).name());
  out << where << ": " << cls.substr(cls.rfind(':') + 1) << " \"" << command.GetDescription()
      << "\"\n  ";
  for (const auto& field : command.GetMetaData()) out << field.first << "=" << field.second << " ";
  out << "formatter=" << command.GetDefaultOutputFormatter() << "\n";
  for (const auto& hint : command.GetDefaultOutputFormatParameters()) {
    out << "  hint " << hint.first << " = " << hint.second << "\n";
  }
  out << "  result " << Describe(command.GetOutputSpec()->GetResultType()) << "\n";
  const boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = command.GetInputSpec();
  for (const auto& p : spec->GetParameters()) {
    out << "  --" << p->GetName() << (p->GetAlias().empty() ? "" : " -" + p->GetAlias()) << " "
        << Fendle::CallSpec::ParameterTypeName(p->GetType()) << " "
        << (p->IsRequired() ? "required" : "optional") << " \"" << p->GetHelp() << "\"\n";
  }
}

void DumpNode(const NodePtr& node, const std::string& path, std::ostream& out) {
  if (auto command = boost::dynamic_pointer_cast<Command>(node)) {
    DumpCommand(path, *command, out);
    return;
  }
  out << path << " (namespace) \"" << node->GetDescription() << "\"\n";
  for (const NodePtr& child : node->GetNamespaceNodes()) {
    DumpNode(child, path + " " + child->GetName(), out);
  }
}

const char kExpected[] = R"dump(internal (namespace) "Halvik internal storage commands."
internal tarn (namespace) "Operations pertaining to Virtual Volumes"
internal tarn kiroprovider (namespace) "Manage Tarn Kiro Provider Operations."
internal tarn kiroprovider add: VendorProviderAdd "Add a new Kiro Provider on the host."
  type=operation formatter=simple
  result ""
  --vp-name -v string required "Kiro Provider Name"
  --vp-url -U string required "VP URL"
  --arrayid -a string-list optional "Array Id"
  --priority -p int-list optional "Priority"
  --isactive -i bool-list optional "Is Active"
internal tarn kiroprovider set: VendorProviderSet "Update an existing Kiro Provider on the host."
  type=operation formatter=simple
  result ""
  --vp-name -v string required "Kiro Provider Name"
  --arrayid -a string-list optional "Array Id"
  --priority -p int-list optional "Priority(integer). Should be specified with arrayId"
  --isactive -i bool-list optional "IsActive(Boolean value). Should be specified with arrayId"
internal tarn kiroprovider remove: VendorProviderRemove "Unregister a Kiro Provider from Hyra host."
  type=operation formatter=
  result bool
  --vp-name -v string required "Kiro Provider Name"
internal tarn kiroprovider activate: VendorProviderActivate "Activate Kiro Provider for a specified Array."
  type=operation formatter=
  result bool
  --vp-name -n string required "Name of the VP to be activated"
  --arrayid -a string required "ID of the Array to be activated"
  --activevpurl -u string optional "URL of current active VP."
internal tarn kiroprovider deactivate: VendorProviderDeactivate "Deactivate Kiro Provider for a specified Array."
  type=operation formatter=
  result bool
  --vp-name -n string required "Name of the VP to be deactivated"
  --arrayid -a string required "ID of the Array to be Deactivated"
internal tarn kiroprovider injectfault: VendorProviderInjectFault "Inject Kiro Provider related fault in Tarnd for debugging."
  type=operation formatter=simple
  result ""
  --vp-name -v string required "Kiro Provider Name"
  --status -s string optional "Connection Status of VP (online/offline/syncError/unknown)"
  --arrayid -a string-list optional "Array Id"
  --isactive -i bool-list optional "IsActive(Boolean value). Should be specified along with parameter arrayId"
internal tarn faultInjection (namespace) "Manage fault injection."
internal tarn faultInjection enable: FaultInjectionEnable "Enable or disable Kiro Fault Injection."
  type=operation formatter=simple
  result bool
  --enabled -e bool required "true / false"
internal tarn faultInjection rule (namespace) ""
internal tarn faultInjection rule add: FaultInjectionRuleAdd "Add a fault injection rule."
  type=operation formatter=simple
  result bool
  --fault -f string required "The fault name (e.g. - "STORAGE_FAULT")"
  --operation -o string optional "The Kiro op (e.g. - "createVirtualVolume") as listed in the Kiro 2.0 specification -- omit this parameter to create a 'wildcard' rule which injects this fault for all operations for which it is legal."
  --frequency -n int optional "The target frequency in operations.  Either this or time must be specified."
  --time -t int optional "The rule will be triggered if time since last injection exceeds this limit (in ms).  Either this or frequency must be specified."
internal tarn faultInjection rule set: FaultInjectionRuleSet "Modify a fault injection rule."
  type=operation formatter=simple
  result bool
  --fault -f string required "The fault name (e.g. - "STORAGE_FAULT")"
  --operation -o string optional "The Kiro op (e.g. - "createVirtualVolume") as listed in the Kiro 2.0 specification -- omit this parameter to create a 'wildcard' rule which injects this fault for all operations for which it is legal."
  --frequency -n int optional "The target frequency in operations.  Either this or time must be specified."
  --time -t int optional "The rule will be triggered if time since last injection exceeds this limit (in ms).  Either this or frequency must be specified."
internal tarn faultInjection rule remove: FaultInjectionRuleRemove "Removes a fault injection rule."
  type=operation formatter=simple
  result bool
  --fault -f string required "The fault name (e.g. - "STORAGE_FAULT")"
  --operation -o string optional "The Kiro op (e.g. - "createVirtualVolume") as listed in the Kiro 2.0 specification -- omit this parameter to remove a 'wildcard' rule."
internal tarn storagecontainer (namespace) "Operations to create, manage, remove and restore Tarn StorageContainers."
internal tarn storagecontainer load: StorageContainerLoad "Load All the Tarn StorageContainers exported by the VP."
  type=operation formatter=simple
  hint header:StorageContainer = %StorageContainer Name%
  hint header:Array = %ArrayId%
  hint table-columns = StorageContainer Name,StorageContainer Id,Max Tarn Size (MB),VP URL,Arrays
  result [<StorageContainer{StorageContainer Name="",StorageContainer Id="",Max Tarn Size (MB)=0,VP URL="",Arrays=[<Array{ArrayId="",Name="",VendorId="",ModelId="",PEInfo=[]}>]}>]
internal tarn storagecontainer add: StorageContainerAdd "Add a new Tarn StorageContainer to the Hyra Host and mount it with the given volume name."
  type=operation formatter=
  result bool
  --container-name -n string required "StorageContainer Name"
  --container-id -c string required "StorageContainer ID"
  --array -a string-list optional "List of Array UUID"
internal tarn storagecontainer remove: StorageContainerRemove "Remove given Tarn StorageContainer from Hyra host"
  type=operation formatter=
  result bool
  --container-id -c string required "StorageContainer ID"
internal tarn storagecontainer checktarns: StorageContainerCheckTarns "Check availability of given Tarns in a StorageContainer"
  type=operation formatter=table
  hint fields:TarnsAreAccessible = TarnId,Status
  result [<TarnsAreAccessible{TarnId="",Status=""}>]
  --path -p string required "Tarn datastore path"
  --tarn -v string-list optional "Tarn Uuid"
internal tarn configtarn (namespace) "Operations pertaining to config-tarns."
internal tarn configtarn add: ConfigTarnAdd "ConfigTarnAdd a config Tarn in a given Tarn StorageContainer."
  type=operation formatter=
  result bool
  --name -n string required "Directory Name"
  --container-id -c string required "StorageContainer ID"
  --size -s int optional "Size of the meta-tarn object in MB"
  --policy -p string optional "Policy string for meta-tarn object"
  --vmuuid -v string optional "VM Uuid string for meta-tarn object"
  --policy-file -f string optional "Policy file for meta-tarn object"
  --priority flag optional "Use priority socket to allow out-of-order execution of this request"
internal tarn configtarn remove: ConfigTarnRemove "Unmount and delete a given config Tarn."
  type=operation formatter=
  result bool
  --name -n string optional "Directory Path"
  --container-id -c string required "StorageContainer ID"
  --uuid -u string optional "meta-tarn UUID"
  --priority flag optional "Use priority socket to allow out-of-order execution of this request"
internal tarn configtarn umount: ConfigTarnUmountdir "Unmount a given Config Tarn from the Hyra file system"
  type=operation formatter=
  result bool
  --name -n string optional "Directory Name"
  --container-id -c string required "StorageContainer ID"
  --uuid -u string optional "meta-tarn UUID"
  --priority flag optional "Use priority socket to allow out-of-order execution of this request"
internal tarn configtarn mount: ConfigTarnMountdir "Mount a given config Tarn as directory in the Hyra file system"
  type=operation formatter=
  result bool
  --name -n string optional "Directory Name"
  --container-id -c string required "StorageContainer ID"
  --uuid -u string optional "meta-tarn UUID"
  --priority flag optional "Use priority socket to allow out-of-order execution of this request"
internal tarn daemon (namespace) "Operations pertaining to Tarn daemon to  set LogLevel,unbind timer and dump objects."
internal tarn daemon set: DaemonCommand "Daemon Command for tarn Operations."
  type=operation formatter=
  result bool
  --log-level -l string optional "log-level <panic|quiet|error|warning|verbose|trivia> log-level is not changed if parameter is omitted"
  --dump-objects -d flag optional "Dump Tarn daemon memory objects to the logdumping of dameon memory is not done if parameter is omitted"
  --unbind-period -t int optional "Unbind timer interval in microseconds. Unbind Timer interval is defaulted to 5 mins if parameter is omitted"
  --unbind-now -u flag optional "Set this flag to force unbind now. Unbind will happen on the timer if parameter is omitted"
  --start-pe-apd string optional "Simulate PE APD start for a given PE. APD simulation is not done if omitted "
  --end-pe-apd string optional "Simulate PE APD end for a given PE. APD simulation is not done if omitted "
  --disable-spm-space-efficiency-cmds bool optional "Disable space efficiency capability commands in SPM. This means that Tarn Layer will not modify profile based on alloctype."
internal tarn kirocontext (namespace) "Operations on the Tarn Kiro context."
internal tarn kirocontext set: KiroContextSet "Set the Tarn Kiro context (ZM UUID) on the host."
  type=operation formatter=simple
  result bool
  --uuid -u string optional "The ZM UUID for the Tarn Kiro context you wish to configure on the host"
  --clear -c flag optional "Clear the Tarn Kiro context for the host"
internal tarn virtualvolume (namespace) "Operations on a specific virtual volume."
internal tarn virtualvolume get: VirtualVolumeGet "Get information about a Virtual Volume."
  type=operation formatter=simple
  hint units:TarnInfoInternal.Logical Size = MB
  hint units:TarnInfoInternal.Committed Size = MB
  hint units:TarnInfoInternal.Unshared Size = MB
  hint fields:TarnInfoInternal = Container Id,Tarn UUID,Logical Size,Committed Size,Unshared Size Valid,Unshared Size,Storage Profile,Block Size
  result TarnInfoInternal{Tarn UUID="",Container Id="",Logical Size=0,Committed Size=0,Unshared Size=0,Unshared Size Valid=bool,Storage Profile="",Block Size=0}
  --container-id -c string required "The storage container the Tarn is in."
  --uuid -u string required "The Tarn UUID."
internal tarn virtualvolume metadata (namespace) "Operations on the metadata for a specific virtual volume."
internal tarn virtualvolume metadata list: VirtualVolumeMetaDataList "List Virtual Volume MetaData."
  type=operation formatter=table
  result [<TarnMetaData{key="",value=""}>]
  --container-id -c string required "The storage container the Tarn is in."
  --uuid -u string required "The Tarn UUID."
not in tree: CGAdd "Add the TarnIds to Consistency Group"
  type=operation formatter=
  result bool
  --cgid -c string required "Consistency Group ID to which tarns are to be added"
  --tarnids -v string-list required "List of TarnIDs."
  --vp-name -n string required "Name of the VP which the Hyra is registered to."
not in tree: CGCreate "Create a Consistency Group."
  type=operation formatter=table
  hint fields:CGCreate = Name,Description,Id,DestinationArrayId,FailoverArrayId,SourceArrayId,State
  result CGCreate{Name="",Description="",Id="",DestinationArrayId="",FailoverArrayId="",SourceArrayId="",State=""}
  --name -n string required "Consistency Group Name"
  --desc -d string required "Consistency Group Description"
  --profile -p string required "Profile ID as advertised by VP"
  --vp-name -v string required "Name of the VP which Hyra host is registered to"
not in tree: CGDelete "Delete the Consistency Group"
  type=operation formatter=simple
  result bool
  --cgid -c string required "ID of Consistency Group to be deleted"
  --vp-name -v string required "Name of the VP"
not in tree: CGList "List Consistency Group IDs."
  type=fetcher formatter=table
  hint fields:CGList = CgId,Name,Description,DestinationArrayId,FailOverArrayId,SourceArrayId,State,Warning,Error
  result [<CGList{CgId="",Name="",Description="",DestinationArrayId="",FailOverArrayId="",SourceArrayId="",State="",Warning="",Error=""}>]
  --cgid -c string-list required "List of CG IDs."
  --vp-name -n string required "Name of the VP which Hyra is registered."
not in tree: CGSync "Sync Consistency Group IDs."
  type=operation formatter=simple
  hint header:CgSync = %CgId%
  hint fields:CGSync = CgId,RpId,TimeStamp,Warning,Error
  result [<CGSync{CgId="",RpId="",TimeStamp="",Warning="",Error=""}>]
  --cgid -c string-list required "List of CG IDs."
  --vp-name -n string required "Name of the VP which Host is registered."
)dump";

class DeclarationTest : public SimWorldTest {};

TEST_F(DeclarationTest, TreeAndClassesDeclareExactlyWhatTheHostShows) {
  boost::shared_ptr<Namespace> root = Namespace::New();
  root->RegisterNamespaceNode(Namespace::New(), "storage");
  AutoCli_RegisterNamespaces(root);
  // Seven commands hold the daemon client library while the tree lives.
  EXPECT_EQ(TarnLibSim_Openings(), 7);

  std::ostringstream dump;
  DumpNode(root->GetNamespaceNode("storage")->GetNamespaceNode("internal"), "internal", dump);
  DumpCommand("not in tree", *CGAdd::New(), dump);
  DumpCommand("not in tree", *CGCreate::New(), dump);
  DumpCommand("not in tree", *CGDelete::New(), dump);
  DumpCommand("not in tree", *CGList::New(), dump);
  DumpCommand("not in tree", *CGSync::New(), dump);
  EXPECT_EQ(dump.str(), kExpected);

  root.reset();
  EXPECT_EQ(TarnLibSim_Openings(), 0);
}

TEST_F(DeclarationTest, LogLevelWordsMapToTheDaemonsNumbers) {
  const std::pair<std::string, int32_t> cases[] = {
      {"panic", 2},    {"quiet", 1},   {"error", 4}, {"warning", 8}, {"WARNING", 8}, {"info", 16},
      {"Verbose", 32}, {"trivia", 64}, {"loud", 4},  {"", 4},        {"panic ", 4},
  };
  boost::shared_ptr<DaemonCommand> command = DaemonCommand::New();
  for (const auto& c : cases) {
    EXPECT_EQ(command->GetLogLevelInt(c.first), c.second) << '"' << c.first << '"';
  }
}

}  // namespace
}  // namespace PluginTest
