#include "fendle/Formatter.h"

#include <boost/algorithm/string/predicate.hpp>

namespace Fendle {
namespace Format {

namespace {

template <typename T>
std::unique_ptr<Formatter> Make() {
  return std::make_unique<T>();
}

}  // namespace

Formatter::~Formatter() = default;

const std::vector<FormatterEntry>& Formatters() {
  static const std::vector<FormatterEntry> kFormatters = {
      {"simple", "indented records, for reading", &Make<SimpleFormatter>},
      {"table", "aligned columns, for reading", &Make<TableFormatter>},
      {"json", "one JSON document", &Make<JsonFormatter>},
      {"xml", "one XML document", &Make<XmlFormatter>},
      {"csv", "comma-separated values with a header row", &Make<CsvFormatter>},
      {"keyvalue", "one path.to.field=value line per value", &Make<KeyValueFormatter>},
  };
  return kFormatters;
}

std::unique_ptr<Formatter> CreateFormatter(const std::string& name) {
  for (const FormatterEntry& entry : Formatters()) {
    if (boost::algorithm::iequals(name, entry.name)) return entry.create();
  }
  return nullptr;
}

const std::vector<std::string>& FormatterNames() {
  static const std::vector<std::string> kNames = [] {
    std::vector<std::string> names;
    for (const FormatterEntry& entry : Formatters()) names.push_back(entry.name);
    return names;
  }();
  return kNames;
}

}  // namespace Format
}  // namespace Fendle
