// The formatters for programs, read back by real parsers: Python's json and
// csv modules and xmllint. A formatter that writes something its parser reads
// differently (a lost quote, a raw control byte, a broken UTF-8 sequence) fails.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <random>
#include <sstream>

#include "fendle/Formatter.h"

namespace {

using namespace Fendle::MetaObj;
using Fendle::Format::FormatHints;
using Value = boost::shared_ptr<MetaObject>;
namespace fs = std::filesystem;

std::string Render(const std::string& formatter, const Value& result,
                   const FormatHints::Pairs& hints = {}) {
  std::ostringstream out;
  Fendle::Format::CreateFormatter(formatter)->Render(result, FormatHints(hints, nullptr), out);
  return out.str();
}

class ParsedBackTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (fs::temp_directory_path() / "formatter-test-XXXXXX").string();
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    dir_ = pattern;
  }
  void TearDown() override { fs::remove_all(dir_); }

  // Writes text to a file, runs command on it ({} stands for its path);
  // answers the command's standard output, or "status N" when it failed.
  std::string Through(const std::string& text, const std::string& command) {
    const fs::path input = dir_ / "input", output = dir_ / "output";
    std::ofstream(input, std::ios::binary) << text;
    std::string line = command;
    line.replace(line.find("{}"), 2, "'" + input.string() + "'");
    const int raw = std::system((line + " >'" + output.string() + "' 2>&1").c_str());
    std::stringstream answer;
    answer << std::ifstream(output).rdbuf();
    const int status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
    return status == 0 ? answer.str() : "status " + std::to_string(status) + ": " + answer.str();
  }

  fs::path dir_;
};

// Two containers whose texts hold everything a writer must take care of.
Value HostileRows() {
  auto rows = MetaList::New(MetaType::Struct);
  const std::pair<std::string, int64_t> containers[] = {
      {"a,b \"q\"\nline2\r\n<&>", INT64_MIN},
      {"esc\x1B[31m tab\t bad\xFF\xC3 ok\xC3\xA4 nonchar\xEF\xBF\xBE", 10240},
  };
  for (const auto& c : containers) {
    auto row = MetaStruct::New("StorageContainer");
    row->SetField("StorageContainer Name", c.first);
    row->SetField("Max Tarn Size (MB)", c.second);
    row->SetField("Hidden", "not listed");
    auto arrays = MetaList::New(MetaType::Struct);
    auto array = MetaStruct::New("Array");
    array->SetField("ArrayId", "A.1=x");
    array->SetField("PEInfo", std::vector<std::string>{"pe 1", "pe\\2"});
    arrays->Append(array);
    row->SetField("Arrays", arrays);
    row->SetField("Ok", MetaBool::New(true));
    rows->Append(row);
  }
  return rows;
}

const FormatHints::Pairs kHints = {
    {"fields:StorageContainer", "Max Tarn Size (MB),StorageContainer Name,Arrays,Ok"},
    {"header:StorageContainer", "%StorageContainer Name%"},
    {"units:StorageContainer.Max Tarn Size (MB)", "MB"},
};

TEST_F(ParsedBackTest, JsonReadsBackAsTheValuesWithInvalidBytesReplaced) {
  const std::string read = Through(Render("json", HostileRows(), kHints),
                                   "python3 -c 'import json,sys; "
                                   "print(json.dumps(json.load(open(sys.argv[1])), "
                                   "ensure_ascii=True))' {}");
  EXPECT_EQ(read,
            "[{\"Max Tarn Size (MB)\": -9223372036854775808, \"StorageContainer Name\": "
            "\"a,b \\\"q\\\"\\nline2\\r\\n<&>\", \"Arrays\": [{\"ArrayId\": \"A.1=x\", "
            "\"PEInfo\": [\"pe 1\", \"pe\\\\2\"]}], \"Ok\": true}, {\"Max Tarn Size (MB)\": "
            "10240, \"StorageContainer Name\": \"esc\\u001b[31m tab\\t bad\\ufffd\\ufffd "
            "ok\\u00e4 nonchar\\ufffe\", \"Arrays\": [{\"ArrayId\": \"A.1=x\", \"PEInfo\": "
            "[\"pe 1\", \"pe\\\\2\"]}], \"Ok\": true}]\n");
}

TEST_F(ParsedBackTest, XmlIsWellFormedAndKeepsTextsHintsAndNesting) {
  const std::string xml = Render("xml", HostileRows(), kHints);
  EXPECT_EQ(Through(xml, "xmllint --noout {}"), "");
  // xmllint ends what it prints with a line feed.
  const auto pick = [&](const std::string& path) {
    std::string text = Through(xml, "xmllint --xpath '" + path + "' {}");
    if (!text.empty() && text.back() == '\n') text.pop_back();
    return text;
  };
  EXPECT_EQ(pick("string(/result/list/struct[1]/field[@name=\"StorageContainer Name\"]/string)"),
            "a,b \"q\"\nline2\r\n<&>");
  // What XML 1.0 cannot carry, and what is not UTF-8, reads as U+FFFD.
  EXPECT_EQ(pick("string(/result/list/struct[2]/@heading)"),
            "esc\xEF\xBF\xBD[31m tab\t bad\xEF\xBF\xBD\xEF\xBF\xBD ok\xC3\xA4 nonchar\xEF\xBF\xBD");
  EXPECT_EQ(pick("string(/result/list/struct[1]/field[1]/@unit)"), "MB");
  EXPECT_EQ(pick("string(/result/list/struct[1]/field[1]/int)"), "-9223372036854775808");
  EXPECT_EQ(pick("count(/result/list/struct[1]/field)"), "4");
  EXPECT_EQ(pick("string(//struct[@name=\"Array\"]/field[@name=\"PEInfo\"]/list/string[2])"),
            "pe\\2");
  EXPECT_EQ(pick("string(/result/list/struct[2]/field[@name=\"Ok\"]/bool)"), "true");
  EXPECT_EQ(Through(Render("xml", MetaString::New("a]]>b")),
                    "xmllint --xpath 'string(/result/string)' {}"),
            "a]]>b\n");
}

TEST_F(ParsedBackTest, CsvReadsBackRowForRowWithNestedValuesAsJson) {
  const std::string csv = Render("csv", HostileRows(), kHints);
  EXPECT_EQ(csv.substr(0, csv.find('\n') + 1),
            "Max Tarn Size (MB) (MB),StorageContainer Name,Arrays,Ok\r\n");
  const std::string read = Through(
      csv,
      "python3 -c 'import csv,json,sys; "
      "print(json.dumps(list(csv.reader(open(sys.argv[1], newline=\"\", encoding=\"utf-8\"), "
      "strict=True))))' {}");
  EXPECT_EQ(
      read,
      "[[\"Max Tarn Size (MB) (MB)\", \"StorageContainer Name\", \"Arrays\", \"Ok\"], "
      "[\"-9223372036854775808\", \"a,b \\\"q\\\"\\nline2\\r\\n<&>\", "
      "\"[{\\\"ArrayId\\\":\\\"A.1=x\\\",\\\"PEInfo\\\":[\\\"pe 1\\\",\\\"pe\\\\\\\\2\\\"]}]\", "
      "\"true\"], [\"10240\", \"esc\\u001b[31m tab\\t bad\\ufffd\\ufffd ok\\u00e4 "
      "nonchar\\ufffe\", \"[{\\\"ArrayId\\\":\\\"A.1=x\\\",\\\"PEInfo\\\":[\\\"pe 1\\\","
      "\\\"pe\\\\\\\\2\\\"]}]\", \"true\"]]\n");
  // Results that are not records have one column; an empty list of records
  // still names its columns.
  auto prototype = MetaStruct::New("Row");
  prototype->SetField("Id", "");
  EXPECT_EQ(Render("csv", MetaList::New(MetaType::Struct, prototype)), "Id\r\n");
  EXPECT_EQ(Render("csv", MetaBool::New(false)), "value\r\nfalse\r\n");
  auto texts = MetaList::New(MetaType::String);
  texts->Append(MetaString::New("x,y"));
  EXPECT_EQ(Render("csv", texts), "value\r\n\"x,y\"\r\n");
}

TEST(KeyValueFormatterTest, OneEscapedLinePerLeafWithIndexesInThePath) {
  EXPECT_EQ(Render("keyvalue", HostileRows(), kHints),
            "0.Max Tarn Size (MB) (MB)=-9223372036854775808\n"
            "0.StorageContainer Name=a,b \"q\"\\nline2\\r\\n<&>\n"
            "0.Arrays.0.ArrayId=A.1=x\n"
            "0.Arrays.0.PEInfo.0=pe 1\n"
            "0.Arrays.0.PEInfo.1=pe\\\\2\n"
            "0.Ok=true\n"
            "1.Max Tarn Size (MB) (MB)=10240\n"
            "1.StorageContainer Name=esc\\x1B[31m tab\\t bad\\xFF\\xC3 ok\xC3\xA4 "
            "nonchar\xEF\xBF\xBE\n"
            "1.Arrays.0.ArrayId=A.1=x\n"
            "1.Arrays.0.PEInfo.0=pe 1\n"
            "1.Arrays.0.PEInfo.1=pe\\\\2\n"
            "1.Ok=true\n");
  auto odd = MetaStruct::New("R");
  odd->SetField("a.b=c", "v");
  odd->SetField("Empty", MetaList::New(MetaType::String));
  EXPECT_EQ(Render("keyvalue", odd), "a\\.b\\=c=v\n");
  EXPECT_EQ(Render("keyvalue", MetaString::New("done\n")), "value=done\\n\n");
}

// Random trees of random bytes, compared with nlohmann's writer, which the
// JSON formatter replaced: the same document, byte for byte.
Value RandomValue(std::mt19937& random, int depth) {
  const auto text = [&] {
    std::string bytes;
    const int length = static_cast<int>(random() % 8);
    for (int i = 0; i < length; ++i) {
      const char pool[] = {'a',    '"',    '\\',   '\n',   '\x01', '\x7F', '\xC3',
                           '\xA4', '\xE2', '\x82', '\xAC', '\xF0', '\x9F', '\x98',
                           '\x80', '\xFF', '\xED', '\xA0', '\xC0'};
      bytes += pool[random() % sizeof pool];
    }
    return bytes;
  };
  switch (depth > 2 ? random() % 3 : random() % 5) {
    case 0:
      return MetaString::New(text());
    case 1:
      return MetaInt::New(static_cast<int64_t>(random()) - (int64_t{1} << 31));
    case 2:
      return MetaBool::New(random() % 2 == 0);
    case 3: {
      auto record = MetaStruct::New("R");
      for (int i = static_cast<int>(random() % 4); i > 0; --i) {
        record->SetField(text(), MetaString::New(text()));
        record->SetField("n" + std::to_string(i), MetaInt::New(i));
      }
      auto inner = MetaList::New(MetaType::List);
      inner->Append(RandomValue(random, depth + 1));
      record->SetField("inner", inner);
      return record;
    }
    default: {
      auto list = MetaList::New(MetaType::List);
      for (int i = static_cast<int>(random() % 4); i > 0; --i)
        list->Append(RandomValue(random, depth + 1));
      return list;
    }
  }
}

nlohmann::ordered_json Reference(const Value& value) {
  if (auto* record = dynamic_cast<const MetaStruct*>(value.get())) {
    nlohmann::ordered_json object = nlohmann::ordered_json::object();
    for (const auto& field : record->GetFields()) object[field.first] = Reference(field.second);
    return object;
  }
  if (auto* list = dynamic_cast<const MetaList*>(value.get())) {
    nlohmann::ordered_json array = nlohmann::ordered_json::array();
    for (const auto& element : list->GetElements()) array.push_back(Reference(element));
    return array;
  }
  if (auto* flag = dynamic_cast<const MetaBool*>(value.get())) return flag->GetValue();
  if (auto* number = dynamic_cast<const MetaInt*>(value.get())) return number->GetValue();
  return dynamic_cast<const MetaString*>(value.get())->GetValue();
}

TEST(JsonFormatterTest, StreamedDocumentMatchesTheLibraryWriterOnRandomBytes) {
  std::mt19937 random(7);
  for (int round = 0; round < 2000; ++round) {
    const Value value = RandomValue(random, 0);
    const std::string expected =
        Reference(value).dump(2, ' ', false, nlohmann::json::error_handler_t::replace) + "\n";
    ASSERT_EQ(Render("json", value), expected) << "round " << round;
  }
}

}  // namespace
