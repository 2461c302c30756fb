#include "LoadResult.h"

#include <string>
#include <vector>

namespace Bench {
namespace {

using namespace Fendle::MetaObj;

boost::shared_ptr<MetaStruct> ArrayPrototype() {
  auto array = MetaStruct::New("Array");
  for (const char* field : {"ArrayId", "Array Name", "Vendor Id", "Model Id"}) {
    array->SetField(field, MetaString::New());
  }
  array->SetField("PEInfo", MetaList::New(MetaType::String));
  return array;
}

boost::shared_ptr<MetaStruct> RowPrototype() {
  auto row = MetaStruct::New("StorageContainer");
  row->SetField("StorageContainer Name", MetaString::New());
  row->SetField("StorageContainer Id", MetaString::New());
  row->SetField("Max Tarn Size (MB)", MetaInt::New());
  row->SetField("VP URL", MetaString::New());
  row->SetField("Arrays", MetaList::New(MetaType::Struct, ArrayPrototype()));
  return row;
}

}  // namespace

boost::shared_ptr<MetaList> LoadResult(int rows) {
  auto list = MetaList::New(MetaType::Struct, RowPrototype());
  for (int n = 0; n < rows; ++n) {
    auto row = RowPrototype();
    row->SetField("StorageContainer Name", "ds" + std::to_string(n));
    row->SetField("StorageContainer Id",
                  "6f1c2f4e-8d3b-4c1a-9e2f-" + std::to_string(100000000000 + n));
    row->SetField("Max Tarn Size (MB)", int64_t{2097152});
    row->SetField("VP URL", "https://vp1.example.test:8443/kiro");
    auto arrays = MetaList::New(MetaType::Struct, ArrayPrototype());
    for (const char* id : {"array-x", "array-y"}) {
      auto array = ArrayPrototype();
      array->SetField("ArrayId", id);
      array->SetField("Array Name", std::string("Array ") + id);
      array->SetField("Vendor Id", "ACME");
      array->SetField("Model Id", "M100");
      std::vector<std::string> endpoints;
      for (int pe = 0; pe < 4; ++pe) {
        endpoints.push_back(
            "PE #" + std::to_string(pe) + " (localUID: pe-" + id + std::to_string(pe) +
            ", isAccessible: 1, isConfigured: 1, type: NFS, ipAddress: 192.0.2." +
            std::to_string(pe) + ", serverMount: /exports/x" + std::to_string(pe) + ")");
      }
      array->SetField("PEInfo", endpoints);
      arrays->Append(array);
    }
    row->SetField("Arrays", arrays);
    list->Append(row);
  }
  return list;
}

Fendle::Format::FormatHints LoadHints(const boost::shared_ptr<MetaList>& result) {
  return Fendle::Format::FormatHints(
      {{"header:StorageContainer", "%StorageContainer Name%"},
       {"header:Array", "%ArrayId%"},
       {"table-columns",
        "StorageContainer Name,StorageContainer Id,Max Tarn Size (MB),VP URL,Arrays"}},
      result);
}

}  // namespace Bench
