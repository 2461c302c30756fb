// The ways a command's invocation ends. Each command picks the one its
// behaviour calls for, so that which calls reach the Output sink, and in which
// order, is decided in one place.
#pragma once

#include <boost/shared_ptr.hpp>
#include <string>

#include "Fendle/CallSpec.h"
#include "Fendle/MetaObj.h"
#include "TarnLib/TarnLib.h"

namespace HalvikCli {
namespace TarnNamespace {

typedef boost::shared_ptr<Fendle::CallSpec::Output> OutputPtr;

// SetResult(result), then Finish.
void EndWithResult(const OutputPtr& output,
                   const boost::shared_ptr<Fendle::MetaObj::MetaObject>& result);
// A text result, then Finish.
void EndWithText(const OutputPtr& output, const std::string& text);
// A true result, then Finish.
void EndWithTrue(const OutputPtr& output);
// SetError only: no result, no Finish.
void EndWithError(const OutputPtr& output, const std::string& text);
// SetError, then Finish; no result.
void EndWithErrorAndFinish(const OutputPtr& output, const std::string& text);
// SetError, then a false result; no Finish.
void EndWithErrorAndFalse(const OutputPtr& output, const std::string& text);
// SetError, a false result, then Finish.
void EndWithErrorFalseAndFinish(const OutputPtr& output, const std::string& text);
// A daemon status: 0 ends with a true result, anything else with the error
// failurePrefix + the status text + line feed alone.
void EndWithDaemonStatus(const OutputPtr& output, TarnLib_Status status,
                         const std::string& failurePrefix);

}  // namespace TarnNamespace
}  // namespace HalvikCli
