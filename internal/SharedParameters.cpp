#include "SharedParameters.h"

#include <limits>
#include <sstream>

#include "CommandSpecs.h"
#include "ParameterNames.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::InputSpec;
using Fendle::CallSpec::ParameterType;

boost::shared_ptr<InputSpec> DeclareFaultRuleParameters() {
  return DeclareParameters({
      {kFault, "f", ParameterType::String, kRequired, kFaultHelp},
      {kOperation, "o", ParameterType::String, kOptional,
       "The Kiro op (e.g. - \"createVirtualVolume\") as listed in the Kiro 2.0 specification "
       "-- omit this parameter to create a 'wildcard' rule which injects this fault for all "
       "operations for which it is legal."},
      {kFrequency, "n", ParameterType::Int, kOptional,
       "The target frequency in operations.  Either this or time must be specified."},
      {kTime, "t", ParameterType::Int, kOptional,
       "The rule will be triggered if time since last injection exceeds this limit (in ms).  "
       "Either this or frequency must be specified."},
  });
}

boost::shared_ptr<InputSpec> DeclareConfigTarnParameters(const char* nameHelp) {
  return DeclareParameters({
      {kName, "n", ParameterType::String, kOptional, nameHelp},
      {kContainerId, "c", ParameterType::String, kRequired, "StorageContainer ID"},
      {kUuid, "u", ParameterType::String, kOptional, "meta-tarn UUID"},
      {kPriority, kNoAlias, ParameterType::Flag, kOptional, kPriorityFlagHelp},
  });
}

boost::shared_ptr<InputSpec> DeclareVirtualVolumeParameters() {
  return DeclareParameters({
      {kContainerId, "c", ParameterType::String, kRequired,
       "The storage container the Tarn is in."},
      {kUuid, "u", ParameterType::String, kRequired, "The Tarn UUID."},
  });
}

boost::shared_ptr<InputSpec> DeclareCgListParameters(const char* vpNameHelp) {
  return DeclareParameters({
      {kCgId, "c", ParameterType::StringList, kRequired, "List of CG IDs."},
      {kVpName, "n", ParameterType::String, kRequired, vpNameHelp},
  });
}

bool NarrowToInt32(const char* name, int64_t value, int32_t& narrowed, std::string& error) {
  constexpr int64_t kMin = std::numeric_limits<int32_t>::min();
  constexpr int64_t kMax = std::numeric_limits<int32_t>::max();
  if (value < kMin || value > kMax) {
    std::ostringstream text;
    text << "Invalid value for parameter " << name << ": " << value << " is outside the range "
         << kMin << " to " << kMax;
    error = text.str();
    return false;
  }
  narrowed = static_cast<int32_t>(value);
  return true;
}

bool ReadInt32(const Fendle::CallSpec::Input& input, const char* name, int32_t& value,
               std::string& error) {
  return NarrowToInt32(name, input.GetInt(name), value, error);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
