// How every storage-control operation meets the simulated world: one world
// operation per call, armed failures turned into the host's exception, and an
// unreadable world reported the same way.
#pragma once

#include <functional>
#include <string>

#include "Operation.h"

namespace OskCtl {
namespace Storage {

// Throws HostCtl::Lib::HostCtlException with text and a default KelmMessage.
[[noreturn]] void ThrowHostError(const std::string& text);

// Runs body as the operation, journaled with args. Answers false when an
// armed failure asks for an answer of "nothing" (the caller then answers its
// empty value without any effect); throws HostCtlException for an armed
// failure or a world that cannot be used. The body reports refusals with
// ThrowHostError.
bool RunHostOperation(const char* operation, HyraSim::Access access, const HyraSim::CallArgs& args,
                      const std::function<void(sqlite3*)>& body);

// Counts a call of an operation that answers from what the object holds;
// answers and throws as RunHostOperation does.
bool CountHostCall(const char* operation, const HyraSim::CallArgs& args);

}  // namespace Storage
}  // namespace OskCtl
