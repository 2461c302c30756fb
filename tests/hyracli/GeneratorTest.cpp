// The completion and manual page generators on a tree built here, with texts
// that roff and the shells would otherwise misread.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "TestCommand.h"
#include "hyracli/Completion.h"
#include "hyracli/HyraCli.h"
#include "hyracli/ManPage.h"
#include "hyracli/ToolOptionList.h"

namespace {

namespace fs = std::filesystem;
using Fendle::CallSpec::ParameterType;

class GeneratorTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (fs::temp_directory_path() / "hyracli-generator-XXXXXX").string();
    ASSERT_NE(mkdtemp(pattern.data()), nullptr);
    dir_ = pattern;
    root_ = Hyracli::NewRootNamespace();
    auto sample = Fendle::AutoCli::Namespace::New();
    sample->SetDescription("Say 'hi': now, \\ and $HOME `x`");
    command_ = FendleTest::TestCommand::New(
        ".TH fake 9\n\n'quoted line\nback\\slash  twice   ",
        nullptr,
        FendleTest::Spec({
            {"dry-run", ParameterType::Flag, "", false, "-starts with a dash"},
            {"be-nice", ParameterType::Bool, "b", true,
             std::string(150, 'x') + " " + std::string(100, 'y') + "\n.SH NOT A SECTION"},
        }));
    sample->RegisterNamespaceNode(command_, "greet");
    root_->GetNamespaceNode("storage")->RegisterNamespaceNode(sample, "sample");
  }
  void TearDown() override { fs::remove_all(dir_); }

  // Runs a shell command line; answers its exit status and its output in out.
  int Shell(const std::string& line, std::string* out = nullptr) {
    const fs::path file = dir_ / "shell.out";
    const int raw = std::system((line + " >" + file.string() + " 2>&1").c_str());
    std::stringstream text;
    text << std::ifstream(file).rdbuf();
    if (out) *out = text.str();
    return WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
  }

  fs::path Write(const std::string& name, const std::string& text) {
    std::ofstream(dir_ / name) << text;
    return dir_ / name;
  }

  fs::path dir_;
  boost::shared_ptr<Fendle::AutoCli::Namespace> root_;
  boost::shared_ptr<FendleTest::TestCommand> command_;
};

TEST_F(GeneratorTest, ManPagesReadEveryTextLiterallyWithoutWarnings) {
  const std::vector<std::string> files =
      Hyracli::WriteManPages(root_, dir_.string(), {"2026-01-02", "9.9"});
  ASSERT_EQ(files, (std::vector<std::string>{"hyracli.1", "hyracli-storage-sample-greet.1"}));

  std::string lint;
  EXPECT_EQ(Shell("mandoc -Tlint " + (dir_ / "hyracli.1").string() + " " +
                      (dir_ / files[1]).string(),
                  &lint),
            0);
  EXPECT_EQ(lint, "");

  std::string text;
  ASSERT_EQ(Shell("mandoc -Tascii -O width=300 " + (dir_ / files[1]).string() + " | col -b", &text),
            0);
  // Lines that look like requests are text; a backslash stays one.
  EXPECT_NE(text.find(".TH fake 9"), std::string::npos) << text;
  EXPECT_NE(text.find("'quoted line"), std::string::npos) << text;
  EXPECT_NE(text.find("back\\slash"), std::string::npos) << text;
  EXPECT_NE(text.find(".SH NOT A SECTION"), std::string::npos) << text;
  // Long help is wrapped, not cut.
  EXPECT_NE(text.find(std::string(100, 'y')), std::string::npos) << text;
  EXPECT_NE(text.find("--be-nice, -b bool"), std::string::npos) << text;
  EXPECT_NE(text.find("Required."), std::string::npos) << text;
  EXPECT_NE(text.find("-starts with a dash"), std::string::npos) << text;
  EXPECT_NE(text.find("9.9"), std::string::npos) << text;
}

TEST_F(GeneratorTest, ScriptsParseInEveryShellAndCompleteANewCommand) {
  for (const std::string& shell : Hyracli::CompletionShells()) {
    std::ostringstream script;
    ASSERT_TRUE(Hyracli::WriteCompletionScript(shell, root_, script));
    const fs::path file = Write("script." + shell, script.str());
    std::string out;
    if (Shell("command -v " + shell) != 0) continue;  // checked where the shell is installed
    EXPECT_EQ(Shell(shell + " -n " + file.string(), &out), 0) << shell << ": " << out;
  }
  std::ostringstream unknown;
  EXPECT_FALSE(Hyracli::WriteCompletionScript("tcsh", root_, unknown));
  EXPECT_EQ(unknown.str(), "");

  // The command registered here completes, with its Bool option's values.
  const std::string drive =
      "bash -c 'source " + (dir_ / "script.bash").string() +
      "; COMP_WORDS=(hyracli storage sample greet --be-nice \"\"); COMP_CWORD=5;"
      " _hyracli; echo \"${COMPREPLY[*]}\";"
      " COMP_WORDS=(hyracli storage s); COMP_CWORD=2; _hyracli; echo \"${COMPREPLY[*]}\"'";
  std::string out;
  EXPECT_EQ(Shell(drive, &out), 0);
  EXPECT_EQ(out, "true false\nsample\n");
}

TEST_F(GeneratorTest, CompletionWordNeedsExactlyOneKnownShell) {
  std::ostringstream out, err;
  EXPECT_EQ(Hyracli::RunCompletion({}, root_, out, err), Hyracli::kExitUsage);
  EXPECT_EQ(Hyracli::RunCompletion({"bash", "zsh"}, root_, out, err), Hyracli::kExitUsage);
  EXPECT_EQ(Hyracli::RunCompletion({"csh"}, root_, out, err), Hyracli::kExitUsage);
  EXPECT_EQ(out.str(), "");
  EXPECT_EQ(err.str().substr(0, 46), "hyracli: completion takes one shell: bash|zsh|");
  EXPECT_EQ(Hyracli::RunCompletion({"bash", "--help"}, root_, out, err), Hyracli::kExitOk);
  EXPECT_EQ(out.str().substr(0, 40), "Usage: hyracli completion bash|zsh|fish\n");
  out.str("");
  EXPECT_EQ(Hyracli::RunCompletion({"zsh"}, root_, out, err), Hyracli::kExitOk);
  EXPECT_EQ(out.str().substr(0, 17), "#compdef hyracli\n");
}

// The completion scripts and manual pages describe the global options from
// their list; it must hold what the tool takes and what its help shows.
TEST_F(GeneratorTest, GlobalOptionListMatchesWhatTheToolTakesAndShows) {
  std::vector<std::string> listed;
  for (const Hyracli::ToolOption& option : Hyracli::ToolOptionList()) {
    listed.push_back("--" + option.name);
    if (!option.alias.empty()) listed.push_back("-" + option.alias);
    std::vector<std::string> args{"--" + option.name};
    if (option.value == Hyracli::ToolOptionValue::Formatter) args.push_back("json");
    if (option.value == Hyracli::ToolOptionValue::Directory) args.push_back("/tmp");
    EXPECT_NO_THROW(Hyracli::ParseGlobalOptions(args)) << option.name;
  }
  std::ostringstream help, err;
  ASSERT_EQ(Hyracli::Run({}, root_, help, err), Hyracli::kExitOk);
  std::istringstream lines(help.str());
  std::string line;
  while (std::getline(lines, line) && line.rfind("Global options", 0) != 0) {
  }
  int shown = 0;
  while (std::getline(lines, line) && !line.empty()) {
    std::istringstream words(line);
    std::string word;
    while (words >> word && word[0] == '-') {
      if (word.back() == ',') word.pop_back();
      if (word == "--") break;  // the terminator, not an option
      EXPECT_NE(std::find(listed.begin(), listed.end(), word), listed.end()) << word;
      ++shown;
    }
  }
  EXPECT_GT(shown, 0);
}

}  // namespace
