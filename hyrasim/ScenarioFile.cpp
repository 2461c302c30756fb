#include "ScenarioFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "World.h"

namespace HyraSimTool {
namespace {

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

[[noreturn]] void Refuse(const std::string& path, const std::string& why) {
  throw HyraSim::WorldError("cannot read the scenario file " + path + ": " + why);
}

// Why a file of this type is no scenario file, or empty for a regular file.
std::string NotRegular(const struct stat& info) {
  if (S_ISREG(info.st_mode)) return "";
  if (S_ISDIR(info.st_mode)) return "it is a directory, not a regular file";
  if (S_ISFIFO(info.st_mode)) return "it is a named pipe, not a regular file";
  if (S_ISCHR(info.st_mode) || S_ISBLK(info.st_mode)) return "it is a device, not a regular file";
  return "it is not a regular file";
}

void CheckType(const std::string& path, const struct stat& info) {
  const std::string why = NotRegular(info);
  if (!why.empty()) Refuse(path, why);
  if (static_cast<unsigned long long>(info.st_size) > kMaxScenarioFileSize) {
    Refuse(path, "it is larger than 64 MiB");
  }
}

}  // namespace

std::string ReadScenarioFile(const std::string& path) {
  struct stat info;
  // Looked at before opening, so that no pipe or device is ever opened.
  if (stat(path.c_str(), &info) != 0) Refuse(path, std::strerror(errno));
  CheckType(path, info);
  // Non-blocking, so that a pipe put in the file's place since cannot hold
  // the open; what was opened is looked at again.
  const FileDescriptor file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
  if (file.Get() < 0 || fstat(file.Get(), &info) != 0) Refuse(path, std::strerror(errno));
  CheckType(path, info);

  // A file that grows while it is read is still cut off at the cap.
  std::string text;
  char buffer[64 * 1024];
  for (;;) {
    const ssize_t got = read(file.Get(), buffer, sizeof(buffer));
    if (got < 0) {
      if (errno == EINTR) continue;
      Refuse(path, std::strerror(errno));
    }
    if (got == 0) return text;
    text.append(buffer, static_cast<size_t>(got));
    if (text.size() > kMaxScenarioFileSize) Refuse(path, "it is larger than 64 MiB");
  }
}

}  // namespace HyraSimTool
