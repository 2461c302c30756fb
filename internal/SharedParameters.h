// Parameter sets that several commands declare alike, and values that several
// commands read alike.
#pragma once

#include <boost/shared_ptr.hpp>
#include <cstdint>
#include <string>

#include "Fendle/CallSpec.h"

namespace HalvikCli {
namespace TarnNamespace {

// `fault` as the fault injection rule commands declare it.
inline constexpr char kFaultHelp[] = "The fault name (e.g. - \"STORAGE_FAULT\")";

// `priority` of the config-tarn commands.
inline constexpr char kPriorityFlagHelp[] =
    "Use priority socket to allow out-of-order execution of this request";

// fault, operation, frequency and time of `faultInjection rule add` and `set`.
boost::shared_ptr<Fendle::CallSpec::InputSpec> DeclareFaultRuleParameters();

// name, container-id, uuid and priority of `configtarn mount`, `umount` and
// `remove`, which differ only in the help of name.
boost::shared_ptr<Fendle::CallSpec::InputSpec> DeclareConfigTarnParameters(const char* nameHelp);

// container-id and uuid of the `virtualvolume` commands.
boost::shared_ptr<Fendle::CallSpec::InputSpec> DeclareVirtualVolumeParameters();

// cgid and vp-name of the consistency-group list and sync commands.
boost::shared_ptr<Fendle::CallSpec::InputSpec> DeclareCgListParameters(const char* vpNameHelp);

// An Int parameter that the host or the daemon keeps in 32 bits. A wider value
// is refused rather than cut, which would send a different number: answers
// false with "Invalid value for parameter <name>: <value> is outside the
// range -2147483648 to 2147483647" in error, else true with narrowed set.
bool NarrowToInt32(const char* name, int64_t value, int32_t& narrowed, std::string& error);

// GetInt of the parameter name, narrowed as NarrowToInt32 does.
bool ReadInt32(const Fendle::CallSpec::Input& input, const char* name, int32_t& value,
               std::string& error);

}  // namespace TarnNamespace
}  // namespace HalvikCli
