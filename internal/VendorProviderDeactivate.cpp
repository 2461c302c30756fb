#include "VendorProviderDeactivate.h"

#include <string>

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Deactivate Kiro Provider for a specified Array.";
constexpr char kSource[] = "internal/VendorProviderDeactivate";
constexpr int kInitLine = 36;
constexpr char kFailurePrefix[] = "TarnLib_DeactivateProvider failed with error ";

}  // namespace

boost::shared_ptr<VendorProviderDeactivate> VendorProviderDeactivate::New() {
  return boost::shared_ptr<VendorProviderDeactivate>(new VendorProviderDeactivate());
}

VendorProviderDeactivate::VendorProviderDeactivate() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

VendorProviderDeactivate::~VendorProviderDeactivate() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> VendorProviderDeactivate::GetInputSpecInternal() {
  return DeclareParameters({
      {kVpName, "n", ParameterType::String, kRequired, "Name of the VP to be deactivated"},
      {kArrayId, "a", ParameterType::String, kRequired, "ID of the Array to be Deactivated"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VendorProviderDeactivate::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void VendorProviderDeactivate::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  const std::string arrayId = input->GetString(kArrayId);
  const std::string name = input->GetString(kVpName);
  EndWithDaemonStatus(output, TarnLib_DeactivateProvider(arrayId.c_str(), name.c_str()),
                      kFailurePrefix);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
