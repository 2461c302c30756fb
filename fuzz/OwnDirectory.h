// A fresh temporary directory of a fuzz run's own, removed when the run ends
// (libFuzzer ends by exit, which destroys static objects).
#pragma once

#include <stdlib.h>

#include <cstdlib>
#include <filesystem>
#include <string>
#include <system_error>

class OwnDirectory {
 public:
  OwnDirectory() {
    std::string directory =
        (std::filesystem::temp_directory_path() / "hyra-fuzz-XXXXXX").string();
    if (mkdtemp(directory.data()) == nullptr) std::abort();
    directory_ = directory;
  }
  ~OwnDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(directory_, ignored);
  }
  OwnDirectory(const OwnDirectory&) = delete;
  OwnDirectory& operator=(const OwnDirectory&) = delete;

  std::string File(const char* name) const { return (directory_ / name).string(); }

 private:
  std::filesystem::path directory_;
};
