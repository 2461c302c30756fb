#include "support/TarnLibBracket.h"

#include <boost/bind/bind.hpp>

#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"
#include "TarnLib/TarnLib.h"

namespace HalvikCli {
namespace TarnNamespace {

void OpenTarnLib(const char* source, int line) {
  if (!TarnLib_Init(0, 0)) {
    throw OskCtl::Lib::OskCtlException(kUnableToInitializeTarnLib, source, line,
                                       HostCtl::Lib::KelmMessage());
  }
}

InvocationBracket::InvocationBracket(const char* source, int line) : release_(Open(source, line)) {}

boost::function<void()> InvocationBracket::Open(const char* source, int line) {
  OpenTarnLib(source, line);
  return boost::function<void()>(boost::bind(&TarnLib_Exit));
}

TryInvocationBracket::TryInvocationBracket()
    : open_(TarnLib_Init(0, 0)),
      release_(open_ ? boost::function<void()>(boost::bind(&TarnLib_Exit))
                     : boost::function<void()>()) {}

}  // namespace TarnNamespace
}  // namespace HalvikCli
