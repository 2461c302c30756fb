// Renders a command's result: for people "simple" (indented records) and
// "table" (aligned columns); for programs "json", "xml", "csv" and "keyvalue".
// Every formatter writes straight to its stream as it walks the value, so the
// output is never held whole in memory.
#pragma once

#include <boost/shared_ptr.hpp>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "Fendle/MetaObj.h"
#include "fendle/FormatHints.h"

namespace Fendle {
namespace Format {

class Formatter {
 public:
  virtual ~Formatter();
  // Writes result to out; an absent result writes nothing.
  virtual void Render(const boost::shared_ptr<MetaObj::MetaObject>& result,
                      const FormatHints& hints, std::ostream& out) const = 0;
};

// Scalars as text, one per line; records as a heading line followed by
// "Field: value" lines, nested values indented below their field.
class SimpleFormatter : public Formatter {
 public:
  void Render(const boost::shared_ptr<MetaObj::MetaObject>& result, const FormatHints& hints,
              std::ostream& out) const override;
};

// A structure or a list of structures as a table with a header row and a row
// of dashes; anything else as SimpleFormatter writes it.
class TableFormatter : public Formatter {
 public:
  void Render(const boost::shared_ptr<MetaObj::MetaObject>& result, const FormatHints& hints,
              std::ostream& out) const override;
};

// The result as one JSON document; bytes that are not UTF-8 become U+FFFD.
class JsonFormatter : public Formatter {
 public:
  void Render(const boost::shared_ptr<MetaObj::MetaObject>& result, const FormatHints& hints,
              std::ostream& out) const override;
};

// The result as one XML 1.0 document (see XmlFormatter.cpp for its shape).
class XmlFormatter : public Formatter {
 public:
  void Render(const boost::shared_ptr<MetaObj::MetaObject>& result, const FormatHints& hints,
              std::ostream& out) const override;
};

// The result as RFC 4180 CSV: a header row, then one row per record.
class CsvFormatter : public Formatter {
 public:
  void Render(const boost::shared_ptr<MetaObj::MetaObject>& result, const FormatHints& hints,
              std::ostream& out) const override;
};

// One "path.to.field=value" line per leaf of the result.
class KeyValueFormatter : public Formatter {
 public:
  void Render(const boost::shared_ptr<MetaObj::MetaObject>& result, const FormatHints& hints,
              std::ostream& out) const override;
};

// One formatter the tool offers: its name, a line for help texts, its maker.
struct FormatterEntry {
  const char* name;
  const char* summary;
  std::unique_ptr<Formatter> (*create)();
};

// Every formatter, in the order help texts list them. The tool's help, its
// error texts and anything generated from the tool read the names from here.
const std::vector<FormatterEntry>& Formatters();
// The formatter of that name in any case, or null when there is none.
std::unique_ptr<Formatter> CreateFormatter(const std::string& name);
// The names of Formatters(), in order.
const std::vector<std::string>& FormatterNames();

// Writes value as JSON text: indented by indent blanks per level, or on one
// line without blanks when indent is negative.
void WriteJson(const boost::shared_ptr<MetaObj::MetaObject>& value, const FormatHints& hints,
               int indent, std::ostream& out);

}  // namespace Format
}  // namespace Fendle
