#include <gtest/gtest.h>

#include "Fendle/AutoCli.h"
#include "HostCtl/Lib.h"
#include "TestCommand.h"

namespace {

using Fendle::AutoCli::Namespace;
using Fendle::AutoCli::NamespaceNode;
using FendleTest::TestCommand;
using Node = boost::shared_ptr<NamespaceNode>;
using Words = std::vector<std::string>;

// root "hyracli" > storage > {taken > run}; loose stands apart.
struct Tree {
  Tree() {
    root->SetName("hyracli");
    root->RegisterNamespaceNode(storage, "storage");
    storage->RegisterNamespaceNode(taken, "taken");
    taken->RegisterNamespaceNode(run, "run");
    loose->SetName("loose");
  }
  Node root = Namespace::New(), storage = Namespace::New(), taken = Namespace::New();
  Node loose = Namespace::New(), run = TestCommand::New();
};

TEST(NamespaceTreeTest, ChildrenKeepOrderNameParentAndPath) {
  Tree tree;
  for (const char* name : {"zeta", "alpha"}) {
    tree.storage->RegisterNamespaceNode(Namespace::New(), name);
  }
  EXPECT_EQ(tree.storage->GetNamespaceNodeNames(), (Words{"taken", "zeta", "alpha"}));
  EXPECT_EQ(tree.storage->GetNamespaceNodes()[0], tree.taken);
  EXPECT_EQ(tree.storage->GetNamespaceNode("alpha")->GetName(), "alpha");
  EXPECT_EQ(tree.run->GetParent(), tree.taken);
  EXPECT_EQ(tree.run->GetPath(), (Words{"storage", "taken", "run"}));
  EXPECT_EQ(tree.run->GetPathString('.'), "storage.taken.run");
  EXPECT_TRUE(tree.root->GetPath().empty());
  EXPECT_FALSE(tree.storage->HasNamespaceNode("run"));

  // A child does not keep its parent alive.
  Node orphan = tree.taken;
  tree = Tree();
  EXPECT_FALSE(orphan->GetParent());
}

TEST(NamespaceTreeTest, RefusedRegistrationChangesNothing) {
  Tree t;
  const struct {
    Node parent, node;
    std::string name, message;
  } cases[] = {
      {t.storage, t.loose, "taken",
       "Cannot register 'taken' in 'storage': the name is already taken"},
      {t.loose, t.taken, "again",
       "Cannot register 'again' in 'loose': the node is already registered as 'storage taken'"},
      {t.taken, t.root, "loop",
       "Cannot register 'loop' in 'storage taken': a node cannot be placed below itself"},
      {t.loose, t.loose, "self",
       "Cannot register 'self' in 'loose': a node cannot be placed below itself"},
      {t.storage, nullptr, "none", "Cannot register an empty node as 'none' in 'storage'"},
      {t.storage, t.loose, "", "Cannot register a node without a name in 'storage'"},
  };
  for (const auto& c : cases) {
    try {
      c.parent->RegisterNamespaceNode(c.node, c.name);
      ADD_FAILURE() << "accepted " << c.name;
    } catch (const HostCtl::Lib::HostCtlException& e) {
      EXPECT_EQ(e.GetMessage(), c.message);
    }
  }
  EXPECT_EQ(t.storage->GetNamespaceNodeNames(), Words{"taken"});
  EXPECT_EQ(t.taken->GetNamespaceNodeNames(), Words{"run"});
  EXPECT_EQ(t.taken->GetParent(), t.storage);
  EXPECT_TRUE(t.loose->GetNamespaceNodeNames().empty());
  EXPECT_FALSE(t.root->GetParent() || t.loose->GetParent());
  EXPECT_EQ(t.loose->GetName(), "loose");
}

TEST(CommandTest, SettingAHintAgainReplacesItInPlace) {
  auto command = TestCommand::New();
  command->SetDefaultOutputParameter("header:A", "%X%");
  command->SetDefaultOutputParameter("fields:A", "X,Y");
  command->SetDefaultOutputParameter("header:A", "%Y%");
  EXPECT_EQ(command->GetDefaultOutputFormatParameters(),
            (TestCommand::Pairs{{"header:A", "%Y%"}, {"fields:A", "X,Y"}}));
}

}  // namespace
