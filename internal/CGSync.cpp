#include "CGSync.h"

#include "TarnLib/TarnLib.h"
#include "support/CommandSpecs.h"
#include "support/GroupListing.h"
#include "support/SharedParameters.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "Sync Consistency Group IDs.";
constexpr char kSource[] = "internal/CGSync";
constexpr int kInitLine = 52;
constexpr char kRowStructure[] = "CGSync";
constexpr char kCgIdField[] = "CgId";
const FieldNames kRowFields = {kCgIdField, "RpId", "TimeStamp", "Warning", "Error"};
// The heading hint is declared for "CgSync", a spelling no structure has, so
// records show the structure name as their heading.
constexpr char kHeadingStructure[] = "CgSync";

}  // namespace

boost::shared_ptr<CGSync> CGSync::New() { return boost::shared_ptr<CGSync>(new CGSync()); }

CGSync::CGSync() {
  SetDescription(kDescription);
  SetDefaultOutputFormatter(kSimpleFormatter);
  SetDefaultOutputParameter(HeaderHintKey(kHeadingStructure), FieldReference(kCgIdField));
  SetDefaultOutputParameter(FieldsHintKey(kRowStructure), JoinFieldNames(kRowFields));
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
  return NewTextStruct(kRowStructure, kRowFields);
}

void CGSync::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                             const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  ExecuteGroupListing(*input, output, GetOutputStructure());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
