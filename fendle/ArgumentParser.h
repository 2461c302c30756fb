// Turns the words after a command's path into the command's parsed Input.
//
//   --name VALUE, --name=VALUE, -a VALUE   an option that takes a value; the
//                                          next word is taken even when it
//                                          starts with a dash
//   --name, -a                             a Flag
//
// Everything the command could not run with is refused with a UsageError
// before the command sees it.
#pragma once

#include <boost/shared_ptr.hpp>
#include <string>
#include <vector>

#include "Fendle/CallSpec.h"
#include "fendle/UsageError.h"

namespace Fendle {
namespace CommandLine {

class ArgumentParser {
 public:
  explicit ArgumentParser(const boost::shared_ptr<CallSpec::InputSpec>& spec);

  // Throws UsageError for an unknown option, a stray word, a missing or bad
  // value, a single-valued option given twice or a missing required option.
  boost::shared_ptr<CallSpec::Input> Parse(const std::vector<std::string>& words) const;

  // True when "--help" stands where an option is expected, not where it is
  // the value of the option before it ("-v --help" names something --help).
  bool AsksForHelp(const std::vector<std::string>& words) const;

 private:
  // Stores one value of parameter, converted to its type.
  void Store(const CallSpec::ParameterSpec& parameter, const std::string& value,
             CallSpec::Input& input) const;

  boost::shared_ptr<CallSpec::InputSpec> spec_;
};

}  // namespace CommandLine
}  // namespace Fendle
