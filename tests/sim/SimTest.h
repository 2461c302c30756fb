// Shared test support: every test gets a fresh world in a temporary
// directory, and can run hyrasim and the probe program against it.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/wait.h>

#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <sstream>
#include <string>

#include "TarnLib/TarnLib.h"
#include "TarnLibSim.h"
#include "World.h"

namespace SimTest {

// Demo world ids the tests rely on.
constexpr const char* kGoldId = "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f";
constexpr const char* kSilverId = "9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d";
constexpr const char* kLegacyId = "1a2b3c4d-5e6f-4a7b-8c9d-0e1f2a3b4c5d";
constexpr const char* kGoldTarn = "0c9e2d1a-3b4f-4a5e-8f70-112233445566";
constexpr const char* kGoldConfigTarn = "5d2f7a10-6b1c-4e3d-9a8b-7c6d5e4f3a2b";
constexpr const char* kSilverUnknownUnshared = "3e4f5a6b-7c8d-4e9f-a0b1-c2d3e4f5a6b7";

struct ToolResult {
  int status = -1;
  std::string out, err;
};

class FreshWorld : public ::testing::Test {
 protected:
  void SetUp() override {
    char pattern[] = "/tmp/simtest-XXXXXX";
    ASSERT_NE(mkdtemp(pattern), nullptr);
    dir_ = pattern;
    setenv("HYRA_SIM_DB", (dir_ / "world.db").c_str(), 1);
    HyraSim::InitDemo();
    TarnLibSim_ResetCounters();
  }
  void TearDown() override { std::filesystem::remove_all(dir_); }

  std::string Path(const std::string& name) const { return (dir_ / name).string(); }
  void WriteFile(const std::string& name, const std::string& text) const {
    std::ofstream(Path(name), std::ios::binary) << text;
  }
  static std::string ReadText(const std::string& path) {
    std::ostringstream text;
    text << std::ifstream(path, std::ios::binary).rdbuf();
    return text.str();
  }

  // Runs a program of the build with arguments given as one shell-quoted text.
  ToolResult Run(const std::string& program, const std::string& arguments) const {
    const int raw =
        std::system((program + " " + arguments + " >" + Path("out") + " 2>" + Path("err")).c_str());
    return {WIFEXITED(raw) ? WEXITSTATUS(raw) : -1, ReadText(Path("out")), ReadText(Path("err"))};
  }
  ToolResult Hyrasim(const std::string& arguments) const { return Run(HYRASIM_PATH, arguments); }
  ToolResult Probe(const std::string& arguments) const { return Run(SIM_PROBE_PATH, arguments); }

  static nlohmann::ordered_json World() {
    return nlohmann::ordered_json::parse(HyraSim::ExportScenario());
  }

  std::filesystem::path dir_;
};

// Holds one opening of the daemon client library for a test scope.
struct Opened {
  Opened() : ok(TarnLib_Init(0, 0)) {}
  ~Opened() {
    if (ok) TarnLib_Exit();
  }
  Opened(const Opened&) = delete;
  Opened& operator=(const Opened&) = delete;
  const bool ok;
};

}  // namespace SimTest
