// One line per leaf: "path=value". The path joins field names and list
// indexes (from 0) with points, from the result down: "0.Arrays.1.ArrayId".
// A field with a unit hint is named "Name (unit)". A result that is a single
// value has the path "value". Lines follow the display order of fields and
// the order of lists, so the same result always writes the same lines; an
// empty list or record writes none.
//
// Escapes, so that every line is one line and splits at its first unescaped
// "=": a backslash is written "\\", line feed "\n", carriage return "\r", tab
// "\t", other control characters and bytes that are not UTF-8 "\xHH"; in a
// path, a point is "\." and "=" is "\=".
#include "fendle/Formatter.h"
#include "fendle/Text.h"

namespace Fendle {
namespace Format {

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace {

std::string Escape(const std::string& text, bool inPath) {
  std::string out;
  for (std::size_t at = 0; at < text.size();) {
    const Text::Utf8Unit unit = Text::NextUtf8Unit(text, at);
    const uint32_t c = unit.codePoint;
    if (unit.valid && c == '\\') {
      out += "\\\\";
    } else if (unit.valid && c == '\n') {
      out += "\\n";
    } else if (unit.valid && c == '\r') {
      out += "\\r";
    } else if (unit.valid && c == '\t') {
      out += "\\t";
    } else if (unit.valid && inPath && (c == '.' || c == '=')) {
      out += '\\';
      out += static_cast<char>(c);
    } else {
      out += Text::TerminalSafe(text.substr(at, unit.length), false);
    }
    at += unit.length;
  }
  return out;
}

class KeyValueWriter {
 public:
  KeyValueWriter(const FormatHints& hints, std::ostream& out) : hints_(hints), out_(out) {}

  void Value(const boost::shared_ptr<MetaObject>& value, const std::string& path) {
    if (const MetaStruct* record = AsStruct(value)) {
      for (const std::string& name : hints_.DisplayFields(*record)) {
        Value(record->GetField(name),
              Join(path, Escape(hints_.ColumnTitle(record->GetName(), name), true)));
      }
    } else if (const MetaList* list = AsList(value)) {
      std::size_t index = 0;
      for (const auto& element : list->GetElements()) {
        Value(element, Join(path, std::to_string(index++)));
      }
    } else {
      out_ << (path.empty() ? std::string("value") : path) << '='
           << Escape(ScalarText(value), false) << '\n';
    }
  }

 private:
  static std::string Join(const std::string& path, const std::string& segment) {
    return path.empty() ? segment : path + "." + segment;
  }

  const FormatHints& hints_;
  std::ostream& out_;
};

}  // namespace

void KeyValueFormatter::Render(const boost::shared_ptr<MetaObject>& result,
                               const FormatHints& hints, std::ostream& out) const {
  if (!result) return;
  KeyValueWriter(hints, out).Value(result, std::string());
}

}  // namespace Format
}  // namespace Fendle
