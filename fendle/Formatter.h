// Renders a command's result for the user: "simple" (indented records),
// "table" (aligned columns) or "json" (for scripts).
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

// The formatter of that name, or null when there is none.
std::unique_ptr<Formatter> CreateFormatter(const std::string& name);
// The names CreateFormatter knows.
const std::vector<std::string>& FormatterNames();

}  // namespace Format
}  // namespace Fendle
