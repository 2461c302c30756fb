// Measures what a large result costs: builds the result of a load of N
// containers (two arrays of four endpoints each, as the plug-in builds it),
// reports the heap its values take, then renders it to standard output with
// the formatter named. Run under /usr/bin/time -v to see the peak beside the
// output's size:
//
//   render_memory_probe FORMATTER [ROWS] [--buffered] > out
//
// --buffered renders into a string first and writes that, as the tool once
// did, for comparison.
#include <malloc.h>

#include <cstring>
#include <iostream>
#include <sstream>
#include <string>

#include "fendle/Formatter.h"

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

}  // namespace

int main(int argc, char** argv) {
  if (argc < 2) {
    std::cerr << "usage: render_memory_probe FORMATTER [ROWS] [--buffered]\n";
    return 2;
  }
  const int rows = argc > 2 && argv[2][0] != '-' ? std::stoi(argv[2]) : 10000;
  const bool buffered = std::strcmp(argv[argc - 1], "--buffered") == 0;
  const std::size_t before = mallinfo2().uordblks;
  const boost::shared_ptr<MetaList> result = LoadResult(rows);
  const std::size_t tree = mallinfo2().uordblks - before;
  const Fendle::Format::FormatHints hints(
      {{"header:StorageContainer", "%StorageContainer Name%"},
       {"header:Array", "%ArrayId%"},
       {"table-columns",
        "StorageContainer Name,StorageContainer Id,Max Tarn Size (MB),VP URL,Arrays"}},
      result);
  auto formatter = Fendle::Format::CreateFormatter(argv[1]);
  if (!formatter) return 2;
  if (buffered) {
    std::ostringstream text;
    formatter->Render(result, hints, text);
    std::cout << text.str();
  } else {
    formatter->Render(result, hints, std::cout);
  }
  std::cout.flush();
  std::cerr << rows << " rows: values take " << tree << " bytes of heap (" << tree / rows
            << " per row)\n";
  return std::cout ? 0 : 1;
}
