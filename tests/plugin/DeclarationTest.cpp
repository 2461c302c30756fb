// What each of the 27 command classes declares to the host: description,
// metadata, formatter and hints, parameters and result prototype.
#include <functional>

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
#include "KiroContextSet.h"
#include "PluginTestSupport.h"
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

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using Fendle::AutoCli::Command;
using Fendle::CallSpec::ParameterType;

// One parameter: long name, alias ("" for none), type, required, help.
struct Param {
  std::string name;
  std::string alias;
  ParameterType type;
  bool required;
  std::string help;
};

struct Declaration {
  const char* cls;
  std::function<boost::shared_ptr<Command>()> make;
  std::string description;
  std::string kind;
  std::string formatter;
  Command::Pairs hints;
  std::string result;  // the prototype as Describe shows it
  std::vector<Param> params;
};

const ParameterType S = ParameterType::String;
const ParameterType I = ParameterType::Int;
const ParameterType B = ParameterType::Bool;
const ParameterType F = ParameterType::Flag;
const ParameterType SL = ParameterType::StringList;
const ParameterType IL = ParameterType::IntList;
const ParameterType BL = ParameterType::BoolList;

const char kPriorityHelp[] = "Use priority socket to allow out-of-order execution of this request";
const char kFaultHelp[] = "The fault name (e.g. - \"STORAGE_FAULT\")";
const char kRuleOperationHelp[] =
    "The Kiro op (e.g. - \"createVirtualVolume\") as listed in the Kiro 2.0 specification -- "
    "omit this parameter to create a 'wildcard' rule which injects this fault for all operations "
    "for which it is legal.";
const char kStoragePrototype[] =
    "[<StorageContainer{StorageContainer Name=\"\",StorageContainer Id=\"\",Max Tarn Size "
    "(MB)=0,VP URL=\"\",Arrays=[<Array{ArrayId=\"\",Name=\"\",VendorId=\"\",ModelId=\"\","
    "PEInfo=[]}>]}>]";

std::vector<Param> RuleParams() {
  return {{"fault", "f", S, true, kFaultHelp},
          {"operation", "o", S, false, kRuleOperationHelp},
          {"frequency", "n", I, false,
           "The target frequency in operations.  Either this or time must be specified."},
          {"time", "t", I, false,
           "The rule will be triggered if time since last injection exceeds this limit (in ms).  "
           "Either this or frequency must be specified."}};
}

std::vector<Param> ConfigTarnParams(const std::string& nameHelp) {
  return {{"name", "n", S, false, nameHelp},
          {"container-id", "c", S, true, "StorageContainer ID"},
          {"uuid", "u", S, false, "meta-tarn UUID"},
          {"priority", "", F, false, kPriorityHelp}};
}

std::vector<Param> VolumeParams() {
  return {{"container-id", "c", S, true, "The storage container the Tarn is in."},
          {"uuid", "u", S, true, "The Tarn UUID."}};
}

template <typename T>
std::function<boost::shared_ptr<Command>()> Maker() {
  return [] { return T::New(); };
}

std::vector<Declaration> Declarations() {
  return {
      {"VendorProviderAdd",
       Maker<VendorProviderAdd>(),
       "Add a new Kiro Provider on the host.",
       "operation",
       "simple",
       {},
       "\"\"",
       {{"vp-name", "v", S, true, "Kiro Provider Name"},
        {"vp-url", "U", S, true, "VP URL"},
        {"arrayid", "a", SL, false, "Array Id"},
        {"priority", "p", IL, false, "Priority"},
        {"isactive", "i", BL, false, "Is Active"}}},
      {"VendorProviderSet",
       Maker<VendorProviderSet>(),
       "Update an existing Kiro Provider on the host.",
       "operation",
       "simple",
       {},
       "\"\"",
       {{"vp-name", "v", S, true, "Kiro Provider Name"},
        {"arrayid", "a", SL, false, "Array Id"},
        {"priority", "p", IL, false, "Priority(integer). Should be specified with arrayId"},
        {"isactive", "i", BL, false, "IsActive(Boolean value). Should be specified with arrayId"}}},
      {"VendorProviderRemove",
       Maker<VendorProviderRemove>(),
       "Unregister a Kiro Provider from Hyra host.",
       "operation",
       "",
       {},
       "bool",
       {{"vp-name", "v", S, true, "Kiro Provider Name"}}},
      {"VendorProviderActivate",
       Maker<VendorProviderActivate>(),
       "Activate Kiro Provider for a specified Array.",
       "operation",
       "",
       {},
       "bool",
       {{"vp-name", "n", S, true, "Name of the VP to be activated"},
        {"arrayid", "a", S, true, "ID of the Array to be activated"},
        {"activevpurl", "u", S, false, "URL of current active VP."}}},
      {"VendorProviderDeactivate",
       Maker<VendorProviderDeactivate>(),
       "Deactivate Kiro Provider for a specified Array.",
       "operation",
       "",
       {},
       "bool",
       {{"vp-name", "n", S, true, "Name of the VP to be deactivated"},
        {"arrayid", "a", S, true, "ID of the Array to be Deactivated"}}},
      {"VendorProviderInjectFault",
       Maker<VendorProviderInjectFault>(),
       "Inject Kiro Provider related fault in Tarnd for debugging.",
       "operation",
       "simple",
       {},
       "\"\"",
       {{"vp-name", "v", S, true, "Kiro Provider Name"},
        {"status", "s", S, false, "Connection Status of VP (online/offline/syncError/unknown)"},
        {"arrayid", "a", SL, false, "Array Id"},
        {"isactive", "i", BL, false,
         "IsActive(Boolean value). Should be specified along with parameter arrayId"}}},
      {"FaultInjectionEnable",
       Maker<FaultInjectionEnable>(),
       "Enable or disable Kiro Fault Injection.",
       "operation",
       "simple",
       {},
       "bool",
       {{"enabled", "e", B, true, "true / false"}}},
      {"FaultInjectionRuleAdd",
       Maker<FaultInjectionRuleAdd>(),
       "Add a fault injection rule.",
       "operation",
       "simple",
       {},
       "bool",
       RuleParams()},
      {"FaultInjectionRuleSet",
       Maker<FaultInjectionRuleSet>(),
       "Modify a fault injection rule.",
       "operation",
       "simple",
       {},
       "bool",
       RuleParams()},
      {"FaultInjectionRuleRemove",
       Maker<FaultInjectionRuleRemove>(),
       "Removes a fault injection rule.",
       "operation",
       "simple",
       {},
       "bool",
       {{"fault", "f", S, true, kFaultHelp},
        {"operation", "o", S, false,
         "The Kiro op (e.g. - \"createVirtualVolume\") as listed in the Kiro 2.0 specification "
         "-- omit this parameter to remove a 'wildcard' rule."}}},
      {"StorageContainerLoad",
       Maker<StorageContainerLoad>(),
       "Load All the Tarn StorageContainers exported by the VP.",
       "operation",
       "simple",
       {{"header:StorageContainer", "%StorageContainer Name%"},
        {"header:Array", "%ArrayId%"},
        {"table-columns",
         "StorageContainer Name,StorageContainer Id,Max Tarn Size (MB),VP URL,Arrays"}},
       kStoragePrototype,
       {}},
      {"StorageContainerAdd",
       Maker<StorageContainerAdd>(),
       "Add a new Tarn StorageContainer to the Hyra Host and mount it with the given volume name.",
       "operation",
       "",
       {},
       "bool",
       {{"container-name", "n", S, true, "StorageContainer Name"},
        {"container-id", "c", S, true, "StorageContainer ID"},
        {"array", "a", SL, false, "List of Array UUID"}}},
      {"StorageContainerRemove",
       Maker<StorageContainerRemove>(),
       "Remove given Tarn StorageContainer from Hyra host",
       "operation",
       "",
       {},
       "bool",
       {{"container-id", "c", S, true, "StorageContainer ID"}}},
      {"StorageContainerCheckTarns",
       Maker<StorageContainerCheckTarns>(),
       "Check availability of given Tarns in a StorageContainer",
       "operation",
       "table",
       {{"fields:TarnsAreAccessible", "TarnId,Status"}},
       "[<TarnsAreAccessible{TarnId=\"\",Status=\"\"}>]",
       {{"path", "p", S, true, "Tarn datastore path"}, {"tarn", "v", SL, false, "Tarn Uuid"}}},
      {"ConfigTarnAdd",
       Maker<ConfigTarnAdd>(),
       "ConfigTarnAdd a config Tarn in a given Tarn StorageContainer.",
       "operation",
       "",
       {},
       "bool",
       {{"name", "n", S, true, "Directory Name"},
        {"container-id", "c", S, true, "StorageContainer ID"},
        {"size", "s", I, false, "Size of the meta-tarn object in MB"},
        {"policy", "p", S, false, "Policy string for meta-tarn object"},
        {"vmuuid", "v", S, false, "VM Uuid string for meta-tarn object"},
        {"policy-file", "f", S, false, "Policy file for meta-tarn object"},
        {"priority", "", F, false, kPriorityHelp}}},
      {"ConfigTarnRemove",
       Maker<ConfigTarnRemove>(),
       "Unmount and delete a given config Tarn.",
       "operation",
       "",
       {},
       "bool",
       ConfigTarnParams("Directory Path")},
      {"ConfigTarnUmountdir",
       Maker<ConfigTarnUmountdir>(),
       "Unmount a given Config Tarn from the Hyra file system",
       "operation",
       "",
       {},
       "bool",
       ConfigTarnParams("Directory Name")},
      {"ConfigTarnMountdir",
       Maker<ConfigTarnMountdir>(),
       "Mount a given config Tarn as directory in the Hyra file system",
       "operation",
       "",
       {},
       "bool",
       ConfigTarnParams("Directory Name")},
      {"DaemonCommand",
       Maker<DaemonCommand>(),
       "Daemon Command for tarn Operations.",
       "operation",
       "",
       {},
       "bool",
       {{"log-level", "l", S, false,
         "log-level <panic|quiet|error|warning|verbose|trivia> log-level is not changed if "
         "parameter is omitted"},
        {"dump-objects", "d", F, false,
         "Dump Tarn daemon memory objects to the logdumping of dameon memory is not done if "
         "parameter is omitted"},
        {"unbind-period", "t", I, false,
         "Unbind timer interval in microseconds. Unbind Timer interval is defaulted to 5 mins "
         "if parameter is omitted"},
        {"unbind-now", "u", F, false,
         "Set this flag to force unbind now. Unbind will happen on the timer if parameter is "
         "omitted"},
        {"start-pe-apd", "", S, false,
         "Simulate PE APD start for a given PE. APD simulation is not done if omitted "},
        {"end-pe-apd", "", S, false,
         "Simulate PE APD end for a given PE. APD simulation is not done if omitted "},
        {"disable-spm-space-efficiency-cmds", "", B, false,
         "Disable space efficiency capability commands in SPM. This means that Tarn Layer will "
         "not modify profile based on alloctype."}}},
      {"KiroContextSet",
       Maker<KiroContextSet>(),
       "Set the Tarn Kiro context (ZM UUID) on the host.",
       "operation",
       "simple",
       {},
       "bool",
       {{"uuid", "u", S, false,
         "The ZM UUID for the Tarn Kiro context you wish to configure on the host"},
        {"clear", "c", F, false, "Clear the Tarn Kiro context for the host"}}},
      {"VirtualVolumeGet",
       Maker<VirtualVolumeGet>(),
       "Get information about a Virtual Volume.",
       "operation",
       "simple",
       {{"units:TarnInfoInternal.Logical Size", "MB"},
        {"units:TarnInfoInternal.Committed Size", "MB"},
        {"units:TarnInfoInternal.Unshared Size", "MB"},
        {"fields:TarnInfoInternal",
         "Container Id,Tarn UUID,Logical Size,Committed Size,Unshared Size Valid,Unshared "
         "Size,Storage Profile,Block Size"}},
       "TarnInfoInternal{Tarn UUID=\"\",Container Id=\"\",Logical Size=0,Committed Size=0,"
       "Unshared Size=0,Unshared Size Valid=bool,Storage Profile=\"\",Block Size=0}",
       VolumeParams()},
      {"VirtualVolumeMetaDataList",
       Maker<VirtualVolumeMetaDataList>(),
       "List Virtual Volume MetaData.",
       "operation",
       "table",
       {},
       "[<TarnMetaData{key=\"\",value=\"\"}>]",
       VolumeParams()},
      {"CGAdd",
       Maker<CGAdd>(),
       "Add the TarnIds to Consistency Group",
       "operation",
       "",
       {},
       "bool",
       {{"cgid", "c", S, true, "Consistency Group ID to which tarns are to be added"},
        {"tarnids", "v", SL, true, "List of TarnIDs."},
        {"vp-name", "n", S, true, "Name of the VP which the Hyra is registered to."}}},
      {"CGCreate",
       Maker<CGCreate>(),
       "Create a Consistency Group.",
       "operation",
       "table",
       {{"fields:CGCreate",
         "Name,Description,Id,DestinationArrayId,FailoverArrayId,SourceArrayId,State"}},
       "CGCreate{Name=\"\",Description=\"\",Id=\"\",DestinationArrayId=\"\",FailoverArrayId="
       "\"\",SourceArrayId=\"\",State=\"\"}",
       {{"name", "n", S, true, "Consistency Group Name"},
        {"desc", "d", S, true, "Consistency Group Description"},
        {"profile", "p", S, true, "Profile ID as advertised by VP"},
        {"vp-name", "v", S, true, "Name of the VP which Hyra host is registered to"}}},
      {"CGDelete",
       Maker<CGDelete>(),
       "Delete the Consistency Group",
       "operation",
       "simple",
       {},
       "bool",
       {{"cgid", "c", S, true, "ID of Consistency Group to be deleted"},
        {"vp-name", "v", S, true, "Name of the VP"}}},
      {"CGList",
       Maker<CGList>(),
       "List Consistency Group IDs.",
       "fetcher",
       "table",
       {{"fields:CGList",
         "CgId,Name,Description,DestinationArrayId,FailOverArrayId,SourceArrayId,State,Warning,"
         "Error"}},
       "[<CGList{CgId=\"\",Name=\"\",Description=\"\",DestinationArrayId=\"\",FailOverArrayId="
       "\"\",SourceArrayId=\"\",State=\"\",Warning=\"\",Error=\"\"}>]",
       {{"cgid", "c", SL, true, "List of CG IDs."},
        {"vp-name", "n", S, true, "Name of the VP which Hyra is registered."}}},
      {"CGSync",
       Maker<CGSync>(),
       "Sync Consistency Group IDs.",
       "operation",
       "simple",
       {{"header:CgSync", "%CgId%"}, {"fields:CGSync", "CgId,RpId,TimeStamp,Warning,Error"}},
       "[<CGSync{CgId=\"\",RpId=\"\",TimeStamp=\"\",Warning=\"\",Error=\"\"}>]",
       {{"cgid", "c", SL, true, "List of CG IDs."},
        {"vp-name", "n", S, true, "Name of the VP which Host is registered."}}},
  };
}

class DeclarationTest : public SimWorldTest {};

TEST_F(DeclarationTest, EveryClassDeclaresWhatItsHelpAndFormattersNeed) {
  const std::vector<Declaration> declarations = Declarations();
  ASSERT_EQ(declarations.size(), 27u);
  for (const Declaration& d : declarations) {
    SCOPED_TRACE(d.cls);
    boost::shared_ptr<Command> command = d.make();
    EXPECT_EQ(command->GetDescription(), d.description);
    EXPECT_EQ(command->GetMetaData(), (Command::Pairs{{"type", d.kind}}));
    EXPECT_EQ(command->GetDefaultOutputFormatter(), d.formatter);
    EXPECT_EQ(command->GetDefaultOutputFormatParameters(), d.hints);
    EXPECT_EQ(Describe(command->GetOutputSpec()->GetResultType()), d.result);

    const boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = command->GetInputSpec();
    const auto& declared = spec->GetParameters();
    ASSERT_EQ(declared.size(), d.params.size());
    for (std::size_t i = 0; i < declared.size(); ++i) {
      const Param& p = d.params[i];
      SCOPED_TRACE(p.name);
      EXPECT_EQ(declared[i]->GetName(), p.name);
      EXPECT_EQ(declared[i]->GetAlias(), p.alias);
      EXPECT_EQ(declared[i]->GetType(), p.type);
      EXPECT_EQ(declared[i]->IsRequired(), p.required);
      EXPECT_EQ(declared[i]->GetHelp(), p.help);
    }
  }
}

TEST_F(DeclarationTest, LogLevelWordsMapToTheDaemonsNumbers) {
  const std::pair<std::string, int32_t> cases[] = {
      {"panic", 2},    {"quiet", 1},   {"error", 4}, {"warning", 8}, {"WARNING", 8}, {"info", 16},
      {"Verbose", 32}, {"trivia", 64}, {"loud", 4},  {"", 4},        {"warn", 4},    {"panic ", 4},
  };
  boost::shared_ptr<DaemonCommand> command = DaemonCommand::New();
  for (const auto& c : cases) {
    EXPECT_EQ(command->GetLogLevelInt(c.first), c.second) << '"' << c.first << '"';
  }
}

TEST_F(DeclarationTest, StorageArrayListKeepsTheRecordsAndTheirEndpointLinesInOrder) {
  boost::shared_ptr<StorageContainerLoad> command = StorageContainerLoad::New();
  const std::vector<SAInfo> arrays = {
      {"a1", "one", "v1", "m1", {"PE #0 (x)", "PE #1 (y)"}},
      {"a2", "two", "v2", "m2", {}},
  };
  const std::string prototype =
      "<Array{ArrayId=\"\",Name=\"\",VendorId=\"\",ModelId=\"\",PEInfo=[]}>";
  EXPECT_EQ(Describe(command->GetStorageArrayList({})), "[" + prototype + "]");
  EXPECT_EQ(Describe(command->GetStorageArrayList(arrays)),
            "[" + prototype +
                "Array{ArrayId=\"a1\",Name=\"one\",VendorId=\"v1\",ModelId=\"m1\","
                "PEInfo=[\"PE #0 (x)\",\"PE #1 (y)\"]},"
                "Array{ArrayId=\"a2\",Name=\"two\",VendorId=\"v2\",ModelId=\"m2\",PEInfo=[]}]");
}

}  // namespace
}  // namespace PluginTest
