#include <cstdio>

#include "fendle/Formatter.h"
#include "fendle/Text.h"

namespace Fendle {
namespace Format {

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace {

// Texts come from the host and may hold any bytes; replacing what is not UTF-8
// keeps the document valid instead of failing to write it.
void WriteString(const std::string& text, std::ostream& out) {
  out << '"';
  for (std::size_t at = 0; at < text.size();) {
    const Text::Utf8Unit unit = Text::NextUtf8Unit(text, at);
    if (!unit.valid) {
      out << "\xEF\xBF\xBD";
    } else if (unit.codePoint == '"') {
      out << "\\\"";
    } else if (unit.codePoint == '\\') {
      out << "\\\\";
    } else if (unit.codePoint < 0x20) {
      switch (unit.codePoint) {
        case '\b':
          out << "\\b";
          break;
        case '\f':
          out << "\\f";
          break;
        case '\n':
          out << "\\n";
          break;
        case '\r':
          out << "\\r";
          break;
        case '\t':
          out << "\\t";
          break;
        default: {
          char escaped[8];
          std::snprintf(escaped, sizeof escaped, "\\u%04x", static_cast<unsigned>(unit.codePoint));
          out << escaped;
        }
      }
    } else {
      out.write(text.data() + at, static_cast<std::streamsize>(unit.length));
    }
    at += unit.length;
  }
  out << '"';
}

class JsonWriter {
 public:
  JsonWriter(const FormatHints& hints, int indent, std::ostream& out)
      : hints_(hints), indent_(indent), out_(out) {}

  void Value(const boost::shared_ptr<MetaObject>& value, int level) {
    if (const MetaStruct* record = AsStruct(value)) {
      const std::vector<std::string> names = hints_.DisplayFields(*record);
      Open('{', names.empty());
      for (std::size_t i = 0; i < names.size(); ++i) {
        Separate(i, level + 1);
        WriteString(names[i], out_);
        out_ << (indent_ < 0 ? ":" : ": ");
        Value(record->GetField(names[i]), level + 1);
      }
      Close('}', names.empty(), level);
    } else if (const MetaList* list = AsList(value)) {
      const auto& elements = list->GetElements();
      Open('[', elements.empty());
      for (std::size_t i = 0; i < elements.size(); ++i) {
        Separate(i, level + 1);
        Value(elements[i], level + 1);
      }
      Close(']', elements.empty(), level);
    } else if (auto* flag = dynamic_cast<const MetaObj::MetaBool*>(value.get())) {
      out_ << (flag->GetValue() ? "true" : "false");
    } else if (auto* number = dynamic_cast<const MetaObj::MetaInt*>(value.get())) {
      out_ << number->GetValue();
    } else if (auto* text = dynamic_cast<const MetaObj::MetaString*>(value.get())) {
      WriteString(text->GetValue(), out_);
    } else {
      out_ << "null";
    }
  }

 private:
  void Open(char bracket, bool empty) {
    out_ << bracket;
    if (empty) out_ << (bracket == '{' ? '}' : ']');
  }
  void Close(char bracket, bool empty, int level) {
    if (empty) return;
    if (indent_ >= 0) NewLine(level);
    out_ << bracket;
  }
  void Separate(std::size_t index, int level) {
    if (index > 0) out_ << ',';
    if (indent_ >= 0) NewLine(level);
  }
  void NewLine(int level) {
    out_ << '\n';
    for (int i = 0; i < level * indent_; ++i) out_ << ' ';
  }

  const FormatHints& hints_;
  const int indent_;
  std::ostream& out_;
};

}  // namespace

void WriteJson(const boost::shared_ptr<MetaObject>& value, const FormatHints& hints, int indent,
               std::ostream& out) {
  JsonWriter(hints, indent, out).Value(value, 0);
}

void JsonFormatter::Render(const boost::shared_ptr<MetaObject>& result, const FormatHints& hints,
                           std::ostream& out) const {
  if (!result) return;
  WriteJson(result, hints, 2, out);
  out << '\n';
}

}  // namespace Format
}  // namespace Fendle
