#include <gtest/gtest.h>

#include <sstream>
#include <stdexcept>

#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"
#include "hyracli/HyraCli.h"
#include "tests/fendle/TestCommand.h"

namespace {

using Fendle::AutoCli::Namespace;
using Fendle::CallSpec::Input;
using Fendle::CallSpec::Output;
using Fendle::CallSpec::ParameterType;
using namespace Fendle::MetaObj;
using FendleTest::Parameter;
using FendleTest::TestCommand;

typedef std::vector<std::string> Words;
typedef boost::shared_ptr<Input> In;
typedef boost::shared_ptr<Output> Out;

// The tool's root with "storage test" holding small commands of every outcome.
class HyraCliTest : public ::testing::Test {
 protected:
  void SetUp() override {
    root_ = Hyracli::NewRootNamespace();
    boost::shared_ptr<Namespace> test = Namespace::New();
    test->SetDescription("Test  commands ");
    boost::dynamic_pointer_cast<Namespace>(root_->GetNamespaceNode("storage"))
        ->RegisterNamespaceNode(test, "test");

    echo_ = TestCommand::New("Echo a \"text\"  back.");
    echo_->SetDefaultOutputFormatter("simple");
    boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = Fendle::CallSpec::InputSpec::New();
    spec->AddParameter(
        Parameter("text", ParameterType::String, "t", true, "The text to \"echo\" "));
    spec->AddParameter(Parameter("times", ParameterType::Int, "", false, "How often"));
    echo_->SetInput(spec);
    echo_->SetBody([](const In& in, const Out& out) {
      std::string text;
      for (int64_t i = 0; i < (in->IsSet("times") ? in->GetInt("times") : 1); ++i) {
        text += in->GetString("text");
      }
      out->SetResult(MetaString::New(text));
      out->Finish();
    });
    test->RegisterNamespaceNode(echo_, "echo");

    Add(test, "fail", [](const In&, const Out& out) {
      out->SetError("first");
      out->SetError("second\n");
      out->SetResult(MetaBool::New(false));
      out->Finish();
    });
    Add(test, "yes", [](const In&, const Out& out) {
      out->SetResult(MetaBool::New(true));
      out->Finish();
    });
    Add(test, "unfinished", [](const In&, const Out& out) { out->SetResult(MetaBool::New(true)); });
    Add(test, "empty", [](const In&, const Out& out) { out->Finish(); });
    boost::shared_ptr<TestCommand> throws = Add(test, "throws", [](const In& in, const Out&) {
      const std::string kind = in->GetString("kind");
      if (kind == "osk") {
        throw OskCtl::Lib::OskCtlException("Unable to initialize tarnLib", "internal/Throws", 9,
                                           HostCtl::Lib::KelmMessage());
      }
      if (kind == "host")
        throw HostCtl::Lib::HostCtlException("host failed", HostCtl::Lib::KelmMessage());
      if (kind == "std") throw std::runtime_error("std failed\n");
      throw 42;
    });
    boost::shared_ptr<Fendle::CallSpec::InputSpec> kinds = Fendle::CallSpec::InputSpec::New();
    kinds->AddParameter(Parameter("kind", ParameterType::String, "k", true));
    throws->SetInput(kinds);

    boost::shared_ptr<TestCommand> rows = Add(test, "rows", [](const In&, const Out& out) {
      boost::shared_ptr<MetaList> list = MetaList::New(MetaType::Struct);
      for (const char* id : {"t1", "tarn-22"}) {
        boost::shared_ptr<MetaStruct> row = MetaStruct::New("TarnsAreAccessible");
        row->SetField("TarnId", id);
        row->SetField("Status", "accessible");
        list->Append(row);
      }
      out->SetResult(list);
      out->Finish();
    });
    rows->SetDefaultOutputFormatter("table");
    rows->SetDefaultOutputParameter("fields:TarnsAreAccessible", "TarnId,Status");
    test->RegisterNamespaceNode(TestCommand::New(), "idle");

    boost::shared_ptr<Namespace> group = Namespace::New();
    group->SetDescription("Grouped  things ");
    boost::shared_ptr<Namespace> inner = Namespace::New();
    inner->SetDescription("Inner  stuff ");
    group->RegisterNamespaceNode(inner, "inner");
    group->RegisterNamespaceNode(Namespace::New(), "bare");
    group->RegisterNamespaceNode(TestCommand::New("Run it."), "run");
    test->RegisterNamespaceNode(group, "group");
  }

  boost::shared_ptr<TestCommand> Add(const boost::shared_ptr<Namespace>& parent,
                                     const std::string& name, const TestCommand::Body& body) {
    boost::shared_ptr<TestCommand> command = TestCommand::New();
    command->SetBody(body);
    parent->RegisterNamespaceNode(command, name);
    return command;
  }

  struct Result {
    int status;
    std::string out;
    std::string err;
  };

  Result Run(const Words& args) {
    std::ostringstream out;
    std::ostringstream err;
    int status = Hyracli::Run(args, root_, out, err);
    return Result{status, out.str(), err.str()};
  }

  boost::shared_ptr<Namespace> root_;
  boost::shared_ptr<TestCommand> echo_;
};

const char kEchoHelp[] =
    "Usage: hyracli storage test echo [options]\n"
    "\n"
    "Echo a \"text\"  back.\n"
    "\n"
    "Options:\n"
    "  --text, -t  string  required\n"
    "      The text to \"echo\" \n"
    "  --times  int  optional\n"
    "      How often\n";

const char kGroupList[] =
    "Usage: hyracli storage test group <namespace|command> ...\n"
    "\n"
    "Grouped  things \n"
    "\n"
    "Namespaces:\n"
    "  inner  Inner  stuff \n"
    "  bare\n"
    "\n"
    "Commands:\n"
    "  run  Run it.\n";

TEST_F(HyraCliTest, ResultsGoToStandardOutputWithTheRightFormatter) {
  const struct {
    Words args;
    std::string out;
  } cases[] = {
      {{"storage", "test", "echo", "--text", "hi"}, "hi\n"},
      {{"storage", "test", "echo", "-t", "a\n", "--times", "2"}, "a\na\n"},
      {{"--formatter", "json", "storage", "test", "echo", "-t", "hi\n"}, "\"hi\\n\"\n"},
      {{"--formatter=table", "storage", "test", "echo", "-t", "x"}, "x\n"},
      {{"storage", "test", "yes"}, "true\n"},
      {{"--formatter", "json", "storage", "test", "yes"}, "true\n"},
      {{"storage", "test", "rows"},
       "TarnId   Status\n-------  ----------\nt1       accessible\ntarn-22  accessible\n"},
      {{"--formatter", "simple", "storage", "test", "rows"},
       "TarnsAreAccessible\n  TarnId: t1\n  Status: accessible\n"
       "TarnsAreAccessible\n  TarnId: tarn-22\n  Status: accessible\n"},
      {{"--formatter", "json", "storage", "test", "rows"},
       "[\n  {\n    \"TarnId\": \"t1\",\n    \"Status\": \"accessible\"\n  },\n"
       "  {\n    \"TarnId\": \"tarn-22\",\n    \"Status\": \"accessible\"\n  }\n]\n"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.args));
    Result result = Run(c.args);
    EXPECT_EQ(result.status, Hyracli::kExitOk);
    EXPECT_EQ(result.out, c.out);
    EXPECT_EQ(result.err, "");
  }
}

TEST_F(HyraCliTest, HelpIsWrittenExactlyWhereverItIsAsked) {
  const struct {
    Words args;
    std::string out;
  } cases[] = {
      {{"storage", "test", "echo", "--help"}, kEchoHelp},
      {{"--help", "storage", "test", "echo"}, kEchoHelp},
      {{"storage", "test", "echo", "--text", "x", "--help"}, kEchoHelp},
      {{"storage", "test", "group"}, kGroupList},
      {{"storage", "test", "group", "--help"}, kGroupList},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.args));
    Result result = Run(c.args);
    EXPECT_EQ(result.status, Hyracli::kExitOk);
    EXPECT_EQ(result.out, c.out);
    EXPECT_EQ(result.err, "");
  }
  EXPECT_EQ(echo_->Runs(), 0);

  Result top = Run({});
  EXPECT_EQ(top.status, Hyracli::kExitOk);
  EXPECT_NE(top.out.find("--formatter NAME"), std::string::npos);
  EXPECT_NE(top.out.find("\nNamespaces:\n  storage  Storage related operations.\n"),
            std::string::npos);
}

TEST_F(HyraCliTest, FailuresGoToStandardErrorOnlyWithStatusOne) {
  const struct {
    Words args;
    std::string err;
  } cases[] = {
      // An error wins over the false result the command set beside it.
      {{"storage", "test", "fail"}, "first\nsecond\n"},
      {{"--formatter", "json", "storage", "test", "fail"}, "first\nsecond\n"},
      {{"storage", "test", "unfinished"}, "hyracli: the command ended without finishing\n"},
      {{"storage", "test", "empty"}, "hyracli: the command finished without a result\n"},
      {{"storage", "test", "idle"}, "The command 'storage test idle' is not implemented.\n"},
      {{"storage", "test", "throws", "-k", "osk"}, "hyracli: Unable to initialize tarnLib\n"},
      {{"storage", "test", "throws", "-k", "host"}, "hyracli: host failed\n"},
      {{"storage", "test", "throws", "-k", "std"}, "hyracli: std failed\n"},
      {{"storage", "test", "throws", "-k", "other"},
       "hyracli: the command failed with an unknown exception\n"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.args));
    Result result = Run(c.args);
    EXPECT_EQ(result.status, Hyracli::kExitCommandFailed);
    EXPECT_EQ(result.out, "");
    EXPECT_EQ(result.err, c.err);
  }
}

TEST_F(HyraCliTest, UsageErrorsStopBeforeTheCommandRunsWithStatusTwo) {
  const struct {
    Words args;
    const char* err;  // a text the message must hold
  } cases[] = {
      {{"storage", "nope"}, "hyracli: Unknown namespace or command 'nope' in 'hyracli storage'\n"},
      {{"storage", "test", "group", "run", "x"}, "Unexpected argument 'x'"},
      {{"storage", "--x"}, "takes no option '--x'"},
      {{"storage", "test", "echo"}, "hyracli: Missing required option: --text\n"},
      {{"storage", "test", "echo", "-t", "a", "--times", "x"}, "not an integer"},
      {{"storage", "test", "echo", "-t", "a", "extra"}, "Unexpected argument 'extra'"},
      {{"storage", "test", "echo", "-t", "a", "--bogus"}, "Unknown option '--bogus'"},
      {{"storage", "test", "echo", "-t", "a", "--formatter", "json"},
       "Unknown option '--formatter'"},
      {{"storage", "test", "echo", "-t", "a", "-t", "b"}, "--text is given more than once"},
      {{"--formatter", "xml", "storage", "test", "echo", "-t", "a"}, "Unknown formatter 'xml'"},
      {{"--formatter"}, "--formatter needs a value"},
      {{"--formatter="}, "--formatter needs a value"},
      {{"--formatter", "json", "--formatter=table", "storage"},
       "--formatter is given more than once"},
      {{"--verbose", "storage"}, "Unknown global option '--verbose'"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.args));
    Result result = Run(c.args);
    EXPECT_EQ(result.status, Hyracli::kExitUsage);
    EXPECT_EQ(result.out, "");
    EXPECT_NE(result.err.find(c.err), std::string::npos) << result.err;
  }
  EXPECT_EQ(echo_->Runs(), 0);
}

}  // namespace
