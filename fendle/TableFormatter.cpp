#include <algorithm>

#include "fendle/Formatter.h"

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

// A value on one line: line feeds become blanks, a final one is dropped.
std::string OneLine(std::string text) {
  if (!text.empty() && text.back() == '\n') text.pop_back();
  std::replace(text.begin(), text.end(), '\n', ' ');
  return text;
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

// The structure that stands for every row: the list's element prototype, the
// declared result's, or the first row.
const MetaStruct* ModelRow(const MetaList* list, const std::vector<const MetaStruct*>& rows,
                           const FormatHints& hints) {
  if (list != nullptr) {
    if (const MetaStruct* model = AsStruct(list->GetPrototype())) return model;
  }
  if (const MetaStruct* declared = AsStruct(hints.Prototype())) return declared;
  if (const MetaList* declared = AsList(hints.Prototype())) {
    if (const MetaStruct* model = AsStruct(declared->GetPrototype())) return model;
  }
  return rows.empty() ? nullptr : rows.front();
}

std::vector<std::string> Columns(const MetaStruct* model, const FormatHints& hints) {
  std::vector<std::string> columns;
  if (model != nullptr) columns = hints.ListedFields(model->GetName());
  if (columns.empty()) columns = hints.TableColumns();
  if (columns.empty() && model != nullptr) {
    for (const auto& field : model->GetFields()) columns.push_back(field.first);
  }
  return columns;
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

  std::vector<std::string> columns = Columns(ModelRow(list, rows, hints), hints);
  if (columns.empty()) return;
  std::vector<std::vector<std::string> > cells;
  std::vector<std::size_t> widths;
  for (const std::string& column : columns) widths.push_back(DisplayWidth(column));
  for (const MetaStruct* row : rows) {
    std::vector<std::string> line;
    for (std::size_t i = 0; i < columns.size(); ++i) {
      line.push_back(Cell(*row, columns[i], hints));
      widths[i] = std::max(widths[i], DisplayWidth(line.back()));
    }
    cells.push_back(line);
  }
  std::vector<std::string> dashes;
  for (std::size_t width : widths) dashes.push_back(std::string(width, '-'));
  WriteRow(columns, widths, out);
  WriteRow(dashes, widths, out);
  for (const auto& line : cells) WriteRow(line, widths, out);
}

}  // namespace Format
}  // namespace Fendle
