// Opening and releasing the daemon client library around a command.
//
// Constructor bracket: the constructor's last step is
//   OpenTarnLib("internal/<Class>", <line>);
// and the destructor calls TarnLib_Exit(). A constructor that throws leaves no
// object, so no TarnLib_Exit follows a failed opening.
//
// Invocation bracket: the first statement of ExecuteInternal is
//   InvocationBracket bracket("internal/<Class>", <line>);
// which releases the library once when ExecuteInternal is left, by any path.
//
// The line is a fixed number kept in each command file as kInitLine, never
// __LINE__: the failure report names it, scripts and people match on it, and
// it must not move when the file is edited.
#pragma once

#include <boost/function.hpp>

#include "Nestra/Finally.h"

namespace HalvikCli {
namespace TarnNamespace {

inline constexpr char kUnableToInitializeTarnLib[] = "Unable to initialize tarnLib";

// TarnLib_Init(0, 0); when it fails, throws OskCtl::Lib::OskCtlException
// "Unable to initialize tarnLib" naming source and line.
void OpenTarnLib(const char* source, int line);

// Holds one opening of the daemon client library for the enclosing scope.
class InvocationBracket {
 public:
  // Opens the library or throws as OpenTarnLib does; nothing is held then.
  InvocationBracket(const char* source, int line);
  InvocationBracket(const InvocationBracket&) = delete;
  InvocationBracket& operator=(const InvocationBracket&) = delete;

 private:
  // Opens the library and answers the action that releases it.
  static boost::function<void()> Open(const char* source, int line);

  Nestra::Finally release_;
};

// Tries to open the library for the enclosing scope without throwing. A
// successful opening is released once when the scope is left, by any path.
class TryInvocationBracket {
 public:
  TryInvocationBracket();
  TryInvocationBracket(const TryInvocationBracket&) = delete;
  TryInvocationBracket& operator=(const TryInvocationBracket&) = delete;

  // Whether TarnLib_Init succeeded.
  bool IsOpen() const { return open_; }

 private:
  bool open_;
  Nestra::Finally release_;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli
