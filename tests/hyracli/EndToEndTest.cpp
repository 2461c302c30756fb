// Runs the built hyracli binary against the test plug-ins.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace {

namespace fs = std::filesystem;
typedef std::vector<std::string> Words;

std::string Quote(const std::string& text) {
  std::string quoted = "'";
  for (char c : text) quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
  return quoted + "'";
}

std::string ReadFile(const fs::path& path) {
  std::ifstream in(path);
  std::stringstream text;
  text << in.rdbuf();
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

  struct Result {
    int status;
    std::string out;
    std::string err;
  };

  // Runs the tool with only the given plug-in settings in its environment.
  Result Run(const Words& args, const std::string& environment = std::string()) {
    std::string command =
        "env -u HYRACLI_PLUGIN_DIR HYRACLI_TEST_TRACE=" + Quote((dir_ / "trace").string()) + " " +
        environment + " " + Quote(HYRACLI_BINARY);
    for (const std::string& arg : args) command += " " + Quote(arg);
    command += " >" + Quote((dir_ / "out").string()) + " 2>" + Quote((dir_ / "err").string());
    int raw = std::system(command.c_str());
    int status = WIFEXITED(raw) ? WEXITSTATUS(raw) : 128 + WTERMSIG(raw);
    return Result{status, ReadFile(dir_ / "out"), ReadFile(dir_ / "err")};
  }

  std::string Trace() { return ReadFile(dir_ / "trace"); }

  fs::path dir_;
};

TEST_F(EndToEndTest, PluginsRegisterInNameOrderAndTheirCommandsRun) {
  Result hello = Run({"--plugin-dir", GOOD_PLUGIN_DIR, "storage", "sample", "hello", "-n", "Kiro"});
  EXPECT_EQ(hello.status, 0) << hello.err;
  EXPECT_EQ(hello.out, "Hello, Kiro\n");
  EXPECT_EQ(hello.err, "");
  // Both commands die with the tree, before their libraries are unloaded.
  EXPECT_EQ(Trace(), "Hello destroyed\nBye destroyed\n");

  Result bye = Run({"--formatter", "json", "storage", "sample", "bye"},
                   "HYRACLI_PLUGIN_DIR=" + Quote(GOOD_PLUGIN_DIR));
  EXPECT_EQ(bye.status, 0) << bye.err;
  EXPECT_EQ(bye.out, "\"Bye\"\n");

  Result list = Run({"--plugin-dir=" GOOD_PLUGIN_DIR, "storage", "sample"});
  EXPECT_EQ(list.status, 0);
  EXPECT_NE(list.out.find("Commands:\n  hello  Say Hello.\n  bye    Say Bye.\n"), std::string::npos)
      << list.out;

  Result help = Run({"--plugin-dir", GOOD_PLUGIN_DIR, "storage", "sample", "hello", "--help"});
  EXPECT_EQ(help.status, 0);
  EXPECT_EQ(help.out,
            "Usage: hyracli storage sample hello [options]\n\nSay Hello.\n\nOptions:\n"
            "  --name, -n  string  optional\n      Who to greet\n");
}

TEST_F(EndToEndTest, OnlyRegularPluginFilesAreLoaded) {
  fs::path plugins = dir_ / "plugins";
  fs::create_directories(plugins / "dir.plugin.so");
  fs::create_symlink(FIRST_PLUGIN, plugins / "a.plugin.so");
  std::ofstream(plugins / "notes.txt") << "not a library";
  std::ofstream(plugins / "old.plugin.so.bak") << "not a library";
  std::ofstream(plugins / ".plugin.so") << "not a library";

  Result result = Run({"--plugin-dir", plugins.string(), "storage", "sample", "hello"});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.out, "Hello\n");
}

TEST_F(EndToEndTest, PluginFailuresExitWithStatusThreeAndSayWhy) {
  fs::path junk = dir_ / "junk";
  fs::create_directories(junk);
  std::ofstream(junk / "broken.plugin.so") << "not a library";

  const struct {
    std::string directory;
    std::string err;  // a text the message must hold
  } cases[] = {
      {FAILING_PLUGIN_DIR,
       "failing.plugin.so: Unable to initialize tarnLib (internal/StorageContainerLoad:42)\n"},
      {NOENTRY_PLUGIN_DIR, "noentry.plugin.so: it has no entry AutoCli_RegisterNamespaces\n"},
      {junk.string(), "Cannot load plug-in " + (junk / "broken.plugin.so").string()},
      {(dir_ / "missing").string(), "Cannot read plug-in directory"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.directory);
    Result result = Run({"--plugin-dir", c.directory, "storage"});
    EXPECT_EQ(result.status, 3);
    EXPECT_EQ(result.out, "");
    EXPECT_EQ(result.err.rfind("hyracli: ", 0), 0u) << result.err;
    EXPECT_NE(result.err.find(c.err), std::string::npos) << result.err;
  }
  // What the failing entry registered was dropped while its code was loaded.
  EXPECT_EQ(Trace(), "leftover destroyed\n");

  // A usage error of the global options is found before any plug-in is loaded.
  Result usage = Run({"--formatter", "xml", "--plugin-dir", FAILING_PLUGIN_DIR});
  EXPECT_EQ(usage.status, 2);
}

}  // namespace
