#include "VendorProviderRemove.h"

#include <string>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Unregister a Kiro Provider from Hyra host.";
constexpr char kSource[] = "internal/VendorProviderRemove";
constexpr int kInitLine = 35;

}  // namespace

boost::shared_ptr<VendorProviderRemove> VendorProviderRemove::New() {
  return boost::shared_ptr<VendorProviderRemove>(new VendorProviderRemove());
}

VendorProviderRemove::VendorProviderRemove() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

VendorProviderRemove::~VendorProviderRemove() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> VendorProviderRemove::GetInputSpecInternal() {
  return DeclareParameters({
      {kVpName, "v", ParameterType::String, kRequired, "Kiro Provider Name"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VendorProviderRemove::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void VendorProviderRemove::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  const std::string name = input->GetString(kVpName);
  try {
    OskCtl::Storage::TarnFileSystemImpl::UnRegisterVendorProvider(name);
    EndWithTrue(output);
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, e.GetMessage(false));
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
