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

template <typename C>
std::function<boost::shared_ptr<Command>()> Maker() {
  return [] { return C::New(); };
}

void ExpectInitFailure(const std::function<void()>& action, const Bracketed& c) {
  try {
    action();
    ADD_FAILURE() << "no exception";
  } catch (const OskCtl::Lib::OskCtlException& e) {
    EXPECT_EQ(e.GetMessage(false), "Unable to initialize tarnLib");
    EXPECT_EQ(e.GetSourceFile(), c.source);
    EXPECT_EQ(e.GetLine(), c.line != 0 ? c.line : e.GetLine());
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
    TarnLibSim_ResetCounters();
    boost::shared_ptr<Command> command = c.make();
    EXPECT_EQ(TarnLibSim_Openings(), 1);
    command.reset();
    EXPECT_EQ(TarnLibSim_ExitCalls(), 1);
    EXPECT_EQ(TarnLibSim_Openings(), 0);

    // A failed opening leaves no object, so nothing is released for it.
    TarnLibSim_ResetCounters();
    Arm("TarnLib_Init");
    ExpectInitFailure([&] { c.make(); }, c);
    EXPECT_EQ(TarnLibSim_InitCalls(), 1);
    EXPECT_EQ(TarnLibSim_ExitCalls(), 0);
  }
}

TEST_F(BracketTest, InvocationBracketReleasesOnceOnEveryWayOut) {
  using T = RecordingOutput::ThrowOn;
  // With each, the sink call that an invocation without parameters reaches;
  // the sink throws from it to leave the invocation by an exception.
  const std::pair<Bracketed, T> cases[] = {
      {{"internal/FaultInjectionEnable", 0, Maker<FaultInjectionEnable>()}, T::kResult},
      {{"internal/FaultInjectionRuleAdd", 0, Maker<FaultInjectionRuleAdd>()}, T::kError},
      {{"internal/FaultInjectionRuleSet", 0, Maker<FaultInjectionRuleSet>()}, T::kError},
      {{"internal/FaultInjectionRuleRemove", 0, Maker<FaultInjectionRuleRemove>()}, T::kError},
      {{"internal/VirtualVolumeGet", 102, Maker<VirtualVolumeGet>()}, T::kError},
      {{"internal/VirtualVolumeMetaDataList", 88, Maker<VirtualVolumeMetaDataList>()}, T::kError},
  };
  for (const auto& [bracketed, reached] : cases) {
    boost::shared_ptr<Command> command = bracketed.make();
    TarnLibSim_ResetCounters();
    RunCommand(*command, nullptr);
    EXPECT_EQ(TarnLibSim_ExitCalls(), 1);
    // An exception from inside the invocation still releases the library.
    EXPECT_THROW(RunCommand(*command, nullptr, reached), HostCtl::Lib::HostCtlException);
    EXPECT_EQ(TarnLibSim_InitCalls(), 2);
    EXPECT_EQ(TarnLibSim_ExitCalls(), 2);

    TarnLibSim_ResetCounters();
    Arm("TarnLib_Init");
    boost::shared_ptr<RecordingOutput> output = RecordingOutput::New();
    ExpectInitFailure([&] { command->Execute(Fendle::CallSpec::Input::New(), output); }, bracketed);
    EXPECT_TRUE(output->GetCalls().empty());
    EXPECT_EQ(TarnLibSim_ExitCalls(), 0);
    EXPECT_EQ(TarnLibSim_Openings(), 0);
  }
}

}  // namespace
}  // namespace PluginTest
