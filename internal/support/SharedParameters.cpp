#include "support/SharedParameters.h"

#include "support/CommandSpecs.h"
#include "support/ParameterNames.h"

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

}  // namespace TarnNamespace
}  // namespace HalvikCli
