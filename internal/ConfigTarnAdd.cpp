#include "ConfigTarnAdd.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdint>
#include <string>
#include <string_view>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/ConfigTarnAction.h"
#include "support/ParameterNames.h"
#include "support/SharedParameters.h"
#include "support/TarnFileSystemList.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;

namespace {

constexpr char kDescription[] = "ConfigTarnAdd a config Tarn in a given Tarn StorageContainer.";
constexpr char kUnreadablePolicyFile[] = "Unable to read policy file ";
constexpr char kCreateFailed[] = "Failed to create Config-Tarn. ";

// The longest first line taken from a policy file; a longer one is refused
// rather than sent in part or read without end.
constexpr size_t kMaxPolicyLine = 1024 * 1024;

// A file descriptor closed when its owner goes.
class FileDescriptor {
 public:
  explicit FileDescriptor(int fd) : fd_(fd) {}
  ~FileDescriptor() {
    if (fd_ >= 0) close(fd_);
  }
  FileDescriptor(const FileDescriptor&) = delete;
  FileDescriptor& operator=(const FileDescriptor&) = delete;
  int Get() const { return fd_; }

 private:
  int fd_;
};

bool IsRegularFile(const struct stat& info) { return S_ISREG(info.st_mode); }

// Puts the first line of the file at path (without its line feed) into
// policy; an empty file gives an empty policy. False when path is not a
// regular file (after following links), cannot be read, or its first line is
// longer than kMaxPolicyLine. Never blocks on a pipe or a device: those are
// refused before anything is read from them.
bool ReadPolicyLine(const std::string& path, std::string& policy) {
  struct stat info;
  // Looked at before opening, so that no device is ever opened.
  if (stat(path.c_str(), &info) != 0 || !IsRegularFile(info)) return false;
  // Non-blocking, so that a pipe put in the file's place since cannot hold the open.
  const FileDescriptor file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
  if (file.Get() < 0 || fstat(file.Get(), &info) != 0 || !IsRegularFile(info)) return false;

  std::string line;
  char buffer[64 * 1024];
  for (;;) {
    const ssize_t got = read(file.Get(), buffer, sizeof(buffer));
    if (got < 0) {
      if (errno == EINTR) continue;
      return false;
    }
    if (got == 0) break;
    const std::string_view chunk(buffer, static_cast<size_t>(got));
    const size_t end = chunk.find('\n');
    line.append(chunk.substr(0, end));
    if (line.size() > kMaxPolicyLine) return false;
    if (end != std::string_view::npos) break;
  }
  policy = line;
  return true;
}

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
