// Exception and message types of the host's control libraries.
#pragma once

#include <exception>
#include <string>

namespace HostCtl {
namespace Lib {

// A localisable message attached to an exception; always default-constructed here.
class KelmMessage {
 public:
  KelmMessage();
  // The message identifier, empty for a default message.
  const std::string& GetId() const;

 private:
  std::string id_;
};

// A failure of the host (or a validation failure of a plug-in).
class HostCtlException : public std::exception {
 public:
  HostCtlException(const std::string& message, const KelmMessage& kelmMessage);
  ~HostCtlException() override;

  // The message text. withDetails adds nothing for a default KelmMessage.
  virtual std::string GetMessage(bool withDetails = false) const;
  const char* what() const noexcept override;
  const KelmMessage& GetKelmMessage() const;

 private:
  std::string message_;
  KelmMessage kelmMessage_;
};

}  // namespace Lib
}  // namespace HostCtl
