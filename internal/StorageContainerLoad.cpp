#include "StorageContainerLoad.h"

#include "CommandSpecs.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaInt;
using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaString;
using Fendle::MetaObj::MetaStruct;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "Load All the Tarn StorageContainers exported by the VP.";
constexpr char kSource[] = "internal/StorageContainerLoad";
constexpr int kInitLine = 42;

constexpr char kContainerStructure[] = "StorageContainer";
constexpr char kContainerNameField[] = "StorageContainer Name";
constexpr char kContainerIdField[] = "StorageContainer Id";
constexpr char kMaxTarnSizeField[] = "Max Tarn Size (MB)";
constexpr char kVpUrlField[] = "VP URL";
constexpr char kArraysField[] = "Arrays";

constexpr char kArrayStructure[] = "Array";
constexpr char kArrayIdField[] = "ArrayId";
constexpr char kArrayNameField[] = "Name";
constexpr char kVendorIdField[] = "VendorId";
constexpr char kModelIdField[] = "ModelId";
constexpr char kPeInfoField[] = "PEInfo";

}  // namespace

boost::shared_ptr<StorageContainerLoad> StorageContainerLoad::New() {
  return boost::shared_ptr<StorageContainerLoad>(new StorageContainerLoad());
}

StorageContainerLoad::StorageContainerLoad() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
  SetDefaultOutputParameter("header:StorageContainer", "%StorageContainer Name%");
  SetDefaultOutputParameter("header:Array", "%ArrayId%");
  SetDefaultOutputParameter(
      "table-columns",
      "StorageContainer Name,StorageContainer Id,Max Tarn Size (MB),VP URL,Arrays");
  OpenTarnLib(kSource, kInitLine);
}

StorageContainerLoad::~StorageContainerLoad() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> StorageContainerLoad::GetInputSpecInternal() {
  return DeclareParameters({});
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> StorageContainerLoad::GetOutputSpecInternal() {
  return DeclareResult(MetaList::New(MetaType::Struct, GetOutputStructure()));
}

boost::shared_ptr<MetaStruct> StorageContainerLoad::GetOutputStructure() {
  boost::shared_ptr<MetaStruct> row = MetaStruct::New(kContainerStructure);
  row->SetField(kContainerNameField, MetaString::New());
  row->SetField(kContainerIdField, MetaString::New());
  row->SetField(kMaxTarnSizeField, MetaInt::New());
  row->SetField(kVpUrlField, MetaString::New());
  row->SetField(kArraysField, MetaList::New(MetaType::Struct, GetStorageArrayStructure()));
  return row;
}

boost::shared_ptr<MetaStruct> StorageContainerLoad::GetStorageArrayStructure() {
  boost::shared_ptr<MetaStruct> array = MetaStruct::New(kArrayStructure);
  array->SetField(kArrayIdField, MetaString::New());
  array->SetField(kArrayNameField, MetaString::New());
  array->SetField(kVendorIdField, MetaString::New());
  array->SetField(kModelIdField, MetaString::New());
  array->SetField(kPeInfoField, MetaList::New(MetaType::String));
  return array;
}

boost::shared_ptr<MetaList> StorageContainerLoad::GetStorageArrayList(
    const std::vector<SAInfo>& arrays) {
  boost::shared_ptr<MetaList> list = MetaList::New(MetaType::Struct, GetStorageArrayStructure());
  for (const SAInfo& info : arrays) {
    boost::shared_ptr<MetaStruct> array = GetStorageArrayStructure();
    array->SetField(kArrayIdField, info.arrayId);
    array->SetField(kArrayNameField, info.arrayName);
    array->SetField(kVendorIdField, info.vendorId);
    array->SetField(kModelIdField, info.modelId);
    array->SetField(kPeInfoField, info.peInfo);
    list->Append(array);
  }
  return list;
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
