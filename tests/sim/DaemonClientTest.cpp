// The daemon client library against the demo world: openings, container ids,
// the export rule, records and the daemon's refusals.
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "OskCtl/Storage.h"
#include "SimTest.h"
#include "TarnLib/TarnLib.h"

namespace {

using SimTest::FreshWorld;
using SimTest::Opened;

using DaemonClient = FreshWorld;

TEST_F(DaemonClient, OpeningsAreCountedAndReleasedOneByOne) {
  EXPECT_TRUE(TarnLib_Init(0, 0));
  EXPECT_TRUE(TarnLib_Init(0, 0));
  EXPECT_EQ(TarnLibSim_Openings(), 2);
  TarnLib_Exit();
  bool enabled = TarnLib_SetFaultInjectionEnabled(true);
  EXPECT_TRUE(enabled) << "one opening is still held";
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
  ASSERT_TRUE(opened.ok());
  HyraSim::SetDaemonRunning(false);
  EXPECT_FALSE(TarnLib_Init(0, 0));
  EXPECT_EQ(TarnLibSim_Openings(), 1);
  StorageContainerResult* result = nullptr;
  const TarnLib_ErrorEx error = TarnLib_GetStorageContainer(1, nullptr, &result);
  EXPECT_FALSE(TarnLib_ErrorExIsSuccess(&error));
  EXPECT_STREQ(TarnLib_ErrorExStr(&error), "Tarnd is not running");
  EXPECT_EQ(result, nullptr);
}

TEST(ContainerId, NormalisesValidFormsAndRejectsTheRest) {
  struct Case {
    const char* id;
    const char* normal;  // null: invalid
  };
  const Case cases[] = {
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f", "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f"},
      {"6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F", "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f"},
      {"6f1c2f4e8d3b4c1a9e2f0a1b2c3d4e5f", "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f"},
      {"6F1c2f4e8D3b4c1a9e2f0a1b2c3d4E5F", "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f"},
      {"", nullptr},
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5", nullptr},    // 35 characters
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f0", nullptr},  // 37 characters
      {"6f1c2f4e8d3b-4c1a-9e2f-0a1b2c3d4e5f0", nullptr},   // a hyphen moved
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5g", nullptr},   // not hex
      {"{6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5}", nullptr},  // braces
      {" 6f1c2f4e8d3b4c1a9e2f0a1b2c3d4e5f", nullptr},      // blank
      {"6f1c2f4e8d3b4c1a9e2f0a1b2c3d4e5", nullptr},        // 31 digits
      {"6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f6f1c2f4e8d3b4c1a9e2f", nullptr},
  };
  for (const Case& c : cases) {
    // Canary bytes around the 37-byte buffer catch any write beyond it.
    char buffer[TARNLIB_CONTAINER_ID_TEXT_SIZE + 8];
    std::memset(buffer, '#', sizeof(buffer));
    char* out = buffer + 4;
    const bool valid = TarnLib_NormalizeContainerIdString(c.id, out);
    EXPECT_EQ(valid, c.normal != nullptr) << c.id;
    if (c.normal != nullptr) {
      EXPECT_STREQ(out, c.normal) << c.id;
    } else {
      EXPECT_EQ(out[0], '#') << "buffer left untouched: " << c.id;
    }
    for (int i = 0; i < 4; ++i) EXPECT_EQ(buffer[i], '#') << c.id;
    for (size_t i = 4 + TARNLIB_CONTAINER_ID_TEXT_SIZE; i < sizeof(buffer); ++i) {
      EXPECT_EQ(buffer[i], '#') << c.id;
    }
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

  OskCtl::Storage::StorageInfoImpl host;
  HostCtl::Storage::VendorProviderInfo vp9;
  vp9.name = "vp9";
  vp9.url = "https://vp9.example.test:8443/kiro";
  host.UpdateTarnVendorProvider({vp9});
  EXPECT_EQ(ExportedNames(), (std::vector<std::string>{"gold", "silver", "bronze", "legacy"}));

  OskCtl::Storage::TarnFileSystemImpl::UnRegisterVendorProvider("vp1");
  EXPECT_EQ(ExportedNames(), (std::vector<std::string>{"bronze", "legacy"}));
}

TEST_F(DaemonClient, ContainerRecordsCarryArraysAndEndpoints) {
  Opened opened;
  StorageContainerResult* result = nullptr;
  TarnLib_GetStorageContainer(1, nullptr, &result);
  ASSERT_NE(result, nullptr);
  ASSERT_EQ(result->containerCount, 3u);
  const StorageContainerRecord& silver = *result->containers[1];
  EXPECT_STREQ(silver.containerId, SimTest::kSilverId);
  EXPECT_STREQ(silver.vpUrl, "https://vp1.example.test:8443/kiro");
  EXPECT_EQ(silver.maxTarnSizeMB, 1048576);
  ASSERT_EQ(silver.arrayCount, 2);
  const StorageArrayRecord& a = *silver.arrays[0];
  EXPECT_STREQ(a.arrayName, "Array A");
  ASSERT_EQ(a.peCount, 3);
  EXPECT_EQ(a.protocolEndpoints[0]->address->type, PROTOCOL_ENDPOINT_NFS);
  EXPECT_STREQ(a.protocolEndpoints[0]->address->secondText, "/exports/a1");
  const ProtocolEndpointRecord& nfs4x = *a.protocolEndpoints[2];
  EXPECT_EQ(nfs4x.address->type, PROTOCOL_ENDPOINT_NFS4X);
  EXPECT_STREQ(nfs4x.address->firstText, "/exports/a3");
  ASSERT_EQ(nfs4x.nfs4xAddressCount, 2);
  EXPECT_STREQ(nfs4x.nfs4xAddresses[1], "192.0.2.12");
  EXPECT_EQ(nfs4x.isConfigured, 0);
  const ProtocolEndpointRecord& bare = *silver.arrays[1]->protocolEndpoints[1];
  EXPECT_EQ(bare.nfs4xAddressCount, 0);
  EXPECT_EQ(bare.isAccessible, 0);
  TarnLib_FreeStorageContainerResult(result);
  TarnLib_FreeStorageContainerResult(nullptr);
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

TEST_F(DaemonClient, VolumeRecordsHoldSizesProfileMetadataAndBlockSize) {
  Opened opened;
  TarnInfo* info = nullptr;
  ASSERT_EQ(TarnLib_GetTarnInfo(SimTest::kGoldId, SimTest::kGoldConfigTarn, &info), 0);
  EXPECT_EQ(info->storageProfile, nullptr);
  EXPECT_EQ(info->logicalSizeMB, 4096);
  TarnLib_FreeTarnInfo(info);

  TarnSpaceStatsInfo* stats = nullptr;
  ASSERT_EQ(TarnLib_SpaceStatsForTarn(SimTest::kSilverId, SimTest::kSilverUnknownUnshared, &stats),
            0);
  EXPECT_FALSE(stats->unsharedSizeValid);
  EXPECT_EQ(stats->committedSizeMB, 20480);
  TarnLib_FreeTarnSpaceStatsInfo(stats);

  void* block = nullptr;
  ASSERT_EQ(TarnLib_UnsharedChunksTarn(SimTest::kSilverId, SimTest::kSilverUnknownUnshared, 0, 0, 0,
                                       0, 0, &block),
            0);
  int64_t words[2];
  std::memcpy(words, block, sizeof(words));
  EXPECT_EQ(words[0], 8192);
  free(block);

  TarnMetadata* metadata = nullptr;
  ASSERT_EQ(TarnLib_GetTarnMetadata(SimTest::kGoldId, SimTest::kGoldTarn, &metadata), 0);
  std::vector<std::string> pairs;
  for (const TarnMetadataEntry* e = metadata->first; e != nullptr; e = e->next) {
    pairs.push_back(std::string(e->key) + "=" + e->value);
  }
  EXPECT_EQ(pairs, (std::vector<std::string>{"owner=ops", "tier=1"}));
  TarnLib_FreeTarnMetadata(metadata);
  ASSERT_EQ(TarnLib_GetTarnMetadata(SimTest::kGoldId, SimTest::kGoldConfigTarn, &metadata), 0);
  EXPECT_EQ(metadata->first, nullptr);
  TarnLib_FreeTarnMetadata(metadata);
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
  const int32_t level = 16;
  const int32_t dump = 1;
  const int32_t unbind = 0;
  EXPECT_EQ(TarnLib_DebugCommand(&level, &dump, nullptr), 0);
  EXPECT_EQ(TarnLib_DebugCommand(nullptr, &dump, &unbind), 0);
  const int32_t badLevel = 5;
  const int32_t badUnbind = -1;
  EXPECT_EQ(TarnLib_DebugCommand(&badLevel, nullptr, nullptr), 3);
  EXPECT_EQ(TarnLib_DebugCommand(nullptr, &dump, &badUnbind), 3) << "refused whole";
  EXPECT_EQ(TarnLib_SetSPMSpaceEfficiencyManipulationEnabled(false), 0);
  const auto daemon = World()["daemon"];
  EXPECT_EQ(daemon["logLevel"], 16);
  EXPECT_EQ(daemon["dumpRequests"], 2);
  EXPECT_EQ(daemon["unbindPeriod"], 0);
  EXPECT_EQ(daemon["spaceEfficiencyManipulation"], false);
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
