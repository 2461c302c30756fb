#include "fendle/Formatter.h"

namespace Fendle {
namespace Format {

Formatter::~Formatter() = default;

std::unique_ptr<Formatter> CreateFormatter(const std::string& name) {
  if (name == "simple") return std::make_unique<SimpleFormatter>();
  if (name == "table") return std::make_unique<TableFormatter>();
  if (name == "json") return std::make_unique<JsonFormatter>();
  return nullptr;
}

const std::vector<std::string>& FormatterNames() {
  static const std::vector<std::string> kNames = {"simple", "table", "json"};
  return kNames;
}

}  // namespace Format
}  // namespace Fendle
