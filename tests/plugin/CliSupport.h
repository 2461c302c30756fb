// Shared pieces of the end-to-end tests: hyracli with the plug-in beside it,
// against a world that hyrasim sets up, arms and shows. Each test starts from
// the demo world in a fresh temporary directory.
#pragma once

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <ostream>
#include <string>
#include <vector>

namespace PluginCliTest {

struct Outcome {
  int status;
  std::string out;
  std::string err;
};

bool operator==(const Outcome& a, const Outcome& b);
std::ostream& operator<<(std::ostream& os, const Outcome& o);

class CliTest : public ::testing::Test {
 protected:
  void SetUp() override;
  void TearDown() override;

  // Runs the tool at path with args; answers its status, stdout and stderr.
  Outcome Tool(const char* path, const std::vector<std::string>& args);
  // hyracli [globalOptions] storage internal tarn <args>
  Outcome Tarn(std::vector<std::string> args, const std::vector<std::string>& globalOptions = {});
  // hyracli storage internal tarn kiroprovider <args>
  Outcome Provider(std::vector<std::string> args);
  // hyrasim <args>
  Outcome Sim(const std::vector<std::string>& args);
  // hyrasim show --json
  nlohmann::json World();

  std::string directory_;
};

}  // namespace PluginCliTest
