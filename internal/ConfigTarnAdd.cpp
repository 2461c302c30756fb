#include "ConfigTarnAdd.h"

#include <cstdint>
#include <string>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ConfigTarnAction.h"
#include "support/ParameterNames.h"
#include "support/PolicyFile.h"
#include "support/SharedParameters.h"
#include "support/TarnFileSystemList.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "ConfigTarnAdd a config Tarn in a given Tarn StorageContainer.";
constexpr char kUnreadablePolicyFile[] = "Unable to read policy file ";
constexpr char kCreateFailed[] = "Failed to create Config-Tarn. ";

}  // namespace

boost::shared_ptr<ConfigTarnAdd> ConfigTarnAdd::New() {
  return boost::shared_ptr<ConfigTarnAdd>(new ConfigTarnAdd());
}

ConfigTarnAdd::ConfigTarnAdd() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> ConfigTarnAdd::GetInputSpecInternal() {
  return DeclareParameters({
      {kName, "n", ParameterType::String, kRequired, "Directory Name"},
      {kContainerId, "c", ParameterType::String, kRequired, "StorageContainer ID"},
      {kSize, "s", ParameterType::Int, kOptional, "Size of the meta-tarn object in MB"},
      {kPolicy, "p", ParameterType::String, kOptional, "Policy string for meta-tarn object"},
      {kVmUuid, "v", ParameterType::String, kOptional, "VM Uuid string for meta-tarn object"},
      {kPolicyFile, "f", ParameterType::String, kOptional, "Policy file for meta-tarn object"},
      {kPriority, kNoAlias, ParameterType::Flag, kOptional, kPriorityFlagHelp},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> ConfigTarnAdd::GetOutputSpecInternal() {
  return DeclareResult(Fendle::MetaObj::MetaBool::New());
}

void ConfigTarnAdd::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                                    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  const std::string name = input->GetString(kName);
  const std::string containerId = input->GetString(kContainerId);
  const bool priority = input->IsSet(kPriority);
  const int64_t sizeMB = input->IsSet(kSize) ? input->GetInt(kSize) : 0;
  const std::string vmUuid = input->IsSet(kVmUuid) ? input->GetString(kVmUuid) : std::string();

  // A policy file wins over a policy given inline, which is then not read.
  std::string policy;
  if (input->IsSet(kPolicyFile)) {
    const std::string path = input->GetString(kPolicyFile);
    // Going on without the policy the user asked for would lose it silently.
    if (!ReadPolicyLine(path, policy)) {
      EndWithErrorAndFalse(output, kUnreadablePolicyFile + path);
      return;
    }
  } else if (input->IsSet(kPolicy)) {
    policy = input->GetString(kPolicy);
  }

  const TarnFileSystemList systems = TakeTarnFileSystems(storageInfo);
  HostCtl::Storage::TarnFileSystem* container = FindByContainerId(systems, containerId);
  if (container == nullptr) {
    EndWithErrorAndFalse(output, kContainerNotFound + containerId);
    return;
  }
  try {
    std::string createdPath;  // the host tells where it created the object; not needed here
    container->CreateConfigTarn(name, policy, sizeMB, vmUuid, createdPath, std::string(), priority);
    EndWithTrue(output);
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, kCreateFailed + e.GetMessage(false));
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli
