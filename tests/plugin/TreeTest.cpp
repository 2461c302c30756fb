// The tree the entry hangs under `storage internal`, and how the entry fails.
#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"
#include "PluginTestSupport.h"
#include "TarnLibSim.h"
#include "TarnNamespace.h"

namespace PluginTest {
namespace {

using Fendle::AutoCli::Command;
using Fendle::AutoCli::Namespace;
using Fendle::AutoCli::NamespaceNode;
using Fendle::AutoCli::NodeType;
typedef boost::shared_ptr<NamespaceNode> NodePtr;
typedef boost::shared_ptr<Namespace> NamespacePtr;

// A namespace that notes, for every child registered under it, the child's
// name, the number of commands below the child and the TarnLib_Init calls
// made so far, as "name commands calls".
class WatchingNamespace : public Namespace {
 public:
  static boost::shared_ptr<WatchingNamespace> New() {
    return boost::shared_ptr<WatchingNamespace>(new WatchingNamespace());
  }

  void RegisterNamespaceNode(const NodePtr& node, const std::string& name) override {
    registrations.push_back(name + " " + std::to_string(CountCommands(node)) + " " +
                            std::to_string(TarnLibSim_InitCalls()));
    Namespace::RegisterNamespaceNode(node, name);
  }

  static int CountCommands(const NodePtr& node) {
    if (node->GetType() == NodeType::Command) return 1;
    int count = 0;
    for (const NodePtr& child : node->GetNamespaceNodes()) count += CountCommands(child);
    return count;
  }

  Calls registrations;
};

// A command that is no namespace, to stand where the entry expects one.
class LeafCommand : public Command {
 public:
  static boost::shared_ptr<LeafCommand> New() {
    return boost::shared_ptr<LeafCommand>(new LeafCommand());
  }
};

NamespacePtr RootWithStorage(const NodePtr& storage) {
  NamespacePtr root = Namespace::New();
  root->SetName("hyracli");
  if (storage) root->RegisterNamespaceNode(storage, "storage");
  return root;
}

class TreeTest : public SimWorldTest {};

TEST_F(TreeTest, NewInternalComesFirstAndTarnLastWithAllItsCommands) {
  // No internal yet: it is registered before any command is built.
  boost::shared_ptr<WatchingNamespace> storage = WatchingNamespace::New();
  NamespacePtr root = RootWithStorage(storage);
  AutoCli_RegisterNamespaces(root);
  EXPECT_EQ(storage->registrations, Calls{"internal 0 0"});

  // tarn shows up only once it holds all 22 commands.
  TarnLibSim_ResetCounters();
  boost::shared_ptr<WatchingNamespace> internal = WatchingNamespace::New();
  root = RootWithStorage(Namespace::New());
  root->GetNamespaceNode("storage")->RegisterNamespaceNode(internal, "internal");
  AutoCli_RegisterNamespaces(root);
  EXPECT_EQ(internal->registrations, Calls{"tarn 22 7"});
}

TEST_F(TreeTest, ExistingInternalIsReusedWithItsDescription) {
  NamespacePtr storage = Namespace::New();
  NamespacePtr internal = Namespace::New();
  internal->SetDescription("Kept by the host.");
  NamespacePtr root = RootWithStorage(storage);
  storage->RegisterNamespaceNode(internal, "internal");
  AutoCli_RegisterNamespaces(root);
  EXPECT_EQ(storage->GetNamespaceNodeNames(), std::vector<std::string>{"internal"});
  EXPECT_EQ(storage->GetNamespaceNode("internal"), NodePtr(internal));
  EXPECT_EQ(internal->GetDescription(), "Kept by the host.");
  EXPECT_EQ(internal->GetNamespaceNodeNames(), std::vector<std::string>{"tarn"});
}

TEST_F(TreeTest, MissingOrWrongNodesAreRefusedWithoutTouchingTheTree) {
  NamespacePtr noStorage = RootWithStorage(nullptr), storage = Namespace::New();
  noStorage->RegisterNamespaceNode(Namespace::New(), "network");
  storage->RegisterNamespaceNode(LeafCommand::New(), "internal");
  std::pair<NamespacePtr, const char*> cases[] = {
      {noStorage, "Unable to find 'storage' namespace in namespace 'hyracli'"},
      {RootWithStorage(LeafCommand::New()),
       "Node 'storage' in namespace 'hyracli' is not a namespace"},
      {RootWithStorage(storage), "Node 'internal' in namespace 'storage' is not a namespace"},
  };
  for (auto& c : cases) {
    EXPECT_EQ(Thrown<HostCtl::Lib::HostCtlException>([&] { AutoCli_RegisterNamespaces(c.first); }),
              c.second);
  }
  EXPECT_EQ(noStorage->GetNamespaceNodeNames(), std::vector<std::string>{"network"});
  EXPECT_TRUE(noStorage->GetNamespaceNode("network")->GetNamespaceNodeNames().empty());
  EXPECT_EQ(storage->GetNamespaceNodeNames(), std::vector<std::string>{"internal"});
  EXPECT_EQ(storage->GetNamespaceNode("internal")->GetType(), NodeType::Command);
  EXPECT_EQ(TarnLibSim_InitCalls(), 0);
}

// Which class fails and where is checked with each class; here, what the
// entry leaves behind when the first or the last of the seven fails.
TEST_F(TreeTest, CommandThatCannotOpenTheLibraryLeavesNoTarnAndNoOpening) {
  for (int64_t passing : {0, 6}) {
    TarnLibSim_ResetCounters();
    Arm("TarnLib_Init", "daemon down", passing);
    NamespacePtr storage = Namespace::New();
    NamespacePtr root = RootWithStorage(storage);
    EXPECT_EQ(Thrown<OskCtl::Lib::OskCtlException>([&] { AutoCli_RegisterNamespaces(root); }),
              "Unable to initialize tarnLib");
    // The new internal stays, empty; the commands built before are gone and
    // released the library, and the one that failed released nothing.
    EXPECT_EQ(storage->GetNamespaceNodeNames(), std::vector<std::string>{"internal"});
    EXPECT_TRUE(storage->GetNamespaceNode("internal")->GetNamespaceNodeNames().empty());
    EXPECT_EQ(TarnLibSim_InitCalls(), passing + 1);
    EXPECT_EQ(TarnLibSim_ExitCalls(), passing);
    EXPECT_EQ(TarnLibSim_Openings(), 0);
  }
}

}  // namespace
}  // namespace PluginTest
