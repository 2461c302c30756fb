#include "hyracli/ToolOptionList.h"

namespace Hyracli {

const char kCompletionWord[] = "completion";

const std::vector<ToolOption>& ToolOptionList() {
  // Kept in step with ParseGlobalOptions, which reads the same names.
  static const std::vector<ToolOption> kOptions = {
      {"formatter", "o", ToolOptionValue::Formatter,
       "render the result with the named formatter"},
      {"plugin-dir", "", ToolOptionValue::Directory, "load the plug-ins from this directory"},
      {"help", "h", ToolOptionValue::None, "show help for the words that follow"},
      {"version", "", ToolOptionValue::None, "show the versions of hyracli and its plug-ins"},
  };
  return kOptions;
}

}  // namespace Hyracli
