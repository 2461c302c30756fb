#include "CGList.h"

#include "support/CommandSpecs.h"
#include "support/GroupListing.h"
#include "support/SharedParameters.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "List Consistency Group IDs.";
constexpr char kRowStructure[] = "CGList";
const FieldNames kRowFields = {
    "CgId",  "Name",    "Description", "DestinationArrayId", "FailOverArrayId", "SourceArrayId",
    "State", "Warning", "Error"};

}  // namespace

boost::shared_ptr<CGList> CGList::New() { return boost::shared_ptr<CGList>(new CGList()); }

CGList::CGList() {
  SetDescription(kDescription);
  SetDefaultOutputFormatter(kTableFormatter);
  SetDefaultOutputParameter(FieldsHintKey(kRowStructure), JoinFieldNames(kRowFields));
  SetMetaDataField(kTypeField, kFetcherKind);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> CGList::GetInputSpecInternal() {
  return DeclareCgListParameters("Name of the VP which Hyra is registered.");
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> CGList::GetOutputSpecInternal() {
  return DeclareResult(MetaList::New(MetaType::Struct, GetOutputStructure()));
}

boost::shared_ptr<Fendle::MetaObj::MetaStruct> CGList::GetOutputStructure() {
  return NewTextStruct(kRowStructure, kRowFields);
}

void CGList::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                             const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  ExecuteGroupListing(*input, output, GetOutputStructure());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
