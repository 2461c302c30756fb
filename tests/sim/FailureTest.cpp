// Armed failures: counts shared between processes, injected texts, and the
// "nothing" answers of --null.
#include <string>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "SimTest.h"
#include "TarnLib/TarnLib.h"

namespace {

using HostCtl::Lib::HostCtlException;
using HostCtl::Storage::TarnFileSystem;
using OskCtl::Storage::StorageInfoImpl;
using SimTest::Opened;
using Failures = SimTest::FreshWorld;

TEST_F(Failures, AfterAndTimesCountAcrossProcesses) {
  ASSERT_EQ(Hyrasim("fail TarnVpExists --after 1 --times 2 --message 'host is busy'").status, 0);
  const char* expected[] = {"true\n", "error: host is busy\n", "error: host is busy\n", "true\n"};
  for (const char* answer : expected) EXPECT_EQ(Probe("vp-exists vp1").out, answer);
  EXPECT_TRUE(HyraSim::ArmedFailures().empty()) << "a spent arming is gone";
}

TEST_F(Failures, ArmingAgainReplacesFailedCallsHaveNoEffectAndClearDisarms) {
  HyraSim::ArmFailure("TarnVpExists", {"first", 5, 5, false});
  HyraSim::ArmFailure("TarnVpExists", {"second"});
  StorageInfoImpl host;
  try {
    host.TarnVpExists("vp1");
    ADD_FAILURE() << "no exception";
  } catch (const HostCtlException& e) {
    EXPECT_EQ(e.GetMessage(false), "second");
  }
  HyraSim::ArmFailure("AddTarnFileSystem", {"mount refused"});
  std::string id = SimTest::kSilverId;
  EXPECT_THROW(host.AddTarnFileSystem("silver", id, {}, true), HostCtlException);
  HyraSim::ArmFailure("CreateConfigTarn", {"create refused"});
  TarnFileSystem* gold = host.GetTarnFileSystemByPath("/hyra/volumes/gold");
  std::string path;
  EXPECT_THROW(gold->CreateConfigTarn("new", "", 1, "", path, "", false), HostCtlException);
  const auto world = World();
  EXPECT_EQ(world["host"]["mounted"].size(), 1u);
  EXPECT_EQ(world["containers"][0]["tarns"].size(), 2u);

  HyraSim::ArmFailure("TarnVpExists", {"again"});
  HyraSim::ArmFailure("GetTarnFileSystems", {"x"});
  HyraSim::ClearFailures();
  EXPECT_TRUE(host.TarnVpExists("vp1"));
  const auto systems = host.GetTarnFileSystems();
  EXPECT_EQ(systems.size(), 1u);
  for (TarnFileSystem* fs : systems) delete fs;
}

TEST_F(Failures, HyrasimRefusalsSayWhyAndChangeNothing) {
  // clang-format off
  const char* refused[] = {
      "bogus", "init", "init --scenario", "show --yaml", "daemon restart", "daemon", "fail",
      "fail NoSuchOperation", "fail TarnLib_Exit", "fail TarnLib_FreeTarnInfo",
      "fail TarnVpExists --times 0", "fail TarnVpExists --after -1", "fail TarnVpExists --after",
      "fail TarnVpExists --times 2x", "fail TarnVpExists --loud"};
  // clang-format on
  const std::string before = HyraSim::ExportScenario();
  for (const char* arguments : refused) {
    const SimTest::ToolResult result = Hyrasim(arguments);
    EXPECT_NE(result.status, 0) << arguments;
    EXPECT_EQ(result.err.rfind("hyrasim: ", 0), 0u) << arguments << ": " << result.err;
  }
  EXPECT_TRUE(HyraSim::ArmedFailures().empty()) << "nothing half written";
  EXPECT_EQ(HyraSim::ExportScenario(), before);
  EXPECT_EQ(Hyrasim("daemon stop").status, 0);
  EXPECT_EQ(World()["daemon"]["running"], false);
}

TEST_F(Failures, DaemonCallsFailWithTheInjectedText) {
  Opened opened;
  HyraSim::ArmFailure("TarnLib_ActivateProvider", {"array offline"});
  unsigned char block[TARNLIB_ACTIVATION_BLOCK_SIZE] = {};
  const TarnLib_Status status = TarnLib_ActivateProvider("array-a", "vp1", "", block);
  EXPECT_NE(status, 0);
  EXPECT_STREQ(TarnLib_Err2String(status), "array offline");
  EXPECT_TRUE(World()["daemon"]["activations"].empty()) << "the failed call had no effect";
  EXPECT_EQ(TarnLib_ActivateProvider("array-a", "vp1", "", block), 0);

  HyraSim::ArmFailure("TarnLib_GetStorageContainer", {"no route to Tarnd"});
  StorageContainerResult* result = nullptr;
  const TarnLib_ErrorEx error = TarnLib_GetStorageContainer(1, nullptr, &result);
  EXPECT_FALSE(TarnLib_ErrorExIsSuccess(&error));
  EXPECT_STREQ(TarnLib_ErrorExStr(&error), "no route to Tarnd");
  EXPECT_EQ(result, nullptr);
  // A text longer than the record is cut before a whole character: 254 bytes
  // and a two-byte character would otherwise end on half of it.
  const std::string longText = std::string(254, 'x') + "\xC3\xA9" + "tail";
  HyraSim::ArmFailure("TarnLib_GetStorageContainer", {longText});
  const TarnLib_ErrorEx cut = TarnLib_GetStorageContainer(1, nullptr, &result);
  EXPECT_EQ(std::string(TarnLib_ErrorExStr(&cut)), std::string(254, 'x'));

  HyraSim::ArmFailure("TarnLib_Init", {"x"});
  EXPECT_FALSE(TarnLib_Init(0, 0));
  EXPECT_EQ(TarnLibSim_Openings(), 1);
  HyraSim::ArmFailure("TarnLib_NormalizeContainerIdString", {"x", 0, 1, true});
  char normal[TARNLIB_CONTAINER_ID_TEXT_SIZE];
  EXPECT_FALSE(TarnLib_NormalizeContainerIdString(SimTest::kGoldId, normal));
  EXPECT_TRUE(TarnLib_NormalizeContainerIdString(SimTest::kGoldId, normal));
}

TEST_F(Failures, NullAnswersNothingWithoutEffect) {
  auto arm = [](const char* operation) { HyraSim::ArmFailure(operation, {"unused", 0, 1, true}); };
  StorageInfoImpl host;
  TarnFileSystem* gold = host.GetTarnFileSystemByPath("/hyra/volumes/gold");
  ASSERT_NE(gold, nullptr);

  arm("AddTarnFileSystem");
  std::string id = SimTest::kSilverId;
  EXPECT_EQ(host.AddTarnFileSystem("silver", id, {}, true), nullptr);
  arm("GetTarnFileSystems");
  EXPECT_TRUE(host.GetTarnFileSystems().empty());
  arm("GetTarnFileSystemByPath");
  EXPECT_EQ(host.GetTarnFileSystemByPath("/hyra/volumes/gold"), nullptr);
  arm("TarnVpExists");
  EXPECT_FALSE(host.TarnVpExists("vp1"));
  arm("GetContainerName");
  EXPECT_EQ(gold->GetContainerName(), "");
  arm("MatchesContainerId");
  EXPECT_FALSE(gold->MatchesContainerId(SimTest::kGoldId));
  arm("CheckTarnAccessibility");
  EXPECT_TRUE(gold->CheckTarnAccessibility({SimTest::kGoldTarn}).empty());
  arm("UpdateTarnVendorProvider");
  host.UpdateTarnVendorProvider({HostCtl::Storage::VendorProviderInfo{"vp5", "u", "", {}}});
  arm("UnRegisterVendorProvider");
  OskCtl::Storage::TarnFileSystemImpl::UnRegisterVendorProvider("no-such-provider");
  arm("RemoveConfigTarn");
  gold->RemoveConfigTarn("vm-config-1", "", "", false);

  Opened opened;
  arm("TarnLib_GetTarnInfo");
  TarnInfo placeholderInfo{};
  TarnInfo* info = &placeholderInfo;
  EXPECT_EQ(TarnLib_GetTarnInfo(SimTest::kGoldId, SimTest::kGoldTarn, &info), 0);
  EXPECT_EQ(info, nullptr);
  arm("TarnLib_QueryAllConfigTarns");
  QueryResult placeholderResult{};
  QueryResult* result = &placeholderResult;
  EXPECT_EQ(TarnLib_QueryAllConfigTarns(SimTest::kGoldId, 2147483647, 0, &result, 0), 0);
  EXPECT_EQ(result, nullptr);
  arm("TarnLib_SetFaultInjectionEnabled");
  EXPECT_FALSE(TarnLib_SetFaultInjectionEnabled(true));
  arm("TarnLib_DebugCommand");
  const int32_t level = 64;
  EXPECT_EQ(TarnLib_DebugCommand(&level, nullptr, nullptr), 0);

  const auto world = World();
  EXPECT_EQ(world["host"]["mounted"].size(), 1u);
  EXPECT_EQ(world["host"]["providers"].size(), 2u);
  EXPECT_EQ(world["containers"][0]["tarns"].size(), 2u);
  EXPECT_EQ(world["daemon"]["faultInjection"]["enabled"], false);
  EXPECT_EQ(world["daemon"]["logLevel"], 4);
  EXPECT_TRUE(HyraSim::ArmedFailures().empty());
}

}  // namespace
