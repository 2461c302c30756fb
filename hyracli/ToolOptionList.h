// The tool's global options, for everything that describes them to a user or a
// shell: completion scripts and manual pages.
#pragma once

#include <string>
#include <vector>

namespace Hyracli {

// What follows a global option on the command line.
enum class ToolOptionValue {
  None,       // a switch
  Formatter,  // a formatter name
  Directory,  // a directory
};

struct ToolOption {
  std::string name;   // long name, without the dashes
  std::string alias;  // one letter, or empty
  ToolOptionValue value;
  std::string help;
};

// The global options in the order the root help lists them.
const std::vector<ToolOption>& ToolOptionList();

// The word on the command line that prints a completion script ("completion").
extern const char kCompletionWord[];

}  // namespace Hyracli
