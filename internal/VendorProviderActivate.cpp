#include "VendorProviderActivate.h"

#include <array>
#include <cstdint>
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

constexpr char kDescription[] = "Activate Kiro Provider for a specified Array.";
constexpr char kSource[] = "internal/VendorProviderActivate";
constexpr int kInitLine = 36;
constexpr char kFailurePrefix[] = "TarnLib_ActivateProvider failed with error ";

}  // namespace

boost::shared_ptr<VendorProviderActivate> VendorProviderActivate::New() {
  return boost::shared_ptr<VendorProviderActivate>(new VendorProviderActivate());
}

VendorProviderActivate::VendorProviderActivate() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

VendorProviderActivate::~VendorProviderActivate() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> VendorProviderActivate::GetInputSpecInternal() {
  return DeclareParameters({
      {kVpName, "n", ParameterType::String, kRequired, "Name of the VP to be activated"},
      {kArrayId, "a", ParameterType::String, kRequired, "ID of the Array to be activated"},
      {kActiveVpUrl, "u", ParameterType::String, kOptional, "URL of current active VP."},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VendorProviderActivate::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void VendorProviderActivate::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  const std::string arrayId = input->GetString(kArrayId);
  const std::string name = input->GetString(kVpName);
  const std::string activeUrl = input->GetString(kActiveVpUrl);
  std::array<uint8_t, TARNLIB_ACTIVATION_BLOCK_SIZE> activation{};
  const TarnLib_Status status =
      TarnLib_ActivateProvider(arrayId.c_str(), name.c_str(), activeUrl.c_str(), activation.data());
  EndWithDaemonStatus(output, status, kFailurePrefix);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
