#include "VendorProviderInjectFault.h"

#include <cstdint>
#include <sstream>
#include <string>
#include <vector>

#include "HostCtl/Lib.h"
#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"
#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/ProviderArrays.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Inject Kiro Provider related fault in Tarnd for debugging.";
constexpr char kDefaultStatus[] = "default";
constexpr char kUnknownProviderPrefix[] = "VP : ";
constexpr char kMissingArrayOrFlag[] = "Missing one of the parameter arrayId or isActive";
constexpr char kLookupFailedPrefix[] = "InjectFault failed for VP";
constexpr char kInjectedPrefix[] = "Successfully Injected fault for VP with name : ";
constexpr char kDaemonFailedPrefix[] = "VendorProviderInjectFault failed for VP with name : ";
constexpr char kDaemonErrorInfix[] = " with error: ";

}  // namespace

boost::shared_ptr<VendorProviderInjectFault> VendorProviderInjectFault::New() {
  return boost::shared_ptr<VendorProviderInjectFault>(new VendorProviderInjectFault());
}

VendorProviderInjectFault::VendorProviderInjectFault() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> VendorProviderInjectFault::GetInputSpecInternal() {
  return DeclareParameters({
      {kVpName, "v", ParameterType::String, kRequired, "Kiro Provider Name"},
      {kStatus, "s", ParameterType::String, kOptional,
       "Connection Status of VP (online/offline/syncError/unknown)"},
      {kArrayId, "a", ParameterType::StringList, kOptional, "Array Id"},
      {kIsActive, "i", ParameterType::BoolList, kOptional,
       "IsActive(Boolean value). Should be specified along with parameter arrayId"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VendorProviderInjectFault::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaString::New());
}

void VendorProviderInjectFault::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  std::string status = input->GetString(kStatus);
  const std::string name = input->GetString(kVpName);
  if (status.empty()) {
    status = kDefaultStatus;
  }

  if (!storageInfo.TarnVpExists(name)) {
    EndWithUnknownProvider(output, kUnknownProviderPrefix, name);
    return;
  }
  // The table borrows the texts of arrayIds, which outlives the daemon call.
  const std::vector<std::string> arrayIds = input->GetStringList(kArrayId);
  const std::vector<bool> flags = input->GetBoolList(kIsActive);
  if (arrayIds.size() != flags.size()) {
    EndWithError(output, kMissingArrayOrFlag);
    return;
  }
  std::vector<KiroFaultArrayEntry> table(arrayIds.size());
  for (std::size_t i = 0; i < arrayIds.size(); ++i) {
    table[i].arrayId = arrayIds[i].c_str();
    table[i].isActive = flags[i];
  }

  // Without the provider's URL the daemon cannot be told which connection to
  // fault, so a failed or empty lookup ends the command.
  std::string url;
  try {
    if (!LookUpStoredProviderUrl(storageInfo, name, url)) {
      EndWithUnknownProvider(output, kUnknownProviderPrefix, name);
      return;
    }
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, kLookupFailedPrefix + e.GetMessage(false));
    return;
  }

  const TarnLib_Status result = TarnLib_VendorProviderInjectFault(
      name.c_str(), url.c_str(), status.c_str(), static_cast<int32_t>(table.size()), table.data());
  if (result == TARNLIB_OK) {
    std::ostringstream text;
    text << kInjectedPrefix << name << std::endl;
    EndWithText(output, text.str());
    return;
  }
  std::ostringstream text;
  text << kDaemonFailedPrefix << name << kDaemonErrorInfix << TarnLib_Err2String(result);
  EndWithError(output, text.str());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
