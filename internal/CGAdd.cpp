#include "CGAdd.h"

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Add the TarnIds to Consistency Group";
constexpr char kSource[] = "internal/CGAdd";
constexpr int kInitLine = 35;

}  // namespace

boost::shared_ptr<CGAdd> CGAdd::New() { return boost::shared_ptr<CGAdd>(new CGAdd()); }

CGAdd::CGAdd() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

CGAdd::~CGAdd() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> CGAdd::GetInputSpecInternal() {
  return DeclareParameters({
      {kCgId, "c", ParameterType::String, kRequired,
       "Consistency Group ID to which tarns are to be added"},
      {kTarnIds, "v", ParameterType::StringList, kRequired, "List of TarnIDs."},
      {kVpName, "n", ParameterType::String, kRequired,
       "Name of the VP which the Hyra is registered to."},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> CGAdd::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void CGAdd::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                            const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  // Read but not used yet: no library answers group requests.
  input->GetString(kCgId);
  input->GetStringList(kTarnIds);
  input->GetString(kVpName);
  EndWithTrue(output);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
