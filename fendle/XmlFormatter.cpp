// The XML shape, one element per value:
//
//   <?xml version="1.0" encoding="UTF-8"?>
//   <result>
//     <list>
//       <struct name="StorageContainer" heading="ds1">
//         <field name="Max Tarn Size (MB)" unit="MB"><int>10240</int></field>
//         <field name="Arrays"><list>...</list></field>
//       </struct>
//     </list>
//   </result>
//
// Scalars are <string>, <int> and <bool> (true or false); an absent value is
// <null/>. "heading" is present where the structure has a heading hint,
// "unit" where the field has a unit hint. Bytes that are not UTF-8, and
// characters XML 1.0 cannot carry at all (C0 controls other than tab, line
// feed and carriage return; U+FFFE, U+FFFF), become U+FFFD.
#include "fendle/Formatter.h"
#include "fendle/Text.h"

namespace Fendle {
namespace Format {

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace {

bool AllowedInXml(uint32_t c) {
  return c == 0x9 || c == 0xA || c == 0xD || (c >= 0x20 && c != 0xFFFE && c != 0xFFFF);
}

// Escapes text for element content or, with attribute, for a value in double
// quotes. Tab, line feed and carriage return are written as references where
// a parser would otherwise normalise them away.
void WriteEscaped(const std::string& text, bool attribute, std::ostream& out) {
  for (std::size_t at = 0; at < text.size();) {
    const Text::Utf8Unit unit = Text::NextUtf8Unit(text, at);
    const uint32_t c = unit.codePoint;
    if (!unit.valid || !AllowedInXml(c)) {
      out << "\xEF\xBF\xBD";
    } else if (c == '&') {
      out << "&amp;";
    } else if (c == '<') {
      out << "&lt;";
    } else if (c == '>') {
      out << "&gt;";
    } else if (c == '"' && attribute) {
      out << "&quot;";
    } else if (c == '\r') {
      out << "&#13;";
    } else if (attribute && c == '\n') {
      out << "&#10;";
    } else if (attribute && c == '\t') {
      out << "&#9;";
    } else {
      out.write(text.data() + at, static_cast<std::streamsize>(unit.length));
    }
    at += unit.length;
  }
}

void Attribute(const char* name, const std::string& value, std::ostream& out) {
  out << ' ' << name << "=\"";
  WriteEscaped(value, true, out);
  out << '"';
}

class XmlWriter {
 public:
  XmlWriter(const FormatHints& hints, std::ostream& out) : hints_(hints), out_(out) {}

  // Writes value as one element on its own lines, starting at the current line.
  void Value(const boost::shared_ptr<MetaObject>& value, int level) {
    if (const MetaStruct* record = AsStruct(value)) {
      Indent(level);
      out_ << "<struct";
      Attribute("name", record->GetName(), out_);
      if (hints_.HasHeading(record->GetName())) Attribute("heading", hints_.Heading(*record), out_);
      const std::vector<std::string> names = hints_.DisplayFields(*record);
      if (names.empty()) {
        out_ << "/>\n";
        return;
      }
      out_ << ">\n";
      for (const std::string& name : names) Field(*record, name, level + 1);
      Indent(level);
      out_ << "</struct>\n";
    } else if (const MetaList* list = AsList(value)) {
      Indent(level);
      if (list->GetElements().empty()) {
        out_ << "<list/>\n";
        return;
      }
      out_ << "<list>\n";
      for (const auto& element : list->GetElements()) Value(element, level + 1);
      Indent(level);
      out_ << "</list>\n";
    } else {
      Indent(level);
      Scalar(value);
      out_ << '\n';
    }
  }

 private:
  void Field(const MetaStruct& record, const std::string& name, int level) {
    const boost::shared_ptr<MetaObject> value = record.GetField(name);
    Indent(level);
    out_ << "<field";
    Attribute("name", name, out_);
    const std::string unit = hints_.Unit(record.GetName(), name);
    if (!unit.empty()) Attribute("unit", unit, out_);
    out_ << '>';
    if (AsStruct(value) || AsList(value)) {
      out_ << '\n';
      Value(value, level + 1);
      Indent(level);
    } else {
      Scalar(value);
    }
    out_ << "</field>\n";
  }

  void Scalar(const boost::shared_ptr<MetaObject>& value) {
    if (auto* flag = dynamic_cast<const MetaObj::MetaBool*>(value.get())) {
      out_ << "<bool>" << (flag->GetValue() ? "true" : "false") << "</bool>";
    } else if (auto* number = dynamic_cast<const MetaObj::MetaInt*>(value.get())) {
      out_ << "<int>" << number->GetValue() << "</int>";
    } else if (auto* text = dynamic_cast<const MetaObj::MetaString*>(value.get())) {
      out_ << "<string>";
      WriteEscaped(text->GetValue(), false, out_);
      out_ << "</string>";
    } else {
      out_ << "<null/>";
    }
  }

  void Indent(int level) {
    for (int i = 0; i < level * 2; ++i) out_ << ' ';
  }

  const FormatHints& hints_;
  std::ostream& out_;
};

}  // namespace

void XmlFormatter::Render(const boost::shared_ptr<MetaObject>& result, const FormatHints& hints,
                          std::ostream& out) const {
  if (!result) return;
  out << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<result>\n";
  XmlWriter(hints, out).Value(result, 1);
  out << "</result>\n";
}

}  // namespace Format
}  // namespace Fendle
