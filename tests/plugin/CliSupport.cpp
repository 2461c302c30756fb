#include "CliSupport.h"

#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace PluginCliTest {
namespace {

std::string Quoted(const std::string& word) {
  std::string quoted = "'";
  for (char c : word) quoted += (c == '\'') ? std::string("'\\''") : std::string(1, c);
  return quoted + "'";
}

std::string ReadFile(const std::string& path) {
  std::ostringstream text;
  text << std::ifstream(path).rdbuf();
  return text.str();
}

}  // namespace

bool operator==(const Outcome& a, const Outcome& b) {
  return a.status == b.status && a.out == b.out && a.err == b.err;
}

std::ostream& operator<<(std::ostream& os, const Outcome& o) {
  return os << "status " << o.status << ", out \"" << o.out << "\", err \"" << o.err << "\"";
}

void CliTest::SetUp() {
  std::string pattern = (std::filesystem::temp_directory_path() / "plugin-cli-XXXXXX").string();
  ASSERT_NE(mkdtemp(pattern.data()), nullptr);
  directory_ = pattern;
  setenv("HYRA_SIM_DB", (directory_ + "/world.db").c_str(), 1);
  ASSERT_EQ(Sim({"init", "--demo"}).status, 0);
}

void CliTest::TearDown() {
  unsetenv("HYRA_SIM_DB");
  std::error_code ignored;
  std::filesystem::remove_all(directory_, ignored);
}

Outcome CliTest::Tool(const char* path, const std::vector<std::string>& args) {
  const std::string outPath = directory_ + "/stdout", errPath = directory_ + "/stderr";
  std::string command = Quoted(path);
  for (const auto& arg : args) command += " " + Quoted(arg);
  const int status =
      std::system((command + " >" + Quoted(outPath) + " 2>" + Quoted(errPath)).c_str());
  return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, ReadFile(outPath), ReadFile(errPath)};
}

Outcome CliTest::Tarn(std::vector<std::string> args,
                      const std::vector<std::string>& globalOptions) {
  args.insert(args.begin(), {"storage", "internal", "tarn"});
  args.insert(args.begin(), globalOptions.begin(), globalOptions.end());
  return Tool(HYRACLI_PATH, args);
}

Outcome CliTest::Provider(std::vector<std::string> args) {
  args.insert(args.begin(), "kiroprovider");
  return Tarn(args);
}

Outcome CliTest::Sim(const std::vector<std::string>& args) { return Tool(HYRASIM_PATH, args); }

nlohmann::json CliTest::World() { return nlohmann::json::parse(Sim({"show", "--json"}).out); }

}  // namespace PluginCliTest
