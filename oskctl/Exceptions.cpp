#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"

namespace HostCtl {
namespace Lib {

KelmMessage::KelmMessage() = default;

const std::string& KelmMessage::GetId() const { return id_; }

HostCtlException::HostCtlException(const std::string& message, const KelmMessage& kelmMessage)
    : message_(message), kelmMessage_(kelmMessage) {}

HostCtlException::~HostCtlException() = default;

std::string HostCtlException::GetMessage(bool /*withDetails*/) const { return message_; }

const char* HostCtlException::what() const noexcept { return message_.c_str(); }

const KelmMessage& HostCtlException::GetKelmMessage() const { return kelmMessage_; }

}  // namespace Lib
}  // namespace HostCtl

namespace OskCtl {
namespace Lib {

OskCtlException::OskCtlException(const std::string& message, const std::string& sourceFile,
                                 int line, const HostCtl::Lib::KelmMessage& kelmMessage)
    : message_(message), sourceFile_(sourceFile), line_(line), kelmMessage_(kelmMessage) {}

OskCtlException::~OskCtlException() = default;

std::string OskCtlException::GetMessage(bool /*withDetails*/) const { return message_; }

const char* OskCtlException::what() const noexcept { return message_.c_str(); }

const std::string& OskCtlException::GetSourceFile() const { return sourceFile_; }

int OskCtlException::GetLine() const { return line_; }

const HostCtl::Lib::KelmMessage& OskCtlException::GetKelmMessage() const { return kelmMessage_; }

}  // namespace Lib
}  // namespace OskCtl
