#include "CGCreate.h"

#include <string>
#include <vector>

#include "CommandEndings.h"
#include "CommandSpecs.h"
#include "GroupListing.h"
#include "ParameterNames.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Create a Consistency Group.";
constexpr char kSource[] = "internal/CGCreate";
constexpr int kInitLine = 47;

}  // namespace

boost::shared_ptr<CGCreate> CGCreate::New() { return boost::shared_ptr<CGCreate>(new CGCreate()); }

CGCreate::CGCreate() {
  SetDescription(kDescription);
  SetDefaultOutputFormatter(kTableFormatter);
  SetDefaultOutputParameter(
      "fields:CGCreate",
      "Name,Description,Id,DestinationArrayId,FailoverArrayId,SourceArrayId,State");
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
  return NewTextStruct("CGCreate", {"Name", "Description", "Id", "DestinationArrayId",
                                    "FailoverArrayId", "SourceArrayId", "State"});
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
  const boost::shared_ptr<Fendle::MetaObj::MetaStruct> row = GetOutputStructure();
  std::vector<std::string> fields;
  for (const auto& field : row->GetFields()) fields.push_back(field.first);
  for (const std::string& field : fields) row->SetField(field, std::string());
  EndWithResult(output, row);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
