#include "HostOperation.h"

#include "HostCtl/Lib.h"
#include "World.h"

namespace OskCtl {
namespace Storage {
namespace {

// Armed failures fire as the host's exception; "nothing" is answered as false.
bool Proceed(const HyraSim::Injection& injection) {
  if (!injection.fired) return true;
  if (injection.null) return false;
  ThrowHostError(injection.message);
}

}  // namespace

void ThrowHostError(const std::string& text) {
  throw HostCtl::Lib::HostCtlException(text, HostCtl::Lib::KelmMessage());
}

bool RunHostOperation(const char* operation, HyraSim::Access access, const HyraSim::CallArgs& args,
                      const std::function<void(sqlite3*)>& body) {
  HyraSim::Injection injection;
  try {
    injection = HyraSim::RunOperation(operation, access, args, body);
  } catch (const HyraSim::WorldError& e) {
    ThrowHostError(std::string("The host cannot reach its storage state: ") + e.what());
  }
  return Proceed(injection);
}

bool CountHostCall(const char* operation, const HyraSim::CallArgs& args) {
  HyraSim::Injection injection;
  try {
    injection = HyraSim::CountCall(operation, args);
  } catch (const HyraSim::WorldError& e) {
    ThrowHostError(std::string("The host cannot reach its storage state: ") + e.what());
  }
  return Proceed(injection);
}

}  // namespace Storage
}  // namespace OskCtl
