#include <gtest/gtest.h>

#include <sstream>

#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"
#include "hyracli/HyraCli.h"
#include "tests/fendle/TestCommand.h"

namespace {

using namespace Fendle::MetaObj;
using Fendle::AutoCli::Namespace;
using Fendle::CallSpec::ParameterType;
using FendleTest::In;
using FendleTest::Out;
using FendleTest::TestCommand;
using Words = std::vector<std::string>;

// What "act" does is named by --do; any other word is echoed.
void Act(const In& in, const Out& out) {
  const std::string what = in->GetString("do");
  if (what == "osk") {
    throw OskCtl::Lib::OskCtlException("Unable to initialize tarnLib", "internal/Act", 9,
                                       HostCtl::Lib::KelmMessage());
  }
  if (what == "other") throw 42;
  if (what == "half") {
    out->SetError("reported first");
    throw HostCtl::Lib::HostCtlException("then thrown", HostCtl::Lib::KelmMessage());
  }
  if (what.compare(0, 4, "err:") == 0) {
    out->SetError(what.substr(4));
    return;
  }
  if (what == "fail") {
    out->SetError("first");
    out->SetError("second\n");
    out->SetResult(MetaBool::New(false));
  } else if (what == "rows") {
    auto rows = MetaList::New(MetaType::Struct);
    for (const char* id : {"t1", "tarn-22"}) {
      auto row = MetaStruct::New("TarnsAreAccessible");
      row->SetField("Status", "accessible");
      row->SetField("TarnId", id);
      rows->Append(row);
    }
    out->SetResult(rows);
  } else if (what != "empty") {
    out->SetResult(MetaString::New(what));
  }
  if (what != "unfinished") out->Finish();
}

class HyraCliTest : public ::testing::Test {
 protected:
  void SetUp() override {
    auto test = Namespace::New();
    test->SetDescription("Test  commands ");
    root_->GetNamespaceNode("storage")->RegisterNamespaceNode(test, "test");
    test->RegisterNamespaceNode(Namespace::New(), "inner");
    act_->SetDefaultOutputFormatter("table");
    act_->SetDefaultOutputParameter("fields:TarnsAreAccessible", "TarnId,Status");
    test->RegisterNamespaceNode(act_, "act");
    test->RegisterNamespaceNode(TestCommand::New(), "idle");
  }

  boost::shared_ptr<Namespace> root_ = Hyracli::NewRootNamespace();
  boost::shared_ptr<TestCommand> act_ = TestCommand::New(
      "Act on a \"word\"  now.", Act,
      FendleTest::Spec({{"do", ParameterType::String, "d", true, "What to \"do\" "},
                        {"tag", ParameterType::StringList, "", false, "Tags "},
                        {"force", ParameterType::Flag, "f", false, ""}}));
};

const char kActHelp[] =
    "Usage: hyracli storage test act [options]\n\nAct on a \"word\"  now.\n\nOptions:\n"
    "  --do, -d  string  required\n      What to \"do\" \n"
    "  --tag  string-list  optional\n      Tags \n  --force, -f  flag  optional\n";
const char kTestList[] =
    "Usage: hyracli storage test <namespace|command> ...\n\nTest  commands \n\n"
    "Namespaces:\n  inner\n\nCommands:\n  act   Act on a \"word\"  now.\n  idle\n";
const char kTable[] =
    "TarnId   Status\n-------  ----------\nt1       accessible\ntarn-22  accessible\n";

// Runs the tool in-process; answers "status|stdout|stderr".
std::string RunTool(const boost::shared_ptr<Namespace>& root, const Words& args) {
  std::ostringstream out, err;
  int status = Hyracli::Run(args, root, out, err);
  return std::to_string(status) + "|" + out.str() + "|" + err.str();
}

TEST_F(HyraCliTest, StatusAndStreamsOfEveryOutcome) {
  const std::string usage = "\nRun 'hyracli --help' for help.\n";
  const std::string actUsage = "\nRun 'hyracli storage test act --help' for help.\n";
  const std::pair<Words, std::string> cases[] = {
      // Results, with the default formatter or the one asked for; hints hold for both.
      {{"storage", "test", "act", "-d", "hi"}, "0|hi\n|"},
      {{"--formatter", "json", "storage", "test", "act", "-d", "hi\n"}, "0|\"hi\\n\"\n|"},
      {{"storage", "test", "act", "-d", "rows"}, std::string("0|") + kTable + "|"},
      // Help, wherever it is asked.
      {{"storage", "test", "act", "--help"}, std::string("0|") + kActHelp + "|"},
      {{"--help", "storage", "test", "act", "-d", "x"}, std::string("0|") + kActHelp + "|"},
      {{"storage", "test", "act", "-d", "x", "--help"}, std::string("0|") + kActHelp + "|"},
      // ... but not where it is an option's value.
      {{"storage", "test", "act", "-d", "--help"}, "0|--help\n|"},
      {{"storage", "test", "act", "--tag", "--help", "-d", "x"}, "0|x\n|"},
      // An input specification made per call must live while the help is written.
      {{"storage", "test", "idle", "--help"},
       "0|Usage: hyracli storage test idle\n\nOptions: none\n|"},
      {{"storage", "--help", "test"}, std::string("0|") + kTestList + "|"},
      // Failures: standard error only, even beside a false result.
      {{"storage", "test", "act", "-d", "fail"}, "1||first\nsecond\n"},
      {{"storage", "test", "act", "-d", "unfinished"},
       "1||hyracli: the command ended without finishing\n"},
      {{"storage", "test", "act", "-d", "empty"},
       "1||hyracli: the command finished without a result\n"},
      {{"storage", "test", "idle"}, "1||The command 'storage test idle' is not implemented.\n"},
      {{"storage", "test", "act", "-d", "osk"}, "1||hyracli: Unable to initialize tarnLib\n"},
      {{"storage", "test", "act", "-d", "other"},
       "1||hyracli: the command failed with an unknown exception\n"},
      {{"storage", "test", "act", "-d", "half"}, "1||reported first\nhyracli: then thrown\n"},
      // Usage errors, found before the command runs.
      {{"storage", "nope"},
       "2||hyracli: Unknown namespace or command 'nope' in 'hyracli storage'\n"
       "Run 'hyracli storage --help' for help.\n"},
      {{"storage", "--x"},
       "2||hyracli: 'hyracli storage' is a namespace and takes no option '--x'\n"
       "Run 'hyracli storage --help' for help.\n"},
      {{"storage", "test", "act"}, "2||hyracli: Missing required option: --do" + actUsage},
      {{"--formatter", "yaml", "storage", "test", "act", "-d", "x"},
       "2||hyracli: Unknown formatter 'yaml'; choose simple, table, json, xml, csv or keyvalue" +
           usage},
      {{"--formatter"}, "2||hyracli: Option --formatter needs a value" + usage},
      {{"--formatter", "json", "--formatter", "table"},
       "2||hyracli: Option --formatter is given more than once" + usage},
      {{"--verbose", "storage"}, "2||hyracli: Unknown global option '--verbose'" + usage},
  };
  for (const auto& c : cases) EXPECT_EQ(RunTool(root_, c.first), c.second);
  // Once per run of "act" above: help and usage errors never ran it.
  EXPECT_EQ(act_->runs_, 11);
}

TEST_F(HyraCliTest, GlobalOptionsHelpWordsAndTheTerminatorWhereverUsersPutThem) {
  const std::string actUsage = "\nRun 'hyracli storage test act --help' for help.\n";
  const std::pair<Words, std::string> cases[] = {
      // The formatter after the command's options, by either name, in any case.
      {{"storage", "test", "act", "-d", "x", "--formatter", "json"}, "0|\"x\"\n|"},
      {{"storage", "test", "act", "-d", "x", "-o", "JSON"}, "0|\"x\"\n|"},
      {{"storage", "test", "act", "--formatter=CSV", "-d", "x"}, "0|value\r\nx\r\n|"},
      {{"-o", "KeyValue", "storage", "test", "act", "-d", "x"}, "0|value=x\n|"},
      // ... but not where it is an option's value or after "--".
      {{"storage", "test", "act", "-d", "--formatter"}, "0|--formatter\n|"},
      {{"storage", "test", "act", "-d", "x", "--", "--formatter", "json"},
       "2||hyracli: Unexpected argument '--formatter'" + actUsage},
      {{"-o", "json", "storage", "test", "act", "-d", "x", "--formatter", "table"},
       "2||hyracli: Option --formatter is given more than once" + actUsage},
      {{"storage", "test", "act", "-d", "x", "--formatter", "jsno"},
       "2||hyracli: Unknown formatter 'jsno'; choose simple, table, json, xml, csv or keyvalue\n"
       "Did you mean 'json'?" +
           actUsage},
      // Help by -h and by the word help, before the words or after a namespace.
      {{"storage", "test", "act", "-h"}, std::string("0|") + kActHelp + "|"},
      {{"help", "storage", "test", "act"}, std::string("0|") + kActHelp + "|"},
      {{"storage", "-h", "test"}, std::string("0|") + kTestList + "|"},
      {{"storage", "test", "help"}, std::string("0|") + kTestList + "|"},
      // "--" ends the global options, then the command's.
      {{"--", "storage", "test", "act", "-d", "x", "--"}, "0|x\n|"},
      // Suggestions for a near miss; none for nonsense.
      {{"storage", "tset"},
       "2||hyracli: Unknown namespace or command 'tset' in 'hyracli storage'\n"
       "Did you mean 'test'?\nRun 'hyracli storage --help' for help.\n"},
      {{"storage", "test", "ACT"},
       "2||hyracli: Unknown namespace or command 'ACT' in 'hyracli storage test'\n"
       "Did you mean 'act'?\nRun 'hyracli storage test --help' for help.\n"},
      {{"storage", "qqqqqq"},
       "2||hyracli: Unknown namespace or command 'qqqqqq' in 'hyracli storage'\n"
       "Run 'hyracli storage --help' for help.\n"},
      {{"--formater", "json"},
       "2||hyracli: Unknown global option '--formater'\nDid you mean '--formatter'?\n"
       "Run 'hyracli --help' for help.\n"},
      {{"--version"}, std::string("0|hyracli ") + HYRA_VERSION + "\n|"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(RunTool(root_, c.first), c.second) << testing::PrintToString(c.first);
  }
}

TEST_F(HyraCliTest, TextsForTheTerminalAreEscapedAndHugeErrorsCut) {
  // A result and an error that carry terminal escape sequences.
  EXPECT_EQ(RunTool(root_, {"storage", "test", "act", "-d",
                            "a\x1B]0;owned\x07"
                            "b"}),
            "0|a\\x1B]0;owned\\x07b\n|");
  EXPECT_EQ(RunTool(root_, {"storage", "test", "act", "-d", "err:bad \x1B[2J\r"}),
            "1||bad \\x1B[2J\\x0D\n");
  EXPECT_EQ(RunTool(root_, {"storage", "\x1B[31m"}).substr(0, 57),
            "2||hyracli: Unknown namespace or command '\\x1B[31m' in 'h");
  // A 100 KiB value echoed by an error is cut, at a character boundary.
  const std::string huge = std::string(4095, 'v') + "\xC3\xA4" + std::string(100 * 1024, 'v');
  const std::string cut = RunTool(root_, {"storage", "test", "act", "-d", "err:" + huge});
  EXPECT_EQ(cut, "1||" + std::string(4095, 'v') + "... (cut, " + std::to_string(huge.size()) +
                     " bytes in all)\n");
}

}  // namespace
