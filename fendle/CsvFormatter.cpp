// CSV after RFC 4180: records end with CR LF; a field is quoted when it holds a
// comma, a double quote, a carriage return or a line feed, and a quote inside
// it is doubled. The first row names the columns: the fields of the record
// structure in display order, a unit hint written as "Name (unit)". A nested
// record or list is one cell holding its JSON text on one line. A result that
// is not records has the one column "value". Bytes that are not UTF-8 become
// U+FFFD.
#include <sstream>

#include "fendle/Formatter.h"
#include "fendle/Text.h"

namespace Fendle {
namespace Format {

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace {

void WriteField(const std::string& raw, std::ostream& out) {
  const std::string text = Text::ReplaceInvalidUtf8(raw);
  if (text.find_first_of(",\"\r\n") == std::string::npos) {
    out << text;
    return;
  }
  out << '"';
  for (char c : text) {
    if (c == '"') out << '"';
    out << c;
  }
  out << '"';
}

void WriteCell(const boost::shared_ptr<MetaObject>& value, const FormatHints& hints,
               std::ostream& out) {
  if (AsStruct(value) || AsList(value)) {
    std::ostringstream json;  // one cell, not the output
    WriteJson(value, hints, -1, json);
    WriteField(json.str(), out);
  } else {
    WriteField(ScalarText(value), out);
  }
}

const char kRecordEnd[] = "\r\n";

}  // namespace

void CsvFormatter::Render(const boost::shared_ptr<MetaObject>& result, const FormatHints& hints,
                          std::ostream& out) const {
  if (!result) return;
  std::vector<const MetaStruct*> rows;
  const MetaList* list = AsList(result);
  bool records = true;
  if (const MetaStruct* record = AsStruct(result)) {
    rows.push_back(record);
  } else if (list != nullptr) {
    for (const auto& element : list->GetElements()) {
      const MetaStruct* row = AsStruct(element);
      records = records && row != nullptr;
      rows.push_back(row);
    }
    // An empty list is records only when it says so by its prototype.
    if (list->GetElements().empty()) {
      records = AsStruct(list->GetPrototype()) != nullptr ||
                hints.RecordColumns(list, nullptr).size() > 0;
    }
  } else {
    records = false;
  }

  if (!records) {
    out << "value" << kRecordEnd;
    if (list == nullptr) {
      WriteCell(result, hints, out);
      out << kRecordEnd;
      return;
    }
    for (const auto& element : list->GetElements()) {
      WriteCell(element, hints, out);
      out << kRecordEnd;
    }
    return;
  }

  const std::vector<std::string> columns =
      hints.RecordColumns(list, rows.empty() ? nullptr : rows.front());
  if (columns.empty()) return;
  const MetaStruct* model = rows.empty() ? AsStruct(list->GetPrototype()) : rows.front();
  const std::string structure = model != nullptr ? model->GetName() : std::string();
  for (std::size_t i = 0; i < columns.size(); ++i) {
    if (i > 0) out << ',';
    WriteField(hints.ColumnTitle(structure, columns[i]), out);
  }
  out << kRecordEnd;
  for (const MetaStruct* row : rows) {
    for (std::size_t i = 0; i < columns.size(); ++i) {
      if (i > 0) out << ',';
      WriteCell(row->GetField(columns[i]), hints, out);
    }
    out << kRecordEnd;
  }
}

}  // namespace Format
}  // namespace Fendle
