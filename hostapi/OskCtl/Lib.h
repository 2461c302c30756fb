// The exception a plug-in throws when a host library cannot be opened.
#pragma once

#include "HostCtl/Lib.h"

#include <exception>
#include <string>

namespace OskCtl {
namespace Lib {

class OskCtlException : public std::exception {
 public:
  OskCtlException(const std::string& message, const std::string& sourceFile, int line,
                  const HostCtl::Lib::KelmMessage& kelmMessage);
  ~OskCtlException() override;

  virtual std::string GetMessage(bool withDetails = false) const;
  const char* what() const noexcept override;
  // Where the exception was thrown, as given by the thrower.
  const std::string& GetSourceFile() const;
  int GetLine() const;
  const HostCtl::Lib::KelmMessage& GetKelmMessage() const;

 private:
  std::string message_;
  std::string sourceFile_;
  int line_;
  HostCtl::Lib::KelmMessage kelmMessage_;
};

}  // namespace Lib
}  // namespace OskCtl
