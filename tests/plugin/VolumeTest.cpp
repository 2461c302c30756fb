// The virtualvolume commands against the simulated daemon: what each answers,
// which failure ends it, and that records and the library are released.
#include <sqlite3.h>

#include "HostCtl/Lib.h"
#include "PluginTestSupport.h"
#include "TarnLibSim.h"
#include "VirtualVolumeGet.h"
#include "VirtualVolumeMetaDataList.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;

constexpr char kGold[] = "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f";
constexpr char kTarn[] = "0c9e2d1a-3b4f-4a5e-8f70-112233445566";
constexpr char kBare[] = "5d2f7a10-6b1c-4e3d-9a8b-7c6d5e4f3a2b";  // no profile, no metadata

InputFiller Volume(const std::string& containerId, const std::string& uuid) {
  return [=](Fendle::CallSpec::Input& in) {
    in.SetString("container-id", containerId);
    in.SetString("uuid", uuid);
  };
}

class VolumeTest : public SimWorldTest {};

TEST_F(VolumeTest, CommandsAnswerOrReportTheirFirstFailure) {
  struct Case {
    boost::shared_ptr<Fendle::AutoCli::Command> command;
    InputFiller input;
    const char* armed;  // armed to fail once, or with null to succeed without a record
    bool null;
    std::string first;  // the error reported, or a part of the result
  };
  const auto get = VirtualVolumeGet::New();
  const auto list = VirtualVolumeMetaDataList::New();
  // clang-format off
  const Case cases[] = {
      {get, Volume("6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F", kTarn), nullptr, false,
       "{Tarn UUID=\"" + std::string(kTarn) + "\",Container Id=\"" + kGold + "\",Logical "
       "Size=10240,Committed Size=2048,Unshared Size=512,Unshared Size Valid=true,Storage "
       "Profile=\"gold-policy\",Block Size=4096}"},
      {get, Volume("9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d", "3e4f5a6b-7c8d-4e9f-a0b1-c2d3e4f5a6b7"),
       nullptr, false, ",Unshared Size=0,Unshared Size Valid=false,"},
      {get, Volume(kGold, kBare), nullptr, false, "Storage Profile=\"\",Block Size=4096}"},
      {get, Volume("gold", ""), nullptr, false, "error: Container Id is not valid."},
      {get, Volume(kGold, ""), nullptr, false, "error: Tarn UUID cannot be empty."},
      {get, Volume(kGold, kTarn), "TarnLib_SpaceStatsForTarn", true,
       "error: Failed to get space stats for Tarn."},
      {get, Volume(kGold, kTarn), "TarnLib_GetTarnInfo", false,
       "error: Failed to get the storage profile for Tarn."},
      {get, Volume(kGold, kTarn), "TarnLib_UnsharedChunksTarn", true,
       "error: Failed to get block size for Tarn."},
      {list, Volume(kGold, kBare), nullptr, false, "result: [<TarnMetaData{key=\"\",value=\"\"}>]"},
      {list, Volume(kGold, kTarn), "TarnLib_GetTarnMetadata", true,
       "error: Failed to get the metadata for Tarn."},
  };
  // clang-format on
  for (const Case& c : cases) {
    SCOPED_TRACE(c.first);
    if (c.armed) Arm(c.armed, "no", 0, c.null);
    TarnLibSim_ResetCounters();
    const Calls calls = RunCommand(*c.command, c.input);
    // An error ends the command alone; a result is followed by Finish.
    if (c.first.rfind("error: ", 0) == 0) {
      EXPECT_EQ(calls, Calls{c.first});
    } else {
      ASSERT_EQ(calls.size(), 2u);
      EXPECT_NE(calls[0].find(c.first), std::string::npos) << calls[0];
      EXPECT_EQ(calls[1], "finish");
    }
    EXPECT_EQ(TarnLibSim_ExitCalls(), 1);
  }

  // A sink that refuses the rows leaves the record and the library released.
  TarnLibSim_ResetCounters();
  EXPECT_THROW(RunCommand(*list, Volume(kGold, kTarn), RecordingOutput::ThrowOn::kResult),
               HostCtl::Lib::HostCtlException);
  EXPECT_EQ(TarnLibSim_Openings(), 0);
}

// A row edited by hand behind the simulated host's back: a block size of 0
// must end the command with its own text, not with a division by zero.
TEST_F(VolumeTest, ABlockSizeOfZeroInTheWorldIsRefusedNotDividedBy) {
  sqlite3* db = nullptr;
  ASSERT_EQ(sqlite3_open((directory_ + "/world.db").c_str(), &db), SQLITE_OK);
  const std::string edit =
      std::string("UPDATE tarn SET block_size = 0 WHERE uuid = '") + kTarn + "'";
  char* error = nullptr;
  EXPECT_EQ(sqlite3_exec(db, edit.c_str(), nullptr, nullptr, &error), SQLITE_OK) << error;
  sqlite3_free(error);
  EXPECT_EQ(sqlite3_changes(db), 1);
  sqlite3_close(db);

  EXPECT_EQ(RunCommand(*VirtualVolumeGet::New(), Volume(kGold, kTarn)),
            Calls{"error: Failed to get space stats for Tarn."});
  EXPECT_EQ(TarnLibSim_Openings(), 0);
}

}  // namespace
}  // namespace PluginTest
