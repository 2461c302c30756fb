// Parameter sets that several commands declare alike.
#pragma once

#include <boost/shared_ptr.hpp>
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

}  // namespace TarnNamespace
}  // namespace HalvikCli
