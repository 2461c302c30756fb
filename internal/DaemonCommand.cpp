#include "DaemonCommand.h"

#include <boost/algorithm/string/predicate.hpp>

#include "CommandSpecs.h"
#include "ParameterNames.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "Daemon Command for tarn Operations.";
constexpr char kSource[] = "internal/DaemonCommand";

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

}  // namespace

boost::shared_ptr<DaemonCommand> DaemonCommand::New() {
  return boost::shared_ptr<DaemonCommand>(new DaemonCommand());
}

DaemonCommand::DaemonCommand() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  OpenTarnLib(kSource, __LINE__);
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

}  // namespace TarnNamespace
}  // namespace HalvikCli
