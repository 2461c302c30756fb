#include "VirtualVolumeGet.h"

#include "CommandEndings.h"
#include "CommandSpecs.h"
#include "SharedParameters.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaBool;
using Fendle::MetaObj::MetaInt;
using Fendle::MetaObj::MetaString;
using Fendle::MetaObj::MetaStruct;

namespace {

constexpr char kDescription[] = "Get information about a Virtual Volume.";
constexpr char kSource[] = "internal/VirtualVolumeGet";
constexpr int kInitLine = 102;

}  // namespace

boost::shared_ptr<VirtualVolumeGet> VirtualVolumeGet::New() {
  return boost::shared_ptr<VirtualVolumeGet>(new VirtualVolumeGet());
}

VirtualVolumeGet::VirtualVolumeGet() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
  SetDefaultOutputParameter("units:TarnInfoInternal.Logical Size", "MB");
  SetDefaultOutputParameter("units:TarnInfoInternal.Committed Size", "MB");
  SetDefaultOutputParameter("units:TarnInfoInternal.Unshared Size", "MB");
  SetDefaultOutputParameter("fields:TarnInfoInternal",
                            "Container Id,Tarn UUID,Logical Size,Committed Size,"
                            "Unshared Size Valid,Unshared Size,Storage Profile,Block Size");
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> VirtualVolumeGet::GetInputSpecInternal() {
  return DeclareVirtualVolumeParameters();
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VirtualVolumeGet::GetOutputSpecInternal() {
  return DeclareResult(GetOutputStructure());
}

boost::shared_ptr<MetaStruct> VirtualVolumeGet::GetOutputStructure() {
  boost::shared_ptr<MetaStruct> info = MetaStruct::New("TarnInfoInternal");
  info->SetField("Tarn UUID", MetaString::New());
  info->SetField("Container Id", MetaString::New());
  info->SetField("Logical Size", MetaInt::New());
  info->SetField("Committed Size", MetaInt::New());
  info->SetField("Unshared Size", MetaInt::New());
  info->SetField("Unshared Size Valid", MetaBool::New());
  info->SetField("Storage Profile", MetaString::New());
  info->SetField("Block Size", MetaInt::New());
  return info;
}

void VirtualVolumeGet::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& /*input*/,
                                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, kInitLine);
  EndWithError(output, kNotImplemented);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
