#include "CGDelete.h"

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Delete the Consistency Group";
constexpr char kSource[] = "internal/CGDelete";
constexpr int kInitLine = 37;

}  // namespace

boost::shared_ptr<CGDelete> CGDelete::New() { return boost::shared_ptr<CGDelete>(new CGDelete()); }

CGDelete::CGDelete() {
  SetDescription(kDescription);
  SetDefaultOutputFormatter(kSimpleFormatter);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

CGDelete::~CGDelete() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> CGDelete::GetInputSpecInternal() {
  return DeclareParameters({
      {kCgId, "c", ParameterType::String, kRequired, "ID of Consistency Group to be deleted"},
      {kVpName, "v", ParameterType::String, kRequired, "Name of the VP"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> CGDelete::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void CGDelete::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                               const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  // Read but not used yet: no library answers group requests.
  input->GetString(kCgId);
  input->GetString(kVpName);
  EndWithTrue(output);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
