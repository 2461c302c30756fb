// The tree the entry hangs under `storage internal`, and how the entry fails.
#include <boost/pointer_cast.hpp>
#include <functional>
#include <sstream>

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
// made so far.
class WatchingNamespace : public Namespace {
 public:
  struct Registration {
    std::string name;
    int commandsBelow;
    int64_t initCallsBefore;
  };

  static boost::shared_ptr<WatchingNamespace> New() {
    return boost::shared_ptr<WatchingNamespace>(new WatchingNamespace());
  }

  void RegisterNamespaceNode(const NodePtr& node, const std::string& name) override {
    registrations.push_back({name, CountCommands(node), TarnLibSim_InitCalls()});
    Namespace::RegisterNamespaceNode(node, name);
  }

  static int CountCommands(const NodePtr& node) {
    if (node->GetType() == NodeType::Command) return 1;
    int count = 0;
    for (const NodePtr& child : node->GetNamespaceNodes()) count += CountCommands(child);
    return count;
  }

  std::vector<Registration> registrations;
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

NodePtr Resolve(const NodePtr& from, const std::string& path) {
  NodePtr node = from;
  std::istringstream words(path);
  std::string word;
  while (node && words >> word) node = node->GetNamespaceNode(word);
  return node;
}

class TreeTest : public SimWorldTest {};

TEST_F(TreeTest, NewInternalComesFirstAndTarnLastWithAllItsCommands) {
  // No internal yet: it is registered before any command is built.
  boost::shared_ptr<WatchingNamespace> storage = WatchingNamespace::New();
  NamespacePtr root = RootWithStorage(storage);
  AutoCli_RegisterNamespaces(root);
  ASSERT_EQ(storage->registrations.size(), 1u);
  EXPECT_EQ(storage->registrations[0].name, "internal");
  EXPECT_EQ(storage->registrations[0].commandsBelow, 0);
  EXPECT_EQ(storage->registrations[0].initCallsBefore, 0);

  // tarn shows up only once it holds all 22 commands.
  TarnLibSim_ResetCounters();
  boost::shared_ptr<WatchingNamespace> internal = WatchingNamespace::New();
  root = RootWithStorage(Namespace::New());
  Resolve(root, "storage")->RegisterNamespaceNode(internal, "internal");
  AutoCli_RegisterNamespaces(root);
  ASSERT_EQ(internal->registrations.size(), 1u);
  EXPECT_EQ(internal->registrations[0].name, "tarn");
  EXPECT_EQ(internal->registrations[0].commandsBelow, 22);
  EXPECT_EQ(internal->registrations[0].initCallsBefore, 7);
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

TEST_F(TreeTest, MissingStorageIsReportedWithTheRootsNameAndNothingIsCreated) {
  NamespacePtr root = RootWithStorage(nullptr);
  root->RegisterNamespaceNode(Namespace::New(), "network");
  try {
    AutoCli_RegisterNamespaces(root);
    FAIL() << "no exception";
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EXPECT_EQ(e.GetMessage(false), "Unable to find 'storage' namespace in namespace 'hyracli'");
  }
  EXPECT_EQ(root->GetNamespaceNodeNames(), std::vector<std::string>{"network"});
  EXPECT_TRUE(Resolve(root, "network")->GetNamespaceNodeNames().empty());
  EXPECT_EQ(TarnLibSim_InitCalls(), 0);
}

TEST_F(TreeTest, NodesThatAreNoNamespaceAreRefusedWithoutTouchingTheTree) {
  struct Case {
    const char* name;
    std::function<NamespacePtr()> makeRoot;
    const char* expectedMessage;
  };
  const Case cases[] = {
      {"storage is a command", [] { return RootWithStorage(LeafCommand::New()); },
       "Node 'storage' in namespace 'hyracli' is not a namespace"},
      {"internal is a command",
       [] {
         NamespacePtr storage = Namespace::New();
         storage->RegisterNamespaceNode(LeafCommand::New(), "internal");
         return RootWithStorage(storage);
       },
       "Node 'internal' in namespace 'storage' is not a namespace"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    NamespacePtr root = c.makeRoot();
    try {
      AutoCli_RegisterNamespaces(root);
      ADD_FAILURE() << "no exception";
    } catch (const HostCtl::Lib::HostCtlException& e) {
      EXPECT_EQ(e.GetMessage(false), c.expectedMessage);
    }
    const NodePtr storage = Resolve(root, "storage");
    if (storage->GetType() == NodeType::Namespace) {
      EXPECT_EQ(storage->GetNamespaceNodeNames(), std::vector<std::string>{"internal"});
      EXPECT_EQ(Resolve(storage, "internal")->GetType(), NodeType::Command);
    }
    EXPECT_EQ(TarnLibSim_InitCalls(), 0);
  }
}

TEST_F(TreeTest, CommandThatCannotOpenTheLibraryLeavesNoTarnAndNoOpening) {
  // The seven commands that open the daemon client library when built, in
  // the order the tree builds them.
  struct Case {
    const char* source;
    int line;  // 0: any line
  };
  const Case cases[] = {
      {"internal/VendorProviderRemove", 35},
      {"internal/VendorProviderActivate", 36},
      {"internal/VendorProviderDeactivate", 36},
      {"internal/StorageContainerLoad", 42},
      {"internal/StorageContainerRemove", 31},
      {"internal/StorageContainerCheckTarns", 40},
      {"internal/DaemonCommand", 0},
  };
  for (int64_t passing = 0; passing < 7; ++passing) {
    const Case& c = cases[passing];
    SCOPED_TRACE(c.source);
    TarnLibSim_ResetCounters();
    Arm("TarnLib_Init", "daemon down", passing);
    NamespacePtr storage = Namespace::New();
    NamespacePtr root = RootWithStorage(storage);
    try {
      AutoCli_RegisterNamespaces(root);
      ADD_FAILURE() << "no exception";
    } catch (const OskCtl::Lib::OskCtlException& e) {
      EXPECT_EQ(e.GetMessage(false), "Unable to initialize tarnLib");
      EXPECT_EQ(e.GetSourceFile(), c.source);
      if (c.line != 0) {
        EXPECT_EQ(e.GetLine(), c.line);
      }
      EXPECT_GT(e.GetLine(), 0);
    }
    // The new internal stays, empty; the commands built before are gone and
    // released the library, and the one that failed released nothing.
    EXPECT_EQ(storage->GetNamespaceNodeNames(), std::vector<std::string>{"internal"});
    EXPECT_TRUE(Resolve(storage, "internal")->GetNamespaceNodeNames().empty());
    EXPECT_EQ(TarnLibSim_InitCalls(), passing + 1);
    EXPECT_EQ(TarnLibSim_ExitCalls(), passing);
    EXPECT_EQ(TarnLibSim_Openings(), 0);
  }
}

}  // namespace
}  // namespace PluginTest
