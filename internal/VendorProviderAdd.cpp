#include "VendorProviderAdd.h"

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

constexpr char kDescription[] = "Add a new Kiro Provider on the host.";
constexpr char kEmptyName[] = "Empty VP Name not allowed.";
constexpr char kCannotAddPrefix[] = "Cannot Add VP as : ";
constexpr char kAlreadyExistsSuffix[] = " already exists";
constexpr char kAddedPrefix[] = "Succesfully Added VP with name : ";
constexpr char kFailedPrefix[] = "Failed to add VP: ";

}  // namespace

boost::shared_ptr<VendorProviderAdd> VendorProviderAdd::New() {
  return boost::shared_ptr<VendorProviderAdd>(new VendorProviderAdd());
}

VendorProviderAdd::VendorProviderAdd() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> VendorProviderAdd::GetInputSpecInternal() {
  return DeclareParameters({
      {kVpName, "v", ParameterType::String, kRequired, "Kiro Provider Name"},
      {kVpUrl, "U", ParameterType::String, kRequired, "VP URL"},
      {kArrayId, "a", ParameterType::StringList, kOptional, "Array Id"},
      {kPriority, "p", ParameterType::IntList, kOptional, "Priority"},
      {kIsActive, "i", ParameterType::BoolList, kOptional, "Is Active"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VendorProviderAdd::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaString::New());
}

void VendorProviderAdd::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                                        const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  const std::string url = input->GetString(kVpUrl);
  const std::string name = input->GetString(kVpName);
  OskCtl::Storage::StorageInfoImpl storageInfo;

  if (name.empty()) {
    EndWithError(output, kEmptyName);
    return;
  }
  if (storageInfo.TarnVpExists(name)) {
    std::ostringstream text;
    text << kCannotAddPrefix << name << kAlreadyExistsSuffix << std::endl;
    EndWithError(output, text.str());
    return;
  }
  std::vector<HostCtl::Storage::RelatedStorageArrayInfo> arrays;
  std::string error;
  if (!ReadProviderArrays(*input, arrays, error)) {
    EndWithError(output, error);
    return;
  }

  try {
    std::vector<VendorProviderInfo> providers(1, MakeProviderRecord(name, url, arrays));
    storageInfo.UpdateTarnVendorProvider(providers);
    // A provider stored without arrays is stored once more as the host now
    // holds it.
    if (arrays.empty()) {
      providers.clear();
      storageInfo.GetTarnVendorProviders(name, providers);
      storageInfo.UpdateTarnVendorProvider(providers);
    }
    std::ostringstream text;
    text << kAddedPrefix << name << std::endl;
    EndWithText(output, text.str());
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, kFailedPrefix + e.GetMessage(false));
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
