#include "VendorProviderSet.h"

#include <sstream>
#include <string>
#include <vector>

#include "HostCtl/Lib.h"
#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/ProviderArrays.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;
using HostCtl::Storage::VendorProviderInfo;

namespace {

constexpr char kDescription[] = "Update an existing Kiro Provider on the host.";
constexpr char kCannotUpdatePrefix[] = "Cannot Update VP as : ";
constexpr char kUpdatedPrefix[] = "Successfully Updated VP with name : ";
constexpr char kFailedPrefix[] = "Failed to update VP";

}  // namespace

boost::shared_ptr<VendorProviderSet> VendorProviderSet::New() {
  return boost::shared_ptr<VendorProviderSet>(new VendorProviderSet());
}

VendorProviderSet::VendorProviderSet() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> VendorProviderSet::GetInputSpecInternal() {
  return DeclareParameters({
      {kVpName, "v", ParameterType::String, kRequired, "Kiro Provider Name"},
      {kArrayId, "a", ParameterType::StringList, kOptional, "Array Id"},
      {kPriority, "p", ParameterType::IntList, kOptional,
       "Priority(integer). Should be specified with arrayId"},
      {kIsActive, "i", ParameterType::BoolList, kOptional,
       "IsActive(Boolean value). Should be specified with arrayId"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VendorProviderSet::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaString::New());
}

void VendorProviderSet::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                                        const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  const std::string name = input->GetString(kVpName);

  if (!storageInfo.TarnVpExists(name)) {
    EndWithUnknownProvider(output, kCannotUpdatePrefix, name);
    return;
  }
  std::vector<HostCtl::Storage::RelatedStorageArrayInfo> arrays;
  std::string error;
  if (!ReadProviderArrays(*input, arrays, error)) {
    EndWithError(output, error);
    return;
  }

  try {
    std::string url;
    // The provider went away since the existence test: there is no URL to keep.
    if (!LookUpStoredProviderUrl(storageInfo, name, url)) {
      EndWithUnknownProvider(output, kCannotUpdatePrefix, name);
      return;
    }
    const std::vector<VendorProviderInfo> providers(1, MakeProviderRecord(name, url, arrays));
    storageInfo.UpdateTarnVendorProvider(providers);
    std::ostringstream text;
    text << kUpdatedPrefix << name << std::endl;
    EndWithText(output, text.str());
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, kFailedPrefix + e.GetMessage(false));
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
