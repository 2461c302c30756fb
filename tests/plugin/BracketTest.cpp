// Opening and releasing the daemon client library: per object for the
// commands that hold it, per invocation for the others, on every path.
#include <functional>

#include "CGAdd.h"
#include "CGCreate.h"
#include "CGDelete.h"
#include "CGSync.h"
#include "DaemonCommand.h"
#include "FaultInjectionEnable.h"
#include "FaultInjectionRuleAdd.h"
#include "FaultInjectionRuleRemove.h"
#include "FaultInjectionRuleSet.h"
#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"
#include "PluginTestSupport.h"
#include "StorageContainerCheckTarns.h"
#include "StorageContainerLoad.h"
#include "StorageContainerRemove.h"
#include "TarnLibSim.h"
#include "VendorProviderActivate.h"
#include "VendorProviderDeactivate.h"
#include "VendorProviderRemove.h"
#include "VirtualVolumeGet.h"
#include "VirtualVolumeMetaDataList.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using Fendle::AutoCli::Command;

struct Bracketed {
  const char* source;
  int line;  // 0: the line is not fixed
  std::function<boost::shared_ptr<Command>()> make;
};

template <typename T>
std::function<boost::shared_ptr<Command>()> Maker() {
  return [] { return T::New(); };
}

void ExpectInitFailure(const std::function<void()>& action, const Bracketed& c) {
  try {
    action();
    ADD_FAILURE() << "no exception";
  } catch (const OskCtl::Lib::OskCtlException& e) {
    EXPECT_EQ(e.GetMessage(false), "Unable to initialize tarnLib");
    EXPECT_EQ(e.GetSourceFile(), c.source);
    if (c.line != 0) {
      EXPECT_EQ(e.GetLine(), c.line);
    }
    EXPECT_GT(e.GetLine(), 0);
  }
}

class BracketTest : public SimWorldTest {};

TEST_F(BracketTest, ConstructorBracketHoldsTheLibraryForTheObjectsLife) {
  const Bracketed cases[] = {
      {"internal/VendorProviderRemove", 35, Maker<VendorProviderRemove>()},
      {"internal/VendorProviderActivate", 36, Maker<VendorProviderActivate>()},
      {"internal/VendorProviderDeactivate", 36, Maker<VendorProviderDeactivate>()},
      {"internal/StorageContainerLoad", 42, Maker<StorageContainerLoad>()},
      {"internal/StorageContainerRemove", 31, Maker<StorageContainerRemove>()},
      {"internal/StorageContainerCheckTarns", 40, Maker<StorageContainerCheckTarns>()},
      {"internal/DaemonCommand", 0, Maker<DaemonCommand>()},
      {"internal/CGAdd", 35, Maker<CGAdd>()},
      {"internal/CGDelete", 37, Maker<CGDelete>()},
      {"internal/CGCreate", 47, Maker<CGCreate>()},
      {"internal/CGSync", 52, Maker<CGSync>()},
  };
  for (const Bracketed& c : cases) {
    SCOPED_TRACE(c.source);
    TarnLibSim_ResetCounters();
    boost::shared_ptr<Command> command = c.make();
    EXPECT_EQ(TarnLibSim_Openings(), 1);
    command.reset();
    EXPECT_EQ(TarnLibSim_Openings(), 0);
    EXPECT_EQ(TarnLibSim_ExitCalls(), 1);

    // A failed opening leaves no object, so nothing is released for it.
    TarnLibSim_ResetCounters();
    Arm("TarnLib_Init");
    ExpectInitFailure([&] { c.make(); }, c);
    EXPECT_EQ(TarnLibSim_InitCalls(), 1);
    EXPECT_EQ(TarnLibSim_ExitCalls(), 0);
  }
}

TEST_F(BracketTest, InvocationBracketReleasesOnceOnEveryWayOut) {
  struct Case {
    Bracketed command;
    // The sink call that an invocation without parameters reaches; the sink
    // throws from it to leave the invocation by an exception.
    RecordingOutput::ThrowOn reached;
  };
  const RecordingOutput::ThrowOn kError = RecordingOutput::ThrowOn::kError;
  const Case cases[] = {
      {{"internal/FaultInjectionEnable", 0, Maker<FaultInjectionEnable>()},
       RecordingOutput::ThrowOn::kResult},
      {{"internal/FaultInjectionRuleAdd", 0, Maker<FaultInjectionRuleAdd>()}, kError},
      {{"internal/FaultInjectionRuleSet", 0, Maker<FaultInjectionRuleSet>()}, kError},
      {{"internal/FaultInjectionRuleRemove", 0, Maker<FaultInjectionRuleRemove>()}, kError},
      {{"internal/VirtualVolumeGet", 102, Maker<VirtualVolumeGet>()}, kError},
      {{"internal/VirtualVolumeMetaDataList", 88, Maker<VirtualVolumeMetaDataList>()}, kError},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.command.source);
    boost::shared_ptr<Command> command = c.command.make();

    TarnLibSim_ResetCounters();
    command->Execute(MakeInput(nullptr), RecordingOutput::New());
    EXPECT_EQ(TarnLibSim_InitCalls(), 1);
    EXPECT_EQ(TarnLibSim_ExitCalls(), 1);

    // An exception from inside the invocation still releases the library.
    TarnLibSim_ResetCounters();
    EXPECT_THROW(command->Execute(MakeInput(nullptr), RecordingOutput::New(c.reached)),
                 HostCtl::Lib::HostCtlException);
    EXPECT_EQ(TarnLibSim_InitCalls(), 1);
    EXPECT_EQ(TarnLibSim_ExitCalls(), 1);

    TarnLibSim_ResetCounters();
    Arm("TarnLib_Init");
    boost::shared_ptr<RecordingOutput> output = RecordingOutput::New();
    ExpectInitFailure([&] { command->Execute(MakeInput(nullptr), output); }, c.command);
    EXPECT_TRUE(output->Calls().empty());
    EXPECT_EQ(TarnLibSim_ExitCalls(), 0);
    EXPECT_EQ(TarnLibSim_Openings(), 0);
  }
}

}  // namespace
}  // namespace PluginTest
