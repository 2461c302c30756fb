#include <gtest/gtest.h>

#include <functional>

#include "Fendle/AutoCli.h"
#include "HostCtl/Lib.h"
#include "TestCommand.h"

namespace {

using Fendle::AutoCli::Namespace;
using Fendle::AutoCli::NamespaceNode;
using Fendle::CallSpec::ParameterType;
using FendleTest::Parameter;
using FendleTest::TestCommand;

typedef std::vector<std::string> Words;

TEST(NamespaceTreeTest, ChildrenKeepRegistrationOrderNamesAndParents) {
  boost::shared_ptr<Namespace> root = Namespace::New();
  root->SetName("hyracli");
  boost::shared_ptr<Namespace> storage = Namespace::New();
  root->RegisterNamespaceNode(storage, "storage");
  for (const char* name : {"zeta", "alpha", "mid"}) {
    storage->RegisterNamespaceNode(Namespace::New(), name);
  }
  boost::shared_ptr<TestCommand> command = TestCommand::New();
  storage->GetNamespaceNode("alpha")->RegisterNamespaceNode(command, "run");

  EXPECT_EQ(storage->GetNamespaceNodeNames(), (Words{"zeta", "alpha", "mid"}));
  std::vector<boost::shared_ptr<NamespaceNode> > nodes = storage->GetNamespaceNodes();
  ASSERT_EQ(nodes.size(), 3u);
  EXPECT_EQ(nodes[1], storage->GetNamespaceNode("alpha"));
  EXPECT_EQ(nodes[1]->GetName(), "alpha");
  EXPECT_EQ(nodes[1]->GetParent(), storage);
  EXPECT_TRUE(storage->HasNamespaceNode("mid"));
  EXPECT_FALSE(storage->HasNamespaceNode("run"));
  EXPECT_FALSE(storage->GetNamespaceNode("nothing"));

  // The root is not part of a path.
  EXPECT_EQ(command->GetPath(), (Words{"storage", "alpha", "run"}));
  EXPECT_EQ(command->GetPathString('.'), "storage.alpha.run");
  EXPECT_TRUE(root->GetPath().empty());
  EXPECT_FALSE(root->GetParent());
  EXPECT_EQ(command->GetThis(), command);
}

TEST(NamespaceTreeTest, ParentIsNotKeptAliveByItsChildren) {
  boost::shared_ptr<Namespace> child = Namespace::New();
  {
    boost::shared_ptr<Namespace> parent = Namespace::New();
    parent->RegisterNamespaceNode(child, "child");
    EXPECT_TRUE(child->GetParent());
  }
  EXPECT_FALSE(child->GetParent());
  EXPECT_TRUE(child->GetPath().empty());
}

struct RefusalCase {
  const char* label;
  // Makes the call that must be refused, on a tree of root > storage > taken.
  std::function<void(const boost::shared_ptr<Namespace>& storage,
                     const boost::shared_ptr<Namespace>& loose)>
      call;
  const char* named;  // a text the message must hold
};

TEST(NamespaceTreeTest, RefusedRegistrationChangesNothing) {
  const RefusalCase cases[] = {
      {"taken name",
       [](const boost::shared_ptr<Namespace>& storage, const boost::shared_ptr<Namespace>& loose) {
         storage->RegisterNamespaceNode(loose, "taken");
       },
       "'taken' in 'storage'"},
      {"node that has a parent",
       [](const boost::shared_ptr<Namespace>& storage, const boost::shared_ptr<Namespace>& loose) {
         loose->RegisterNamespaceNode(storage->GetNamespaceNode("taken"), "again");
       },
       "storage taken"},
      {"root under its own descendant",
       [](const boost::shared_ptr<Namespace>& storage, const boost::shared_ptr<Namespace>&) {
         boost::dynamic_pointer_cast<Namespace>(storage->GetNamespaceNode("taken"))
             ->RegisterNamespaceNode(storage->GetParent(), "loop");
       },
       "'loop'"},
      {"node under itself",
       [](const boost::shared_ptr<Namespace>&, const boost::shared_ptr<Namespace>& loose) {
         loose->RegisterNamespaceNode(loose, "self");
       },
       "'self'"},
      {"empty node",
       [](const boost::shared_ptr<Namespace>& storage, const boost::shared_ptr<Namespace>&) {
         storage->RegisterNamespaceNode(boost::shared_ptr<NamespaceNode>(), "none");
       },
       "'none'"},
      {"empty name",
       [](const boost::shared_ptr<Namespace>& storage, const boost::shared_ptr<Namespace>& loose) {
         storage->RegisterNamespaceNode(loose, "");
       },
       "'storage'"},
  };
  for (const RefusalCase& c : cases) {
    SCOPED_TRACE(c.label);
    boost::shared_ptr<Namespace> root = Namespace::New();
    root->SetName("hyracli");
    boost::shared_ptr<Namespace> storage = Namespace::New();
    root->RegisterNamespaceNode(storage, "storage");
    boost::shared_ptr<Namespace> taken = Namespace::New();
    storage->RegisterNamespaceNode(taken, "taken");
    boost::shared_ptr<Namespace> loose = Namespace::New();
    loose->SetName("loose");

    try {
      c.call(storage, loose);
      ADD_FAILURE() << "not refused";
    } catch (const HostCtl::Lib::HostCtlException& e) {
      EXPECT_NE(e.GetMessage().find(c.named), std::string::npos) << e.GetMessage();
    }
    EXPECT_EQ(storage->GetNamespaceNodeNames(), Words{"taken"});
    EXPECT_EQ(storage->GetNamespaceNode("taken"), taken);
    EXPECT_EQ(taken->GetParent(), storage);
    EXPECT_TRUE(taken->GetNamespaceNodeNames().empty());
    EXPECT_FALSE(root->GetParent());
    EXPECT_FALSE(loose->GetParent());
    EXPECT_EQ(loose->GetName(), "loose");
    EXPECT_TRUE(loose->GetNamespaceNodeNames().empty());
  }
}

TEST(NamespaceTreeTest, ResolveNodeConsumesOnlyTheWordsOfThePath) {
  boost::shared_ptr<Namespace> root = Namespace::New();
  boost::shared_ptr<Namespace> storage = Namespace::New();
  root->RegisterNamespaceNode(storage, "storage");
  boost::shared_ptr<TestCommand> run = TestCommand::New();
  storage->RegisterNamespaceNode(run, "run");

  struct {
    Words words;
    boost::shared_ptr<NamespaceNode> node;
    Words rest;
  } cases[] = {
      {{}, root, {}},
      {{"storage"}, storage, {}},
      {{"storage", "run", "storage", "--x"}, run, {"storage", "--x"}},
      {{"storage", "nope", "run"}, storage, {"nope", "run"}},
      {{"run"}, root, {"run"}},
  };
  for (auto& c : cases) {
    Words words = c.words;
    EXPECT_EQ(root->ResolveNode(words), c.node);
    EXPECT_EQ(words, c.rest);
  }
}

TEST(CommandTest, FrameworkDefaultsAnswerForWhatACommandDoesNotDeclare) {
  boost::shared_ptr<Namespace> root = Namespace::New();
  boost::shared_ptr<TestCommand> command = TestCommand::New();
  root->RegisterNamespaceNode(command, "idle");

  EXPECT_EQ(command->GetType(), Fendle::AutoCli::NodeType::Command);
  EXPECT_TRUE(command->GetInputSpec()->GetParameters().empty());
  EXPECT_FALSE(command->GetOutputSpec()->GetResultType());

  boost::shared_ptr<Fendle::CallSpec::Output> output = Fendle::CallSpec::Output::New();
  command->Execute(Fendle::CallSpec::Input::New(), output);
  ASSERT_EQ(output->GetErrors().size(), 1u);
  EXPECT_NE(output->GetErrors()[0].find("idle"), std::string::npos);
  EXPECT_NE(output->GetErrors()[0].find("not implemented"), std::string::npos);
  EXPECT_FALSE(output->IsFinished());
  EXPECT_FALSE(output->GetResult());
}

TEST(CommandTest, HintsAndMetadataKeepFirstSetOrderAndReplaceInPlace) {
  boost::shared_ptr<TestCommand> command = TestCommand::New();
  command->SetDefaultOutputParameter("header:A", "%X%");
  command->SetDefaultOutputParameter("fields:A", "X,Y");
  command->SetDefaultOutputParameter("header:A", "%Y%");
  EXPECT_EQ(command->GetDefaultOutputFormatParameters(),
            (TestCommand::Pairs{{"header:A", "%Y%"}, {"fields:A", "X,Y"}}));

  command->SetMetaDataField("type", "fetcher");
  command->SetMetaDataField("owner", "storage");
  command->SetMetaDataField("type", "operation");
  EXPECT_EQ(command->GetMetaData(),
            (TestCommand::Pairs{{"type", "operation"}, {"owner", "storage"}}));
  EXPECT_EQ(command->GetMetaDataField("type"), "operation");
  EXPECT_EQ(command->GetMetaDataField("missing"), "");
  EXPECT_EQ(command->GetDefaultOutputFormatter(), "");
}

TEST(CommandTest, HelpShowsEveryParameterAndTextsExactlyAsDeclared) {
  boost::shared_ptr<Namespace> root = Namespace::New();
  root->SetName("hyracli");
  boost::shared_ptr<Namespace> storage = Namespace::New();
  root->RegisterNamespaceNode(storage, "storage");
  boost::shared_ptr<TestCommand> command =
      TestCommand::New("Check the \"given\"  tarns of a container ");
  storage->RegisterNamespaceNode(command, "check");
  boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = Fendle::CallSpec::InputSpec::New();
  spec->AddParameter(Parameter("path", ParameterType::String, "p", true, "Tarn datastore path"));
  spec->AddParameter(Parameter("tarn", ParameterType::StringList, "", false, "Tarn Uuid "));
  spec->AddParameter(Parameter("force", ParameterType::Flag, "f", false));
  spec->AddParameter(Parameter("priority", ParameterType::Int, "", true, "A \"rank\"  value"));
  command->SetInput(spec);

  EXPECT_EQ(command->GenerateHelpOutput(),
            "Usage: hyracli storage check [options]\n"
            "\n"
            "Check the \"given\"  tarns of a container \n"
            "\n"
            "Options:\n"
            "  --path, -p  string  required\n"
            "      Tarn datastore path\n"
            "  --tarn  string-list  optional\n"
            "      Tarn Uuid \n"
            "  --force, -f  flag  optional\n"
            "  --priority  int  required\n"
            "      A \"rank\"  value\n");

  boost::shared_ptr<TestCommand> bare = TestCommand::New();
  storage->RegisterNamespaceNode(bare, "bare");
  bare->AddExample("hyracli storage bare", "Runs it.");
  EXPECT_EQ(bare->GenerateHelpOutput(),
            "Usage: hyracli storage bare\n\nOptions: none\n\nExamples:\n"
            "  hyracli storage bare\n      Runs it.\n");
}

}  // namespace
