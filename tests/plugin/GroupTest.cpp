// The five consistency-group classes, built with New() as they are not in the
// tree: their fixed answers, and that no execution keeps the daemon client
// library open.
#include <functional>

#include "CGAdd.h"
#include "CGCreate.h"
#include "CGDelete.h"
#include "CGList.h"
#include "CGSync.h"
#include "HostCtl/Lib.h"
#include "PluginTestSupport.h"
#include "TarnLibSim.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using Fendle::CallSpec::Input;
typedef boost::shared_ptr<Fendle::AutoCli::Command> CommandPtr;

void AnyGroupInput(Input& in) {
  for (const char* name : {"cgid", "name", "desc", "profile", "vp-name"}) in.SetString(name, "x");
  in.AddString("cgid", "cg-2");
  in.AddString("tarnids", "t-1");
}

class GroupTest : public SimWorldTest {};

TEST_F(GroupTest, AddAndDeleteAnswerTrue) {
  for (const CommandPtr& command : {CommandPtr(CGAdd::New()), CommandPtr(CGDelete::New())}) {
    EXPECT_EQ(RunCommand(*command, AnyGroupInput), (Calls{"result: true", "finish"}));
  }
}

TEST_F(GroupTest, CreateListAndSyncReleaseWhatEachExecutionOpened) {
  const struct {
    std::function<CommandPtr()> make;
    std::string result;
    int64_t heldByObject;  // the constructor's opening
  } cases[] = {
      {[] { return CGCreate::New(); },
       R"(CGCreate{Name="",Description="",Id="",DestinationArrayId="",FailoverArrayId="",)"
       R"(SourceArrayId="",State=""})",
       1},
      {[] { return CGList::New(); },
       R"([<CGList{CgId="",Name="",Description="",DestinationArrayId="",FailOverArrayId="",)"
       R"(SourceArrayId="",State="",Warning="",Error=""}>])",
       0},
      {[] { return CGSync::New(); },
       R"([<CGSync{CgId="",RpId="",TimeStamp="",Warning="",Error=""}>])", 1},
  };
  for (const auto& c : cases) {
    TarnLibSim_ResetCounters();
    CommandPtr command = c.make();
    for (int run = 0; run < 2; ++run) {
      EXPECT_EQ(RunCommand(*command, AnyGroupInput), (Calls{"result: " + c.result, "finish"}));
      EXPECT_EQ(TarnLibSim_Openings(), c.heldByObject);
    }
    EXPECT_THROW(RunCommand(*command, AnyGroupInput, RecordingOutput::ThrowOn::kResult),
                 HostCtl::Lib::HostCtlException);
    EXPECT_EQ(TarnLibSim_Openings(), c.heldByObject);
    Arm("TarnLib_Init", "daemon gone");
    EXPECT_EQ(RunCommand(*command, AnyGroupInput), Calls{"error: Failed to initialize TarnLib"});
    EXPECT_EQ(TarnLibSim_Openings(), c.heldByObject);
    command.reset();
    EXPECT_EQ(TarnLibSim_Openings(), 0);
    EXPECT_EQ(TarnLibSim_InitCalls(), c.heldByObject + 4);
  }
}

}  // namespace
}  // namespace PluginTest
