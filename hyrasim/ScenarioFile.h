// Reading the scenario file that `hyrasim init --scenario` is given.
#pragma once

#include <cstddef>
#include <string>

namespace HyraSimTool {

// The largest scenario file read; a world of many thousand containers fits.
constexpr size_t kMaxScenarioFileSize = 64 * 1024 * 1024;

// The whole text of the regular file at path (links followed). Throws
// HyraSim::WorldError, saying why, for anything else: a directory, a named
// pipe, a device such as /dev/zero, a socket, a file larger than
// kMaxScenarioFileSize, or one that cannot be opened or read. Never blocks:
// what is not a regular file is refused before anything is read from it.
std::string ReadScenarioFile(const std::string& path);

}  // namespace HyraSimTool
