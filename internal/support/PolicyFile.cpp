#include "support/PolicyFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <string_view>

namespace HalvikCli {
namespace TarnNamespace {
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

bool IsRegularFile(const struct stat& info) { return S_ISREG(info.st_mode); }

}  // namespace

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

}  // namespace TarnNamespace
}  // namespace HalvikCli
