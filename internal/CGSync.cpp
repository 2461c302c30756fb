#include "CGSync.h"

#include "CommandSpecs.h"
#include "GroupListing.h"
#include "SharedParameters.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "Sync Consistency Group IDs.";
constexpr char kSource[] = "internal/CGSync";
constexpr int kInitLine = 52;

}  // namespace

boost::shared_ptr<CGSync> CGSync::New() { return boost::shared_ptr<CGSync>(new CGSync()); }

CGSync::CGSync() {
  SetDescription(kDescription);
  SetDefaultOutputFormatter(kSimpleFormatter);
  SetDefaultOutputParameter("header:CgSync", "%CgId%");
  SetDefaultOutputParameter("fields:CGSync", "CgId,RpId,TimeStamp,Warning,Error");
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

CGSync::~CGSync() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> CGSync::GetInputSpecInternal() {
  return DeclareCgListParameters("Name of the VP which Host is registered.");
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> CGSync::GetOutputSpecInternal() {
  return DeclareResult(MetaList::New(MetaType::Struct, GetOutputStructure()));
}

boost::shared_ptr<Fendle::MetaObj::MetaStruct> CGSync::GetOutputStructure() {
  return NewTextStruct("CGSync", {"CgId", "RpId", "TimeStamp", "Warning", "Error"});
}

void CGSync::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                             const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  ExecuteGroupListing(*input, output, GetOutputStructure());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
