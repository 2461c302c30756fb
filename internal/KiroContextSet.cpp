#include "KiroContextSet.h"

#include <string>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Set the Tarn Kiro context (ZM UUID) on the host.";
constexpr char kFailurePrefix[] = "Failed to update host Kiro context Uuid: ";
constexpr char kExactlyOne[] = "Exactly one of --clear or --uuid must be specified!";
constexpr char kEmptyUuid[] = "--uuid requires a parameter";

}  // namespace

boost::shared_ptr<KiroContextSet> KiroContextSet::New() {
  return boost::shared_ptr<KiroContextSet>(new KiroContextSet());
}

KiroContextSet::KiroContextSet() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> KiroContextSet::GetInputSpecInternal() {
  return DeclareParameters({
      {kUuid, "u", ParameterType::String, kOptional,
       "The ZM UUID for the Tarn Kiro context you wish to configure on the host"},
      {kClear, "c", ParameterType::Flag, kOptional, "Clear the Tarn Kiro context for the host"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> KiroContextSet::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void KiroContextSet::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                                     const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  using OskCtl::Storage::TarnFileSystemImpl;
  // Invalid input is thrown as a host failure so that one handler words and
  // ends every failure alike.
  try {
    const bool clear = input->GetFlag(kClear);
    const bool uuidGiven = input->IsSet(kUuid);
    if (clear == uuidGiven) {
      throw HostCtl::Lib::HostCtlException(kExactlyOne, HostCtl::Lib::KelmMessage());
    }
    if (input->GetFlag(kClear)) {
      TarnFileSystemImpl::ClearKiroContext();
    } else {
      const std::string uuid = input->GetString(kUuid);
      if (uuid.empty()) {
        throw HostCtl::Lib::HostCtlException(kEmptyUuid, HostCtl::Lib::KelmMessage());
      }
      TarnFileSystemImpl::SetKiroContext(uuid);
    }
    output->SetResult(Fendle::MetaObj::MetaBool::New(true));
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithErrorAndFalse(output, kFailurePrefix + e.GetMessage(false));
  }
  output->Finish();
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
