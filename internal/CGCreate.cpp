#include "CGCreate.h"

#include <string>
#include <vector>

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/GroupListing.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Create a Consistency Group.";
constexpr char kSource[] = "internal/CGCreate";
constexpr int kInitLine = 47;
constexpr char kRowStructure[] = "CGCreate";
// The hint shows the fields in another order than the structure holds them.
const FieldNames kRowFields = {
    "Name", "Description", "Id", "DestinationArrayId", "FailoverArrayId", "SourceArrayId", "State"};

}  // namespace

boost::shared_ptr<CGCreate> CGCreate::New() { return boost::shared_ptr<CGCreate>(new CGCreate()); }

CGCreate::CGCreate() {
  SetDescription(kDescription);
  SetDefaultOutputFormatter(kTableFormatter);
  SetDefaultOutputParameter(FieldsHintKey(kRowStructure), JoinFieldNames(kRowFields));
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

CGCreate::~CGCreate() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> CGCreate::GetInputSpecInternal() {
  return DeclareParameters({
      {kName, "n", ParameterType::String, kRequired, "Consistency Group Name"},
      {kDesc, "d", ParameterType::String, kRequired, "Consistency Group Description"},
      {kProfile, "p", ParameterType::String, kRequired, "Profile ID as advertised by VP"},
      {kVpName, "v", ParameterType::String, kRequired,
       "Name of the VP which Hyra host is registered to"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> CGCreate::GetOutputSpecInternal() {
  return DeclareResult(GetOutputStructure());
}

boost::shared_ptr<Fendle::MetaObj::MetaStruct> CGCreate::GetOutputStructure() {
  return NewTextStruct(kRowStructure, kRowFields);
}

void CGCreate::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                               const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  // Read but not used yet: no library answers group requests.
  input->GetString(kName);
  input->GetString(kDesc);
  input->GetString(kProfile);
  input->GetString(kVpName);
  const TryInvocationBracket bracket;
  if (!bracket.IsOpen()) {
    EndWithError(output, kFailedToInitializeTarnLib);
    return;
  }
  // A fresh structure holds an empty text in every field.
  EndWithResult(output, GetOutputStructure());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
