#include <algorithm>

#include "fendle/Formatter.h"
#include "fendle/Text.h"

namespace Fendle {
namespace Format {

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace {

const char kGap[] = "  ";

// Columns are aligned by characters, not bytes, so UTF-8 names line up.
std::size_t DisplayWidth(const std::string& text) {
  return static_cast<std::size_t>(std::count_if(text.begin(), text.end(), [](char c) {
    return (static_cast<unsigned char>(c) & 0xC0) != 0x80;
  }));
}

// A value on one line: line feeds become blanks, a final one is dropped, and
// control bytes (tab included, it would break the columns) are shown escaped.
std::string OneLine(std::string text) {
  if (!text.empty() && text.back() == '\n') text.pop_back();
  std::replace(text.begin(), text.end(), '\n', ' ');
  return Text::TerminalSafe(text, false);
}

// A nested value in one cell: a record by its heading hint (else its fields in
// braces), a list comma-joined.
std::string Compact(const boost::shared_ptr<MetaObject>& value, const FormatHints& hints) {
  if (const MetaStruct* record = AsStruct(value)) {
    if (hints.HasHeading(record->GetName())) return OneLine(hints.Heading(*record));
    std::string text;
    for (const std::string& name : hints.DisplayFields(*record)) {
      text += (text.empty() ? "" : ", ") + name + ": " + Compact(record->GetField(name), hints);
    }
    return "{" + text + "}";
  }
  if (const MetaList* list = AsList(value)) {
    std::string text;
    bool first = true;
    for (const auto& element : list->GetElements()) {
      text += (first ? "" : ", ") + Compact(element, hints);
      first = false;
    }
    return text;
  }
  return OneLine(ScalarText(value));
}

std::string Cell(const MetaStruct& row, const std::string& column, const FormatHints& hints) {
  boost::shared_ptr<MetaObject> value = row.GetField(column);
  std::string text = Compact(value, hints);
  std::string unit = hints.Unit(row.GetName(), column);
  if (!unit.empty() && !text.empty() && !AsStruct(value) && !AsList(value)) text += " " + unit;
  return text;
}

// Writes one row padded to widths; nothing follows its last non-empty cell.
void WriteRow(const std::vector<std::string>& cells, const std::vector<std::size_t>& widths,
              std::ostream& out) {
  std::size_t last = cells.size();
  while (last > 0 && cells[last - 1].empty()) --last;
  for (std::size_t i = 0; i < last; ++i) {
    out << cells[i];
    if (i + 1 < last) out << std::string(widths[i] - DisplayWidth(cells[i]), ' ') << kGap;
  }
  out << '\n';
}

}  // namespace

void TableFormatter::Render(const boost::shared_ptr<MetaObject>& result, const FormatHints& hints,
                            std::ostream& out) const {
  std::vector<const MetaStruct*> rows;
  const MetaList* list = AsList(result);
  if (const MetaStruct* record = AsStruct(result)) {
    rows.push_back(record);
  } else if (list != nullptr) {
    for (const auto& element : list->GetElements()) {
      const MetaStruct* row = AsStruct(element);
      if (row == nullptr) {
        // Only records make rows; any other list reads better as lines.
        SimpleFormatter().Render(result, hints, out);
        return;
      }
      rows.push_back(row);
    }
  } else {
    SimpleFormatter().Render(result, hints, out);
    return;
  }

  std::vector<std::string> columns =
      hints.RecordColumns(list, rows.empty() ? nullptr : rows.front());
  if (columns.empty()) return;
  // Two passes, measuring then writing, so no cell is held beyond its row.
  std::vector<std::size_t> widths;
  for (const std::string& column : columns) widths.push_back(DisplayWidth(OneLine(column)));
  std::vector<std::string> line(columns.size());
  for (const MetaStruct* row : rows) {
    for (std::size_t i = 0; i < columns.size(); ++i) {
      widths[i] = std::max(widths[i], DisplayWidth(Cell(*row, columns[i], hints)));
    }
  }
  std::vector<std::string> dashes;
  for (std::size_t width : widths) dashes.push_back(std::string(width, '-'));
  for (std::string& column : columns) column = OneLine(column);
  WriteRow(columns, widths, out);
  WriteRow(dashes, widths, out);
  for (const MetaStruct* row : rows) {
    for (std::size_t i = 0; i < columns.size(); ++i) line[i] = Cell(*row, columns[i], hints);
    WriteRow(line, widths, out);
  }
}

}  // namespace Format
}  // namespace Fendle
