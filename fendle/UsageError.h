// A command line that cannot be run as written: the tool reports it and exits
// with its usage status without running anything.
#pragma once

#include <stdexcept>
#include <string>

namespace Fendle {
namespace CommandLine {

class UsageError : public std::runtime_error {
 public:
  explicit UsageError(const std::string& message);
  ~UsageError() override;
};

}  // namespace CommandLine
}  // namespace Fendle
