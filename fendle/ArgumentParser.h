// Turns the words after a command's path into the command's parsed Input.
//
//   --name VALUE, --name=VALUE, -a VALUE   an option that takes a value; the
//                                          next word is taken even when it
//                                          starts with a dash
//   --name, -a                             a Flag
//   --                                     ends the options; the command
//                                          takes no other words, so any word
//                                          after it is refused
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

  // True when "--help" (or "-h", unless the command has an alias "h") stands
  // where an option is expected, not where it is the value of the option
  // before it ("-v --help" names something --help) or after "--".
  bool AsksForHelp(const std::vector<std::string>& words) const;

  // Removes "--name VALUE", "--name=VALUE" and "-alias VALUE" where an option
  // is expected and answers the values, in order, for an option the tool
  // offers beside the command's own; a command that declares the name (or the
  // alias) itself keeps it. Throws UsageError when the value is missing.
  std::vector<std::string> TakeToolOption(std::vector<std::string>& words, const std::string& name,
                                          const std::string& alias) const;

 private:
  // Calls visit(at) for each word at an option's place, up to "--"; visit
  // answers how many of the following words it used. Answers the index of
  // "--" or words.size().
  template <typename Visit>
  std::size_t ForEachOptionWord(const std::vector<std::string>& words, Visit visit) const;
  // The parameter a word at an option's place names, or null.
  boost::shared_ptr<CallSpec::ParameterSpec> Named(const std::string& word) const;

  // Stores one value of parameter, converted to its type.
  void Store(const CallSpec::ParameterSpec& parameter, const std::string& value,
             CallSpec::Input& input) const;

  boost::shared_ptr<CallSpec::InputSpec> spec_;
};

}  // namespace CommandLine
}  // namespace Fendle
