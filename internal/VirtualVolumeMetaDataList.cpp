#include "VirtualVolumeMetaDataList.h"

#include "CommandEndings.h"
#include "CommandSpecs.h"
#include "SharedParameters.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "List Virtual Volume MetaData.";
constexpr char kSource[] = "internal/VirtualVolumeMetaDataList";
constexpr int kInitLine = 88;

}  // namespace

boost::shared_ptr<VirtualVolumeMetaDataList> VirtualVolumeMetaDataList::New() {
  return boost::shared_ptr<VirtualVolumeMetaDataList>(new VirtualVolumeMetaDataList());
}

VirtualVolumeMetaDataList::VirtualVolumeMetaDataList() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kTableFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> VirtualVolumeMetaDataList::GetInputSpecInternal() {
  return DeclareVirtualVolumeParameters();
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VirtualVolumeMetaDataList::GetOutputSpecInternal() {
  return DeclareResult(MetaList::New(MetaType::Struct, GetOutputStructure()));
}

boost::shared_ptr<Fendle::MetaObj::MetaStruct> VirtualVolumeMetaDataList::GetOutputStructure() {
  return NewTextStruct("TarnMetaData", {"key", "value"});
}

void VirtualVolumeMetaDataList::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& /*input*/,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, kInitLine);
  EndWithError(output, kNotImplemented);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
