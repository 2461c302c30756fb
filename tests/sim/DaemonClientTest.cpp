// The daemon client library against the demo world: openings, container ids,
// the export rule, queries and the daemon's refusals. What the records hold is
// read back through the commands' own tests.
#include <cstring>
#include <string>
#include <vector>

#include "OskCtl/Storage.h"
#include "SimTest.h"
#include "TarnLib/TarnLib.h"

namespace {

using SimTest::Opened;
using DaemonClient = SimTest::FreshWorld;

TEST_F(DaemonClient, OpeningsAreCountedAndReleasedOneByOne) {
  EXPECT_TRUE(TarnLib_Init(0, 0));
  EXPECT_TRUE(TarnLib_Init(0, 0));
  EXPECT_EQ(TarnLibSim_Openings(), 2);
  TarnLib_Exit();
  EXPECT_TRUE(TarnLib_SetFaultInjectionEnabled(true)) << "one opening is still held";
  TarnLib_Exit();
  TarnLib_Exit();  // nothing left to release: changes nothing
  EXPECT_EQ(TarnLibSim_Openings(), 0);
  EXPECT_EQ(TarnLibSim_InitCalls(), 2);
  EXPECT_EQ(TarnLibSim_ExitCalls(), 3);
  EXPECT_FALSE(TarnLib_SetFaultInjectionEnabled(false));
  EXPECT_STREQ(TarnLib_Err2String(TarnLib_DebugCommand(nullptr, nullptr, nullptr)),
               "TarnLib is not initialised");
}

TEST_F(DaemonClient, StoppedDaemonRefusesOpeningAndCalls) {
  Opened opened;
  ASSERT_TRUE(opened.ok);
  HyraSim::SetDaemonRunning(false);
  EXPECT_FALSE(TarnLib_Init(0, 0));
  EXPECT_EQ(TarnLibSim_Openings(), 1);
  StorageContainerResult* result = nullptr;
  const TarnLib_ErrorEx error = TarnLib_GetStorageContainer(1, nullptr, &result);
  EXPECT_FALSE(TarnLib_ErrorExIsSuccess(&error));
  EXPECT_STREQ(TarnLib_ErrorExStr(&error), "Tarnd is not running");
  EXPECT_EQ(result, nullptr);
}

using ContainerIdForms = SimTest::FreshWorld;

TEST_F(ContainerIdForms, NormalisesValidFormsAndRejectsTheRest) {
  const std::pair<const char*, bool> cases[] = {
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f", true},
      {"6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F", true},
      {"6f1c2f4e8d3b4c1a9e2f0a1b2c3d4e5f", true},
      {"6F1c2f4e8D3b4c1a9e2f0a1b2c3d4E5F", true},
      {"", false},
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5", false},    // 35 characters
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f0", false},  // 37 characters
      {"6f1c2f4e8d3b-4c1a-9e2f-0a1b2c3d4e5f0", false},   // a hyphen moved
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5g", false},   // not hex
      {"{6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5}", false},  // braces
      {" 6f1c2f4e8d3b4c1a9e2f0a1b2c3d4e5f", false},      // blank
      {"6f1c2f4e8d3b4c1a9e2f0a1b2c3d4e5", false},        // 31 digits
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f6f1c2f4e8d3b4c1a9e2f", false},
  };
  // Canary bytes around the 37-byte buffer catch any write beyond it; an
  // invalid id leaves the buffer untouched.
  const std::string canary(4, '#');
  for (const auto& c : cases) {
    char buffer[TARNLIB_CONTAINER_ID_TEXT_SIZE + 8];
    std::memset(buffer, '#', sizeof(buffer));
    EXPECT_EQ(TarnLib_NormalizeContainerIdString(c.first, buffer + 4), c.second) << c.first;
    const std::string expected =
        c.second ? canary + SimTest::kGoldId + '\0' + canary : std::string(sizeof(buffer), '#');
    EXPECT_EQ(std::string(buffer, sizeof(buffer)), expected) << c.first;
  }
  char out[TARNLIB_CONTAINER_ID_TEXT_SIZE];
  EXPECT_FALSE(TarnLib_NormalizeContainerIdString(nullptr, out));
}

// The names of the exported containers, in the daemon's order.
std::vector<std::string> ExportedNames() {
  StorageContainerResult* result = nullptr;
  const TarnLib_ErrorEx error = TarnLib_GetStorageContainer(1, nullptr, &result);
  EXPECT_TRUE(TarnLib_ErrorExIsSuccess(&error)) << TarnLib_ErrorExStr(&error);
  std::vector<std::string> names;
  for (uint32_t i = 0; result != nullptr && i < result->containerCount; ++i) {
    names.push_back(result->containers[i]->containerName);
  }
  TarnLib_FreeStorageContainerResult(result);
  return names;
}

TEST_F(DaemonClient, ExportsContainersOfRegisteredProvidersInWorldOrder) {
  Opened opened;
  EXPECT_EQ(ExportedNames(), (std::vector<std::string>{"gold", "silver", "bronze"}));

  OskCtl::Storage::StorageInfoImpl().UpdateTarnVendorProvider(
      {{"vp9", "https://vp9.example.test:8443/kiro", "", {}}});
  EXPECT_EQ(ExportedNames(), (std::vector<std::string>{"gold", "silver", "bronze", "legacy"}));

  OskCtl::Storage::TarnFileSystemImpl::UnRegisterVendorProvider("vp1");
  EXPECT_EQ(ExportedNames(), (std::vector<std::string>{"bronze", "legacy"}));
}

TEST_F(DaemonClient, VolumeQueriesNeedAKnownContainerInNormalFormAndAKnownTarn) {
  Opened opened;
  struct Case {
    const char* container;
    const char* uuid;
    TarnLib_Status status;
  };
  const Case cases[] = {
      {SimTest::kGoldId, SimTest::kGoldTarn, TARNLIB_OK},
      {SimTest::kGoldId, "0C9E2D1A-3B4F-4A5E-8F70-112233445566", TARNLIB_OK},
      {SimTest::kGoldId, SimTest::kSilverUnknownUnshared, 4},           // tarn of another container
      {SimTest::kLegacyId, "6e5d4c3b-2a19-4087-b6a5-948372615049", 4},  // not exported
      {"6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F", SimTest::kGoldTarn, 3},  // not the normal form
      {"gold", SimTest::kGoldTarn, 3},
      {SimTest::kGoldId, nullptr, 3},
  };
  for (const Case& c : cases) {
    TarnInfo* info = nullptr;
    EXPECT_EQ(TarnLib_GetTarnInfo(c.container, c.uuid, &info), c.status) << c.container;
    EXPECT_EQ(info != nullptr, c.status == TARNLIB_OK);
    TarnLib_FreeTarnInfo(info);
    TarnSpaceStatsInfo* stats = nullptr;
    EXPECT_EQ(TarnLib_SpaceStatsForTarn(c.container, c.uuid, &stats), c.status);
    TarnLib_FreeTarnSpaceStatsInfo(stats);
    void* block = nullptr;
    EXPECT_EQ(TarnLib_UnsharedChunksTarn(c.container, c.uuid, 0, 0, 0, 0, 0, &block), c.status);
    free(block);
  }
  EXPECT_STREQ(TarnLib_Err2String(4), "not found");
  EXPECT_STREQ(TarnLib_Err2String(3), "invalid argument");
}

TEST_F(DaemonClient, ConfigTarnQueryListsInOrderAndFailedQueryStillAnswersAResult) {
  Opened opened;
  QueryResult* result = nullptr;
  ASSERT_EQ(TarnLib_QueryAllConfigTarns(SimTest::kGoldId, 2147483647, 0, &result, 0), 0);
  ASSERT_EQ(result->entryCount, 1);
  EXPECT_STREQ(result->entries[0]->tarnId, SimTest::kGoldConfigTarn);
  EXPECT_STREQ(result->entries[0]->name, "vm-config-1");
  EXPECT_EQ(result->entries[0]->mounted, 0);
  TarnLib_FreeQueryResult(result);

  result = nullptr;
  EXPECT_EQ(TarnLib_QueryAllConfigTarns(SimTest::kLegacyId, 2147483647, 0, &result, 0), 4);
  ASSERT_NE(result, nullptr);
  EXPECT_EQ(result->entryCount, 0);
  TarnLib_FreeQueryResult(result);
}

TEST_F(DaemonClient, FaultRulesAreKeyedByOperationAndFault) {
  Opened opened;
  EXPECT_TRUE(TarnLib_AddFaultInjectionRule("*", "STORAGE_FAULT", 10, -1));
  EXPECT_FALSE(TarnLib_AddFaultInjectionRule("*", "STORAGE_FAULT", 3, -1)) << "exists";
  EXPECT_TRUE(TarnLib_AddFaultInjectionRule("createVirtualVolume", "STORAGE_FAULT", -1, 500));
  EXPECT_FALSE(TarnLib_AddFaultInjectionRule("*", "NO_LIMIT", -1, -1)) << "would never fire";
  EXPECT_FALSE(TarnLib_ModifyFaultInjectionRule("bindVirtualVolume", "STORAGE_FAULT", 5, -1));
  EXPECT_TRUE(TarnLib_ModifyFaultInjectionRule("*", "STORAGE_FAULT", 5, 20));
  EXPECT_TRUE(TarnLib_ModifyFaultInjectionRule("createVirtualVolume", "STORAGE_FAULT", -1, -1));
  EXPECT_FALSE(TarnLib_ModifyFaultInjectionRule("createVirtualVolume", "STORAGE_FAULT", -1, -1));
  const auto rules = World()["daemon"]["faultInjection"]["rules"];
  ASSERT_EQ(rules.size(), 1u);
  EXPECT_EQ(rules[0]["operation"], "*");
  EXPECT_EQ(rules[0]["frequency"], 5);
  EXPECT_EQ(rules[0]["time"], 20);
}

TEST_F(DaemonClient, DaemonRecordsWhatItWasTold) {
  Opened opened;
  const int32_t level = 16, dump = 1, unbind = 0, badLevel = 5, badUnbind = -1;
  EXPECT_EQ(TarnLib_DebugCommand(&level, &dump, nullptr), 0);
  EXPECT_EQ(TarnLib_DebugCommand(nullptr, &dump, &unbind), 0);
  EXPECT_EQ(TarnLib_DebugCommand(&badLevel, nullptr, nullptr), 3);
  EXPECT_EQ(TarnLib_DebugCommand(nullptr, &dump, &badUnbind), 3) << "refused whole";
  const auto daemon = World()["daemon"];
  EXPECT_EQ(daemon["logLevel"], 16);
  EXPECT_EQ(daemon["dumpRequests"], 2);
  EXPECT_EQ(daemon["unbindPeriod"], 0);
}

TEST_F(DaemonClient, ActivationNeedsAProviderThatServesTheArray) {
  Opened opened;
  unsigned char block[TARNLIB_ACTIVATION_BLOCK_SIZE] = {};
  EXPECT_EQ(TarnLib_ActivateProvider("array-b", "vp1", "", block), 0);
  EXPECT_EQ(TarnLib_ActivateProvider("array-c", "vp1", "", block), 4) << "vp1 does not serve it";
  EXPECT_EQ(TarnLib_ActivateProvider("array-a", "vp7", "", block), 4) << "not registered";
  EXPECT_EQ(TarnLib_DeactivateProvider("array-c", "vp2"), 0);
  EXPECT_EQ(TarnLib_DeactivateProvider("array-a", "vp2"), 4);
  EXPECT_EQ(TarnLib_ActivateProvider("array-b", "vp1", "https://other", block), 0);
  const auto activations = World()["daemon"]["activations"];
  ASSERT_EQ(activations.size(), 2u);
  EXPECT_EQ(activations[0]["activeProviderUrl"], "https://other") << "one record per pair";
  EXPECT_EQ(activations[1]["active"], false);
}

TEST_F(DaemonClient, ProviderFaultStatusWordsCompareExactly) {
  Opened opened;
  const KiroFaultArrayEntry arrays[] = {{"array-a", false, 0}, {"array-b", true, 0}};
  for (const char* word : {"online", "offline", "syncError", "unknown", "default"}) {
    EXPECT_EQ(TarnLib_VendorProviderInjectFault("vp1", "u", word, 2, arrays), 0) << word;
  }
  for (const char* word : {"Online", "syncerror", "", "broken"}) {
    EXPECT_EQ(TarnLib_VendorProviderInjectFault("vp1", "u", word, 0, nullptr), 3) << word;
  }
  const auto faults = World()["daemon"]["providerFaults"];
  ASSERT_EQ(faults.size(), 1u) << "the last injection for a provider wins";
  EXPECT_EQ(faults[0]["status"], "default");
  EXPECT_EQ(faults[0]["arrays"][0]["isActive"], false);
}

}  // namespace
