#include "VendorProviderSet.h"

#include <sstream>
#include <string>
#include <vector>

#include "CommandEndings.h"
#include "CommandSpecs.h"
#include "HostCtl/Lib.h"
#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"
#include "ParameterNames.h"
#include "ProviderArrays.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;
using HostCtl::Storage::VendorProviderInfo;

namespace {

constexpr char kDescription[] = "Update an existing Kiro Provider on the host.";
constexpr char kCannotUpdatePrefix[] = "Cannot Update VP as : ";
constexpr char kDoesNotExistSuffix[] = " does not exist";
constexpr char kUpdatedPrefix[] = "Successfully Updated VP with name : ";
constexpr char kFailedPrefix[] = "Failed to update VP";

void EndWithUnknownProvider(const OutputPtr& output, const std::string& name) {
  std::ostringstream text;
  text << kCannotUpdatePrefix << name << kDoesNotExistSuffix << std::endl;
  EndWithError(output, text.str());
}

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
    EndWithUnknownProvider(output, name);
    return;
  }
  std::vector<HostCtl::Storage::RelatedStorageArrayInfo> arrays;
  std::string error;
  if (!ReadProviderArrays(*input, arrays, error)) {
    EndWithError(output, error);
    return;
  }

  try {
    std::vector<VendorProviderInfo> known;
    storageInfo.GetTarnVendorProviders(name, known);
    // The provider went away since the existence test: there is no URL to keep.
    if (known.empty()) {
      EndWithUnknownProvider(output, name);
      return;
    }
    const std::vector<VendorProviderInfo> providers(
        1, MakeProviderRecord(name, known.front().url, arrays));
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
