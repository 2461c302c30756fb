// Long names of the commands' parameters. Each command declares its parameters
// and reads them back through these constants, so the two cannot drift apart.
#pragma once

namespace HalvikCli {
namespace TarnNamespace {

inline constexpr char kActiveVpUrl[] = "activevpurl";
inline constexpr char kArray[] = "array";
inline constexpr char kArrayId[] = "arrayid";
inline constexpr char kCgId[] = "cgid";
inline constexpr char kClear[] = "clear";
inline constexpr char kContainerId[] = "container-id";
inline constexpr char kContainerName[] = "container-name";
inline constexpr char kDesc[] = "desc";
inline constexpr char kDisableSpmSpaceEfficiencyCmds[] = "disable-spm-space-efficiency-cmds";
inline constexpr char kDumpObjects[] = "dump-objects";
inline constexpr char kEnabled[] = "enabled";
inline constexpr char kEndPeApd[] = "end-pe-apd";
inline constexpr char kFault[] = "fault";
inline constexpr char kFrequency[] = "frequency";
inline constexpr char kIsActive[] = "isactive";
inline constexpr char kLogLevel[] = "log-level";
inline constexpr char kName[] = "name";
inline constexpr char kOperation[] = "operation";
inline constexpr char kPath[] = "path";
inline constexpr char kPolicy[] = "policy";
inline constexpr char kPolicyFile[] = "policy-file";
inline constexpr char kPriority[] = "priority";
inline constexpr char kProfile[] = "profile";
inline constexpr char kSize[] = "size";
inline constexpr char kStartPeApd[] = "start-pe-apd";
inline constexpr char kStatus[] = "status";
inline constexpr char kTarn[] = "tarn";
inline constexpr char kTarnIds[] = "tarnids";
inline constexpr char kTime[] = "time";
inline constexpr char kUnbindNow[] = "unbind-now";
inline constexpr char kUnbindPeriod[] = "unbind-period";
inline constexpr char kUuid[] = "uuid";
inline constexpr char kVmUuid[] = "vmuuid";
inline constexpr char kVpName[] = "vp-name";
inline constexpr char kVpUrl[] = "vp-url";

}  // namespace TarnNamespace
}  // namespace HalvikCli
