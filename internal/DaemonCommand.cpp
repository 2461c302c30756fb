#include "DaemonCommand.h"

#include <boost/algorithm/string/predicate.hpp>
#include <optional>
#include <sstream>
#include <vector>

#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"
#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/Int32Values.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Daemon Command for tarn Operations.";
constexpr char kSource[] = "internal/DaemonCommand";
constexpr int kInitLine = 75;

// The daemon's log levels, tried in this order.
struct LogLevelWord {
  const char* word;
  int32_t level;
};
constexpr LogLevelWord kLogLevels[] = {
    {"panic", 2}, {"quiet", 1},    {"error", 4},   {"warning", 8},
    {"info", 16}, {"verbose", 32}, {"trivia", 64},
};
// The level of a word that names none of the above.
constexpr int32_t kDefaultLogLevel = 4;

constexpr char kSpmFailedPrefix[] =
    "TarnLib_SetSPMSpaceEfficiencyManipulationEnabled failed with error, ";
constexpr char kDebugFailedPrefix[] = "TarnLib_DebugCommand  failed with error ";
constexpr char kNeedOneParameter[] =
    "At least one of the parameters --log-level, --dump-objects, --unbind-period, --unbind-now, "
    "--start-pe-apd, --end-pe-apd, --disable-spm-space-efficiency-cmds is needed";
constexpr char kNotifiedPrefix[] = "Notify PE APD command returned containers: ";
constexpr char kNotifiedSeparator[] = ", ";
constexpr int32_t kDumpObjectsValue = 1;
constexpr int32_t kUnbindNowPeriod = 0;

// The value for the daemon: a null pointer leaves its setting unchanged.
const int32_t* SettingOf(const std::optional<int32_t>& value) { return value ? &*value : nullptr; }

// The containers an APD notification affected, each followed by ", ".
// Reported as the command's error: the notification sets no result.
void EndWithNotifiedContainers(const OutputPtr& output,
                               const std::vector<std::string>& containers) {
  std::ostringstream text;
  text << kNotifiedPrefix;
  for (const std::string& container : containers) {
    text << container << kNotifiedSeparator;
  }
  text << "." << std::endl;
  EndWithError(output, text.str());
}

}  // namespace

boost::shared_ptr<DaemonCommand> DaemonCommand::New() {
  return boost::shared_ptr<DaemonCommand>(new DaemonCommand());
}

DaemonCommand::DaemonCommand() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, kInitLine);
}

DaemonCommand::~DaemonCommand() { TarnLib_Exit(); }

int32_t DaemonCommand::GetLogLevelInt(const std::string& word) const {
  for (const LogLevelWord& entry : kLogLevels) {
    if (boost::algorithm::iequals(word, entry.word)) {
      return entry.level;
    }
  }
  return kDefaultLogLevel;
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> DaemonCommand::GetInputSpecInternal() {
  return DeclareParameters({
      {kLogLevel, "l", ParameterType::String, kOptional,
       "log-level <panic|quiet|error|warning|verbose|trivia> log-level is not changed if "
       "parameter is omitted"},
      {kDumpObjects, "d", ParameterType::Flag, kOptional,
       "Dump Tarn daemon memory objects to the logdumping of dameon memory is not done if "
       "parameter is omitted"},
      {kUnbindPeriod, "t", ParameterType::Int, kOptional,
       "Unbind timer interval in microseconds. Unbind Timer interval is defaulted to 5 mins if "
       "parameter is omitted"},
      {kUnbindNow, "u", ParameterType::Flag, kOptional,
       "Set this flag to force unbind now. Unbind will happen on the timer if parameter is "
       "omitted"},
      {kStartPeApd, kNoAlias, ParameterType::String, kOptional,
       "Simulate PE APD start for a given PE. APD simulation is not done if omitted "},
      {kEndPeApd, kNoAlias, ParameterType::String, kOptional,
       "Simulate PE APD end for a given PE. APD simulation is not done if omitted "},
      {kDisableSpmSpaceEfficiencyCmds, kNoAlias, ParameterType::Bool, kOptional,
       "Disable space efficiency capability commands in SPM. This means that Tarn Layer will "
       "not modify profile based on alloctype."},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> DaemonCommand::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void DaemonCommand::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                                    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  std::vector<std::string> containers;

  // The debug settings are collected first, whichever action follows.
  // The period is checked against the daemon's 32 bits only where it is sent.
  std::optional<int32_t> logLevel;
  std::optional<int32_t> dumpObjects;
  std::optional<int64_t> unbindPeriod;
  if (input->IsSet(kLogLevel)) {
    logLevel = GetLogLevelInt(input->GetString(kLogLevel));
  }
  if (input->GetFlag(kDumpObjects)) {
    dumpObjects = kDumpObjectsValue;
  }
  if (input->GetFlag(kUnbindNow)) {
    unbindPeriod = kUnbindNowPeriod;
  } else if (input->IsSet(kUnbindPeriod)) {
    unbindPeriod = input->GetInt(kUnbindPeriod);
  }

  if (input->IsSet(kStartPeApd)) {
    storageInfo.NotifyTarnProtocolEndpointEvent(input->GetString(kStartPeApd),
                                                HostCtl::Storage::PE_APD_START, containers);
    EndWithNotifiedContainers(output, containers);
    return;
  }
  if (input->IsSet(kEndPeApd)) {
    storageInfo.NotifyTarnProtocolEndpointEvent(input->GetString(kEndPeApd),
                                                HostCtl::Storage::PE_APD_END, containers);
    EndWithNotifiedContainers(output, containers);
    return;
  }
  if (input->IsSet(kDisableSpmSpaceEfficiencyCmds)) {
    const TarnLib_Status status = TarnLib_SetSPMSpaceEfficiencyManipulationEnabled(
        !input->GetBool(kDisableSpmSpaceEfficiencyCmds));
    if (status == TARNLIB_OK) {
      EndWithTrue(output);
      return;
    }
    std::ostringstream text;
    text << kSpmFailedPrefix << TarnLib_Err2String(status) << std::endl;
    EndWithErrorAndFinish(output, text.str());
    return;
  }
  if (logLevel || dumpObjects || unbindPeriod) {
    // A period the daemon cannot hold is refused rather than cut to another number.
    std::optional<int32_t> period;
    if (unbindPeriod) {
      int32_t narrowed;
      std::string error;
      if (!NarrowToInt32(kUnbindPeriod, *unbindPeriod, narrowed, error)) {
        EndWithError(output, error);
        return;
      }
      period = narrowed;
    }
    EndWithDaemonStatus(
        output,
        TarnLib_DebugCommand(SettingOf(logLevel), SettingOf(dumpObjects), SettingOf(period)),
        kDebugFailedPrefix);
    return;
  }
  EndWithError(output, kNeedOneParameter);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
