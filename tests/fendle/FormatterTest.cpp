#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <sstream>

#include "fendle/Formatter.h"

namespace {

using namespace Fendle::MetaObj;
using Fendle::Format::CreateFormatter;
using Fendle::Format::FormatHints;

typedef FormatHints::Pairs Pairs;

std::string Render(const std::string& formatter, const boost::shared_ptr<MetaObject>& result,
                   const Pairs& hints = Pairs(),
                   const boost::shared_ptr<MetaObject>& prototype = {}) {
  std::ostringstream out;
  CreateFormatter(formatter)->Render(result, FormatHints(hints, prototype), out);
  return out.str();
}

boost::shared_ptr<MetaStruct> Array(const std::string& id, const std::vector<std::string>& pes) {
  boost::shared_ptr<MetaStruct> array = MetaStruct::New("Array");
  array->SetField("ArrayId", id);
  array->SetField("Name", "array " + id);
  array->SetField("PEInfo", pes);
  return array;
}

boost::shared_ptr<MetaStruct> Container(const std::string& name, int64_t size,
                                        const std::vector<std::string>& arrayIds) {
  boost::shared_ptr<MetaStruct> row = MetaStruct::New("StorageContainer");
  row->SetField("StorageContainer Name", name);
  row->SetField("Max Tarn Size (MB)", size);
  boost::shared_ptr<MetaList> arrays = MetaList::New(MetaType::Struct);
  for (const std::string& id : arrayIds) arrays->Append(Array(id, {"pe " + id}));
  row->SetField("Arrays", arrays);
  return row;
}

boost::shared_ptr<MetaList> Strings(const std::vector<std::string>& texts) {
  boost::shared_ptr<MetaList> list = MetaList::New(MetaType::String);
  for (const std::string& text : texts) list->Append(MetaString::New(text));
  return list;
}

TEST(FormatterTest, ScalarsAndPlainListsPrintAsLinesInSimpleAndTable) {
  const struct {
    boost::shared_ptr<MetaObject> value;
    std::string expected;
  } cases[] = {
      {MetaString::New("done"), "done\n"},   {MetaString::New("two\nlines\n"), "two\nlines\n"},
      {MetaString::New(""), "\n"},           {MetaBool::New(true), "true\n"},
      {MetaBool::New(), "false\n"},          {MetaInt::New(-3), "-3\n"},
      {Strings({"a", "b"}), "a\nb\n"},       {Strings({}), ""},
      {boost::shared_ptr<MetaObject>(), ""},
  };
  for (const char* formatter : {"simple", "table"}) {
    for (const auto& c : cases) {
      EXPECT_EQ(Render(formatter, c.value), c.expected) << formatter;
    }
  }
  EXPECT_FALSE(CreateFormatter("xml"));
  EXPECT_FALSE(CreateFormatter(""));
}

TEST(SimpleFormatterTest, RecordsAreHeadedByTheHintAndNestedValuesIndent) {
  const Pairs hints = {{"header:StorageContainer", "%StorageContainer Name%"},
                       {"header:Array", "[%ArrayId%] 100%% %Name"}};
  boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct);
  boost::shared_ptr<MetaStruct> first = Container("ds1", 10240, {"A1", "A2"});
  boost::dynamic_pointer_cast<MetaList>(first->GetField("Arrays"))
      ->Append(Array("A3", {"pe one", "pe two"}));
  rows->Append(first);
  rows->Append(Container("", 0, {}));

  EXPECT_EQ(Render("simple", rows, hints),
            "ds1\n"
            "  StorageContainer Name: ds1\n"
            "  Max Tarn Size (MB): 10240\n"
            "  Arrays:\n"
            "    [A1] 100% %Name\n"
            "      ArrayId: A1\n"
            "      Name: array A1\n"
            "      PEInfo:\n"
            "        pe A1\n"
            "    [A2] 100% %Name\n"
            "      ArrayId: A2\n"
            "      Name: array A2\n"
            "      PEInfo:\n"
            "        pe A2\n"
            "    [A3] 100% %Name\n"
            "      ArrayId: A3\n"
            "      Name: array A3\n"
            "      PEInfo:\n"
            "        pe one\n"
            "        pe two\n"
            // An empty heading value falls back to the structure name.
            "StorageContainer\n"
            "  StorageContainer Name:\n"
            "  Max Tarn Size (MB): 0\n"
            "  Arrays:\n");
}

TEST(SimpleFormatterTest, FieldsHintChoosesAndOrdersFieldsAndUnitsFollowValues) {
  boost::shared_ptr<MetaStruct> info = MetaStruct::New("TarnInfoInternal");
  info->SetField("Tarn UUID", "u1");
  info->SetField("Container Id", "c1");
  info->SetField("Logical Size", static_cast<int64_t>(10240));
  info->SetField("Unshared Size", static_cast<int64_t>(7));
  info->SetField("Unshared Size Valid", MetaBool::New(false));
  info->SetField("Storage Profile", "gold\nfast\n");
  const Pairs hints = {
      {"units:TarnInfoInternal.Logical Size", "MB"},
      {"units:TarnInfoInternal.Unshared Size", "MB"},
      {"units:Other.Tarn UUID", "GB"},
      {"fields:TarnInfoInternal",
       "Container Id,Tarn UUID,Logical Size,Nothing,Unshared Size Valid,Storage Profile"}};

  EXPECT_EQ(Render("simple", info, hints),
            "TarnInfoInternal\n"
            "  Container Id: c1\n"
            "  Tarn UUID: u1\n"
            "  Logical Size: 10240 MB\n"
            "  Unshared Size Valid: false\n"
            "  Storage Profile: gold\n"
            "    fast\n");
}

TEST(TableFormatterTest, FieldsHintOrdersTheColumns) {
  boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct);
  for (auto pair :
       {std::make_pair("t1", "accessible"), std::make_pair("tarn-22", "non-existent")}) {
    boost::shared_ptr<MetaStruct> row = MetaStruct::New("TarnsAreAccessible");
    row->SetField("TarnId", pair.first);
    row->SetField("Status", pair.second);
    rows->Append(row);
  }
  EXPECT_EQ(Render("table", rows, {{"fields:TarnsAreAccessible", "Status,TarnId"}}),
            "Status        TarnId\n"
            "------------  -------\n"
            "accessible    t1\n"
            "non-existent  tarn-22\n");
}

TEST(TableFormatterTest, TableColumnsHintWithUnitsNestedHeadingsAndWideCharacters) {
  boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct);
  rows->Append(Container("ds1", 10240, {"A1", "A2"}));
  rows->Append(Container("d\xC3\xA4t\xC3\xA4", 0, {}));
  const Pairs hints = {{"header:Array", "%ArrayId%"},
                       {"units:StorageContainer.Max Tarn Size (MB)", "MB"},
                       {"table-columns", "StorageContainer Name,Max Tarn Size (MB),Arrays"}};
  EXPECT_EQ(Render("table", rows, hints),
            "StorageContainer Name  Max Tarn Size (MB)  Arrays\n"
            "---------------------  ------------------  ------\n"
            "ds1                    10240 MB            A1, A2\n"
            "d\xC3\xA4t\xC3\xA4                   0 MB\n");
}

TEST(TableFormatterTest, PrototypeGivesTheColumnsAndNestedValuesStayOnOneLine) {
  boost::shared_ptr<MetaStruct> prototype = MetaStruct::New("Row");
  prototype->SetField("Id", "");
  prototype->SetField("Info", MetaList::New(MetaType::Struct, MetaStruct::New("Info")));
  prototype->SetField("Tags", std::vector<std::string>());
  boost::shared_ptr<MetaObject> declared = MetaList::New(MetaType::Struct, prototype);

  boost::shared_ptr<MetaStruct> info = MetaStruct::New("Info");
  info->SetField("K", static_cast<int64_t>(1));
  info->SetField("L", "w");
  boost::shared_ptr<MetaStruct> row = MetaStruct::New("Row");
  row->SetField("Tags", std::vector<std::string>{"x", "y"});
  row->SetField("Id", "r1");
  boost::shared_ptr<MetaList> infos = MetaList::New(MetaType::Struct);
  infos->Append(info);
  row->SetField("Info", infos);
  boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct);
  rows->Append(row);

  EXPECT_EQ(Render("table", rows, {}, declared),
            "Id  Info          Tags\n"
            "--  ------------  ----\n"
            "r1  {K: 1, L: w}  x, y\n");
  EXPECT_EQ(Render("table", MetaList::New(MetaType::Struct), {}, declared),
            "Id  Info  Tags\n"
            "--  ----  ----\n");

  boost::shared_ptr<MetaStruct> single = MetaStruct::New("S");
  single->SetField("Name", "a\nb\n");
  single->SetField("N", static_cast<int64_t>(5));
  EXPECT_EQ(Render("table", single), "Name  N\n----  -\na b   5\n");
}

TEST(JsonFormatterTest, StructsFollowTheDisplayOrderAndTextsKeepTheirLineFeeds) {
  boost::shared_ptr<MetaStruct> row = MetaStruct::New("R");
  row->SetField("A", static_cast<int64_t>(5));
  row->SetField("B", "text\n");
  row->SetField("C", MetaBool::New(true));
  EXPECT_EQ(Render("json", row, {{"fields:R", "B,A"}, {"units:R.A", "MB"}}),
            "{\n  \"B\": \"text\\n\",\n  \"A\": 5\n}\n");

  EXPECT_EQ(Render("json", MetaBool::New(true)), "true\n");
  EXPECT_EQ(Render("json", MetaString::New("a\n")), "\"a\\n\"\n");
  EXPECT_EQ(Render("json", MetaInt::New(INT64_MIN)), "-9223372036854775808\n");
  EXPECT_EQ(Render("json", MetaList::New(MetaType::Struct)), "[]\n");

  boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct);
  rows->Append(Container("ds1", 1, {"A1"}));
  nlohmann::ordered_json parsed = nlohmann::ordered_json::parse(Render("json", rows));
  EXPECT_EQ(parsed.dump(),
            "[{\"StorageContainer Name\":\"ds1\",\"Max Tarn Size (MB)\":1,\"Arrays\":"
            "[{\"ArrayId\":\"A1\",\"Name\":\"array A1\",\"PEInfo\":[\"pe A1\"]}]}]");
}

TEST(JsonFormatterTest, BytesThatAreNotUtf8BecomeReplacementCharacters) {
  boost::shared_ptr<MetaStruct> row = MetaStruct::New("R");
  row->SetField("Na\xFFme", "ab\xFF\xFE\n");
  row->SetField("Ok", "\xC3\xA4");
  std::string out = Render("json", row);
  ASSERT_FALSE(out.empty());
  EXPECT_EQ(out.back(), '\n');
  nlohmann::json parsed;
  ASSERT_NO_THROW(parsed = nlohmann::json::parse(out));
  EXPECT_EQ(parsed["Na\xEF\xBF\xBDme"], "ab\xEF\xBF\xBD\xEF\xBF\xBD\n");
  EXPECT_EQ(parsed["Ok"], "\xC3\xA4");
}

}  // namespace
