// Runs the built hyracli binary against the test plug-ins.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace {

namespace fs = std::filesystem;

std::string Quote(const std::string& text) {
  std::string quoted = "'";
  for (char c : text) quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
  return quoted + "'";
}

std::string Read(const fs::path& path) {
  std::stringstream text;
  text << std::ifstream(path).rdbuf();
  return text.str();
}

class EndToEndTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (fs::temp_directory_path() / "hyracli-test-XXXXXX").string();
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    dir_ = pattern;
  }
  void TearDown() override { fs::remove_all(dir_); }

  // Runs the tool with "status|stdout|stderr" as answer; the caller's plug-in
  // directory setting is not passed on.
  std::string Run(const std::vector<std::string>& args, const std::string& environment = "") {
    std::string command = "env -u HYRACLI_PLUGIN_DIR HYRACLI_TEST_TRACE=" + Quote(dir_ / "trace") +
                          " " + environment + " " + Quote(HYRACLI_BINARY);
    for (const std::string& arg : args) command += " " + Quote(arg);
    command += " >" + Quote(dir_ / "out") + " 2>" + Quote(dir_ / "err");
    int raw = std::system(command.c_str());
    int status = WIFEXITED(raw) ? WEXITSTATUS(raw) : 128 + WTERMSIG(raw);
    return std::to_string(status) + "|" + Read(dir_ / "out") + "|" + Read(dir_ / "err");
  }

  fs::path dir_;
};

TEST_F(EndToEndTest, PluginsRegisterInNameOrderAndTheirCommandsRun) {
  EXPECT_EQ(Run({"storage", "sample", "hello"}, "HYRACLI_PLUGIN_DIR=" + Quote(GOOD_PLUGIN_DIR)),
            "0|Hello\n|");
  // Both commands died with the tree, before their libraries were unloaded.
  EXPECT_EQ(Read(dir_ / "trace"), "Hello destroyed\nBye destroyed\n");
  EXPECT_EQ(Run({"--plugin-dir=" GOOD_PLUGIN_DIR, "storage", "sample"}),
            "0|Usage: hyracli storage sample <namespace|command> ...\n\nSample commands.\n\n"
            "Commands:\n  hello  Say Hello.\n  bye    Say Bye.\n|");

  // Only regular files named *.plugin.so count; a link to one is one.
  fs::path plugins = dir_ / "plugins";
  fs::create_directories(plugins / "dir.plugin.so");
  fs::create_symlink(FIRST_PLUGIN, plugins / "a.plugin.so");
  for (const char* name : {"notes.txt", "old.plugin.so.bak", ".plugin.so"}) {
    std::ofstream(plugins / name) << "not a library";
  }
  EXPECT_EQ(Run({"--plugin-dir", plugins, "storage", "sample", "hello"}), "0|Hello\n|");
}

TEST_F(EndToEndTest, PluginFailuresExitWithStatusThreeAndSayWhy) {
  fs::create_directories(dir_ / "junk");
  std::ofstream(dir_ / "junk" / "broken.plugin.so") << "not a library";
  const std::string prefix = "3||hyracli: ";
  EXPECT_EQ(Run({"--plugin-dir", FAILING_PLUGIN_DIR, "storage"}),
            prefix + "Cannot register plug-in " FAILING_PLUGIN_DIR
                     "/failing.plugin.so: Unable to initialize tarnLib "
                     "(internal/StorageContainerLoad:42)\n"
                     "hyracli: hint: if the simulated Tarnd is stopped, start it with "
                     "'hyrasim daemon start'\n");
  // What the failing entry registered was dropped while its code was loaded.
  EXPECT_EQ(Read(dir_ / "trace"), "Leftover destroyed\n");
  EXPECT_EQ(Run({"--plugin-dir", NOENTRY_PLUGIN_DIR}),
            prefix + "Cannot load plug-in " NOENTRY_PLUGIN_DIR
                     "/noentry.plugin.so: it has no entry AutoCli_RegisterNamespaces\n");
  const std::string junk =
      prefix + "Cannot load plug-in " + (dir_ / "junk/broken.plugin.so").string();
  EXPECT_EQ(Run({"--plugin-dir", dir_ / "junk"}).substr(0, junk.size()), junk);
  // Global options are checked before any plug-in is loaded.
  EXPECT_EQ(Run({"--formatter", "yaml", "--plugin-dir", FAILING_PLUGIN_DIR}).substr(0, 4), "2||h");
}

TEST_F(EndToEndTest, VersionsAndAnEmptyPluginDirectoryAreReported) {
  // Plug-ins built without a version note are still listed.
  EXPECT_EQ(Run({"--version", "--plugin-dir", GOOD_PLUGIN_DIR}),
            std::string("0|hyracli ") + HYRA_VERSION +
                "\n10-first.plugin.so (no version)\n20-second.plugin.so (no version)\n|");
  fs::create_directories(dir_ / "empty");
  EXPECT_EQ(Run({"--plugin-dir", dir_ / "empty", "storage", "internal"}),
            "2||hyracli: Unknown namespace or command 'internal' in 'hyracli storage'\n"
            "Run 'hyracli storage --help' for help.\n"
            "hyracli: no plug-in was loaded from " +
                (dir_ / "empty").string() + " (plug-ins are its *.plugin.so files)\n");
}

}  // namespace
