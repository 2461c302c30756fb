#include "fendle/Formatter.h"
#include "fendle/Text.h"

namespace Fendle {
namespace Format {

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace {

constexpr int kStep = 2;

class SimpleWriter {
 public:
  SimpleWriter(const FormatHints& hints, std::ostream& out) : hints_(hints), out_(out) {}

  void Record(const MetaStruct& record, int indent) {
    Line(indent, hints_.Heading(record));
    for (const std::string& name : hints_.DisplayFields(record)) {
      Field(record.GetName(), name, record.GetField(name), indent + kStep);
    }
  }

  void Elements(const MetaList& list, int indent) {
    for (const auto& element : list.GetElements()) {
      if (const MetaStruct* record = AsStruct(element)) {
        Record(*record, indent);
      } else if (const MetaList* inner = AsList(element)) {
        Elements(*inner, indent + kStep);
      } else {
        Line(indent, ScalarText(element));
      }
    }
  }

 private:
  void Field(const std::string& structure, const std::string& name,
             const boost::shared_ptr<MetaObject>& value, int indent) {
    if (const MetaStruct* record = AsStruct(value)) {
      Line(indent, name + ":");
      Record(*record, indent + kStep);
      return;
    }
    if (const MetaList* list = AsList(value)) {
      Line(indent, name + ":");
      Elements(*list, indent + kStep);
      return;
    }
    std::string text = ScalarText(value);
    std::string unit = hints_.Unit(structure, name);
    if (!unit.empty() && !text.empty()) text += " " + unit;
    Line(indent, text.empty() ? name + ":" : name + ": " + text);
  }

  // One line at indent; a text of several lines keeps its later lines under the
  // first. Control bytes are shown escaped: they come from the host and must
  // not drive the user's terminal.
  void Line(int indent, const std::string& text) {
    std::string body = Text::TerminalSafe(text);
    if (!body.empty() && body.back() == '\n') body.pop_back();
    if (body.empty()) {
      out_ << '\n';
      return;
    }
    const std::string pad(static_cast<std::size_t>(indent), ' ');
    out_ << pad;
    for (char c : body) {
      out_ << c;
      if (c == '\n') out_ << pad << std::string(kStep, ' ');
    }
    out_ << '\n';
  }

  const FormatHints& hints_;
  std::ostream& out_;
};

}  // namespace

void SimpleFormatter::Render(const boost::shared_ptr<MetaObject>& result, const FormatHints& hints,
                             std::ostream& out) const {
  if (!result) return;
  SimpleWriter writer(hints, out);
  if (const MetaStruct* record = AsStruct(result)) {
    writer.Record(*record, 0);
  } else if (const MetaList* list = AsList(result)) {
    writer.Elements(*list, 0);
  } else {
    // A text result is the command's own wording: written as is, ended once.
    std::string text = Text::TerminalSafe(ScalarText(result));
    out << text;
    if (text.empty() || text.back() != '\n') out << '\n';
  }
}

}  // namespace Format
}  // namespace Fendle
