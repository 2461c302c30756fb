#include <gtest/gtest.h>

#include <sstream>

#include "fendle/Formatter.h"

namespace {

using namespace Fendle::MetaObj;
using Fendle::Format::FormatHints;
using Value = boost::shared_ptr<MetaObject>;

std::string Render(const std::string& formatter, const Value& result,
                   const FormatHints::Pairs& hints = {}, const Value& prototype = nullptr) {
  std::ostringstream out;
  Fendle::Format::CreateFormatter(formatter)->Render(result, FormatHints(hints, prototype), out);
  return out.str();
}

boost::shared_ptr<MetaList> List(MetaType type, const std::vector<Value>& elements,
                                 const Value& prototype = nullptr) {
  auto list = MetaList::New(type, prototype);
  for (const Value& element : elements) list->Append(element);
  return list;
}

boost::shared_ptr<MetaStruct> Container(const std::string& name, int64_t size,
                                        const std::vector<std::string>& arrayIds) {
  auto row = MetaStruct::New("StorageContainer");
  row->SetField("StorageContainer Name", name);
  row->SetField("Max Tarn Size (MB)", size);
  std::vector<Value> arrays;
  for (const std::string& id : arrayIds) {
    auto array = MetaStruct::New("Array");
    array->SetField("ArrayId", id);
    array->SetField("PEInfo", std::vector<std::string>{"pe " + id, "pe 2"});
    arrays.push_back(array);
  }
  row->SetField("Arrays", List(MetaType::Struct, arrays));
  return row;
}

TEST(FormatterTest, ScalarsAndPlainListsPrintAsLinesInSimpleAndTable) {
  const std::pair<Value, std::string> cases[] = {
      {MetaString::New("done"), "done\n"},
      {MetaString::New("two\nlines\n"), "two\nlines\n"},
      {MetaString::New(""), "\n"},
      {MetaBool::New(true), "true\n"},
      {MetaBool::New(), "false\n"},
      {MetaInt::New(-3), "-3\n"},
      {List(MetaType::String, {}), ""},
      {nullptr, ""},
      {List(MetaType::String, {MetaString::New("a"), MetaInt::New(2)}), "a\n2\n"},
  };
  for (const char* formatter : {"simple", "table"}) {
    for (const auto& c : cases) EXPECT_EQ(Render(formatter, c.first), c.second) << formatter;
  }
  EXPECT_FALSE(Fendle::Format::CreateFormatter("yaml"));
  EXPECT_TRUE(Fendle::Format::CreateFormatter("KeyValue"));
}

TEST(SimpleFormatterTest, RecordsAreHeadedByTheHintAndNestedValuesIndent) {
  auto rows = List(MetaType::Struct, {Container("ds1", 10240, {"A1"}), Container("", 0, {})});
  EXPECT_EQ(Render("simple", rows,
                   {{"header:StorageContainer", "%StorageContainer Name%"},
                    {"header:Array", "[%ArrayId%] 100%% %Name"}}),
            "ds1\n"
            "  StorageContainer Name: ds1\n"
            "  Max Tarn Size (MB): 10240\n"
            "  Arrays:\n"
            "    [A1] 100% %Name\n"
            "      ArrayId: A1\n"
            "      PEInfo:\n"
            "        pe A1\n"
            "        pe 2\n"
            // An empty heading falls back to the structure name.
            "StorageContainer\n"
            "  StorageContainer Name:\n"
            "  Max Tarn Size (MB): 0\n"
            "  Arrays:\n");
}

TEST(SimpleFormatterTest, FieldsHintChoosesAndOrdersFieldsAndUnitsFollowValues) {
  auto info = MetaStruct::New("TarnInfoInternal");
  info->SetField("Tarn UUID", "u1");
  info->SetField("Container Id", "c1");
  info->SetField("Logical Size", int64_t{10240});
  info->SetField("Unshared Size Valid", MetaBool::New(false));
  info->SetField("Storage Profile", "gold\nfast\n");
  EXPECT_EQ(Render("simple", info,
                   {{"units:TarnInfoInternal.Logical Size", "MB"},
                    {"units:Other.Tarn UUID", "GB"},
                    {"fields:TarnInfoInternal",
                     "Container Id,Tarn UUID,Nothing,Logical Size,Storage Profile"}}),
            "TarnInfoInternal\n  Container Id: c1\n  Tarn UUID: u1\n  Logical Size: 10240 MB\n"
            "  Storage Profile: gold\n    fast\n");
}

TEST(TableFormatterTest, ColumnsComeFromFieldsHintThenTableColumnsThenPrototype) {
  auto rows = List(MetaType::Struct,
                   {Container("ds1", 10240, {"A1", "A2"}), Container("d\xC3\xA4t\xC3\xA4", 0, {})});
  EXPECT_EQ(Render("table", rows,
                   {{"header:Array", "%ArrayId%"},
                    {"units:StorageContainer.Max Tarn Size (MB)", "MB"},
                    {"table-columns", "StorageContainer Name,Max Tarn Size (MB),Arrays"},
                    {"fields:Other", "Arrays"}}),
            "StorageContainer Name  Max Tarn Size (MB)  Arrays\n"
            "---------------------  ------------------  ------\n"
            "ds1                    10240 MB            A1, A2\n"
            "d\xC3\xA4t\xC3\xA4                   0 MB\n");
  auto prototype = MetaStruct::New("Row");
  prototype->SetField("Id", "");
  prototype->SetField("Note", "");
  auto row = MetaStruct::New("Row");
  row->SetField("Note", "a\nb\n");
  row->SetField("Id", "r1");
  EXPECT_EQ(
      Render("table", List(MetaType::Struct, {row}), {}, List(MetaType::Struct, {}, prototype)),
      "Id  Note\n--  ----\nr1  a b\n");
  EXPECT_EQ(Render("table", List(MetaType::Struct, {}, prototype)), "Id  Note\n--  ----\n");
  EXPECT_EQ(Render("table", row), "Note  Id\n----  --\na b   r1\n");
}

TEST(JsonFormatterTest, StructsFollowTheDisplayOrderAndTextsStayExact) {
  auto row = MetaStruct::New("R");
  row->SetField("A", int64_t{5});
  row->SetField("B", "text\n");
  row->SetField("C", MetaBool::New(true));
  EXPECT_EQ(Render("json", row, {{"fields:R", "B,A"}, {"units:R.A", "MB"}}),
            "{\n  \"B\": \"text\\n\",\n  \"A\": 5\n}\n");
  EXPECT_EQ(Render("json", List(MetaType::Struct, {Container("ds1", 1, {})})),
            "[\n  {\n    \"StorageContainer Name\": \"ds1\",\n    \"Max Tarn Size (MB)\": 1,\n"
            "    \"Arrays\": []\n  }\n]\n");
  EXPECT_EQ(Render("json", MetaBool::New(true)), "true\n");
  EXPECT_EQ(Render("json", MetaInt::New(INT64_MIN)), "-9223372036854775808\n");
  // Bytes that are not UTF-8 become U+FFFD, in keys and values alike.
  auto odd = MetaStruct::New("R");
  odd->SetField("Na\xFFme", "ab\xFF\xFE\n");
  odd->SetField("Ok", "\xC3\xA4");
  EXPECT_EQ(
      Render("json", odd),
      "{\n  \"Na\xEF\xBF\xBDme\": \"ab\xEF\xBF\xBD\xEF\xBF\xBD\\n\",\n  \"Ok\": \"\xC3\xA4\"\n}\n");
}

TEST(FormatterTest, ControlBytesFromTheHostReachTheTerminalEscaped) {
  auto row = MetaStruct::New("R");
  row->SetField("Name", "a\x1B[2Jb\tc\rd\xC2\x9B\xFF\xC3\xA4\x7F");
  EXPECT_EQ(Render("simple", row), "R\n  Name: a\\x1B[2Jb\tc\\x0Dd\\xC2\\x9B\\xFF\xC3\xA4\\x7F\n");
  // In a table a tab would break the columns.
  EXPECT_EQ(Render("table", row), "Name\n" + std::string(36, '-') +
                                      "\n"
                                      "a\\x1B[2Jb\\x09c\\x0Dd\\xC2\\x9B\\xFF\xC3\xA4\\x7F\n");
  EXPECT_EQ(Render("simple", MetaString::New("ok\x07\n")), "ok\\x07\n");
}

}  // namespace
