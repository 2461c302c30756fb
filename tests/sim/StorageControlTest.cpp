// The storage-control library against the demo world: providers, mounts,
// config-tarns and endpoint events.
#include <memory>
#include <string>
#include <vector>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "SimTest.h"
#include "TarnLib/TarnLib.h"

namespace {

using HostCtl::Lib::HostCtlException;
using HostCtl::Storage::TarnFileSystem;
using OskCtl::Storage::StorageInfoImpl;
using OskCtl::Storage::TarnFileSystemImpl;
using StorageControl = SimTest::FreshWorld;

// The file systems GetTarnFileSystems answers, owned.
std::vector<std::unique_ptr<TarnFileSystem> > Mounted(StorageInfoImpl& host) {
  std::vector<std::unique_ptr<TarnFileSystem> > owned;
  for (TarnFileSystem* fs : host.GetTarnFileSystems()) owned.emplace_back(fs);
  return owned;
}

std::string MessageOf(const std::function<void()>& action) {
  try {
    action();
  } catch (const HostCtlException& e) {
    return e.GetMessage(false);
  }
  return "(no exception)";
}

TEST_F(StorageControl, ProviderUpdateReplacesWholeRecordsByName) {
  StorageInfoImpl host;
  host.UpdateTarnVendorProvider({{"vp1", "https://new.example.test/kiro", "", {}},
                                 {"vp3", "", "", {{"array-x", false, -7}}}});

  std::vector<HostCtl::Storage::VendorProviderInfo> found;
  host.GetTarnVendorProviders("vp1", found);
  ASSERT_EQ(found.size(), 1u);
  EXPECT_EQ(found[0].url, "https://new.example.test/kiro");
  EXPECT_TRUE(found[0].arrays.empty()) << "the old arrays are gone";
  host.GetTarnVendorProviders("vp3", found);
  ASSERT_EQ(found.size(), 2u) << "appended to what the list held";
  EXPECT_EQ(found[1].arrays[0].priority, -7);
  EXPECT_TRUE(host.TarnVpExists("vp3"));

  TarnFileSystemImpl::UnRegisterVendorProvider("vp3");
  EXPECT_FALSE(host.TarnVpExists("vp3"));
  EXPECT_EQ(MessageOf([] { TarnFileSystemImpl::UnRegisterVendorProvider("vp3"); }),
            "No Kiro provider named vp3 is registered");
  const auto providers = World()["host"]["providers"];
  ASSERT_EQ(providers.size(), 2u);
  EXPECT_EQ(providers[0]["name"], "vp1") << "an update keeps the provider's place";
}

TEST_F(StorageControl, MountKeepsIdAsGivenAnswersForItsTarnsAndIsFoundByPath) {
  StorageInfoImpl host;
  std::string id = "9B8A7C6D5E4F4A3B8C2D1E0F9A8B7C6D";
  std::unique_ptr<TarnFileSystem> silver(host.AddTarnFileSystem("silver", id, {"array-a"}, true));
  ASSERT_NE(silver, nullptr);
  EXPECT_EQ(silver->GetContainerId(), "9B8A7C6D5E4F4A3B8C2D1E0F9A8B7C6D");
  EXPECT_EQ(silver->GetContainerIdText(), SimTest::kSilverId);
  EXPECT_TRUE(silver->MatchesContainerId(SimTest::kSilverId));
  EXPECT_FALSE(silver->MatchesContainerId(SimTest::kGoldId));
  // Accessibility is the stored state of tarns of this container only.
  EXPECT_EQ(silver->CheckTarnAccessibility({SimTest::kSilverUnknownUnshared,
                                            "4a5b6c7d-8e9f-4a0b-b1c2-d3e4f5a6b7c8",
                                            SimTest::kGoldTarn, SimTest::kSilverUnknownUnshared}),
            (std::vector<HostCtl::Storage::TarnAccessibilityType>{
                HostCtl::Storage::TARN_INACCESSIBLE, HostCtl::Storage::TARN_UNCONFIRMED,
                HostCtl::Storage::TARN_NON_EXISTENT, HostCtl::Storage::TARN_INACCESSIBLE}));
  EXPECT_TRUE(silver->CheckTarnAccessibility({}).empty());

  auto mounted = Mounted(host);
  ASSERT_EQ(mounted.size(), 2u);
  EXPECT_EQ(mounted[0]->GetContainerName(), "gold");
  EXPECT_EQ(mounted[1]->GetContainerName(), "silver");

  for (const char* path : {"/hyra/volumes/silver", "/hyra/volumes/silver/"}) {
    TarnFileSystem* found = host.GetTarnFileSystemByPath(path);
    ASSERT_NE(found, nullptr) << path;
    EXPECT_EQ(found->GetContainerName(), "silver");
  }
  for (const char* path :
       {"/hyra/volumes/bronze", "/hyra/volumes/", "silver", "/hyra/volumes/silver//"}) {
    EXPECT_EQ(host.GetTarnFileSystemByPath(path), nullptr) << path;
  }

  host.RemoveTarnFileSystem(SimTest::kSilverId);
  EXPECT_EQ(MessageOf([&] { host.RemoveTarnFileSystem(SimTest::kSilverId); }),
            std::string("No container file system with id ") + SimTest::kSilverId + " is mounted");
  // Names that would leave /hyra/volumes are refused.
  for (const char* name : {"", ".", "..", "a/b", "../etc"}) {
    EXPECT_THROW(host.AddTarnFileSystem(name, id, {}, true), HostCtlException) << name;
  }
  EXPECT_EQ(Mounted(host).size(), 1u);
}

// A mount that is already what was asked for is answered as the existing
// mount; only a true conflict, or an id that names no container, is refused.
TEST_F(StorageControl, MountingAgainAnswersTheExistingMountAndRefusesConflicts) {
  StorageInfoImpl host;
  std::string sameGold = "6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F";
  std::unique_ptr<TarnFileSystem> again(host.AddTarnFileSystem("gold", sameGold, {}, true));
  ASSERT_NE(again, nullptr);
  EXPECT_EQ(again->GetContainerName(), "gold");
  EXPECT_EQ(again->GetContainerId(), SimTest::kGoldId) << "the existing mount, as it was mounted";

  std::string silver = SimTest::kSilverId;
  std::string upperGold = "6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F";
  std::string bad = "Bad CID";
  const struct {
    const char* name;
    std::string* id;
    std::string refusal;
  } refused[] = {
      {"gold", &silver,
       "A container file system named gold is already mounted at /hyra/volumes/gold"},
      {"gold-2", &upperGold,
       "The container 6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F is already mounted as gold at "
       "/hyra/volumes/gold"},
      {"odd", &bad, "Cannot mount the container odd: \"Bad CID\" is not a container id"},
  };
  for (const auto& c : refused) {
    EXPECT_EQ(MessageOf([&] { host.AddTarnFileSystem(c.name, *c.id, {}, true); }), c.refusal);
  }
  EXPECT_EQ(World()["host"]["mounted"].size(), 1u);

  // Removing by any form of the id takes the one mount.
  host.RemoveTarnFileSystem("6F1C2F4E8D3B4C1A9E2F0A1B2C3D4E5F");
  EXPECT_TRUE(World()["host"]["mounted"].empty());
}

TEST_F(StorageControl, ConfigTarnLifecycle) {
  StorageInfoImpl host;
  TarnFileSystem* gold = host.GetTarnFileSystemByPath("/hyra/volumes/gold");
  ASSERT_NE(gold, nullptr);
  std::string path;
  gold->CreateConfigTarn("vm-two", "policy-x", 2048, "vm-uuid-2", path, "", false);
  EXPECT_EQ(path, "/hyra/volumes/gold/vm-two");

  QueryResult* result = nullptr;
  {
    SimTest::Opened opened;
    ASSERT_EQ(TarnLib_QueryAllConfigTarns(SimTest::kGoldId, 2147483647, 0, &result, 0), 0);
  }
  ASSERT_EQ(result->entryCount, 2);
  EXPECT_STREQ(result->entries[1]->name, "vm-two");
  const std::string uuid = result->entries[1]->tarnId;
  TarnLib_FreeQueryResult(result);
  EXPECT_EQ(gold->CheckTarnAccessibility({uuid, "no-such-tarn"}),
            (std::vector<HostCtl::Storage::TarnAccessibilityType>{
                HostCtl::Storage::TARN_ACCESSIBLE, HostCtl::Storage::TARN_NON_EXISTENT}));

  gold->MountConfigTarn("vm-two", "", "", false);
  EXPECT_EQ(MessageOf([&] { gold->MountConfigTarn("", uuid, "", false); }),
            "The config-tarn vm-two is already mounted");
  gold->UnmountConfigTarn("", uuid, "", false);
  EXPECT_EQ(MessageOf([&] { gold->UnmountConfigTarn("vm-two", "", "", false); }),
            "The config-tarn vm-two is not mounted");
  gold->RemoveConfigTarn("vm-two", "", "", false);
  EXPECT_EQ(MessageOf([&] { gold->RemoveConfigTarn("vm-two", "", "", false); }),
            "No config-tarn named vm-two in gold");
  gold->MountConfigTarn("vm-config-1", "", "", false);
  gold->RemoveConfigTarn("", SimTest::kGoldConfigTarn, "", false);  // mounted: goes as well
  EXPECT_EQ(World()["containers"][0]["tarns"].size(), 1u);
}

TEST_F(StorageControl, ConfigTarnRefusals) {
  StorageInfoImpl host;
  TarnFileSystem* gold = host.GetTarnFileSystemByPath("/hyra/volumes/gold");
  ASSERT_NE(gold, nullptr);
  std::string path = "untouched";
  struct Case {
    std::string name;
    int64_t size;
    std::string message;
  };
  const Case cases[] = {
      {"vm-config-1", 10, "A config-tarn named vm-config-1 already exists in gold"},
      {"big", 2097153, "The size 2097153 MB is above the largest tarn size 2097152 MB of gold"},
      {"neg", -1, "The size of a config-tarn cannot be negative"},
      {"a/b", 1, "\"a/b\" cannot be the directory name of a config-tarn"},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(MessageOf([&] { gold->CreateConfigTarn(c.name, "", c.size, "", path, "", false); }),
              c.message);
  }
  EXPECT_EQ(path, "untouched");
  EXPECT_EQ(MessageOf([&] { gold->MountConfigTarn("", "", "", false); }),
            "Either a config-tarn name or UUID is needed");
  EXPECT_EQ(MessageOf([&] { gold->MountConfigTarn("", SimTest::kGoldTarn, "", false); }),
            std::string("The tarn ") + SimTest::kGoldTarn + " is not a config-tarn");

  // A container the daemon does not know: mounted by hand under its own id.
  std::string legacyId = SimTest::kLegacyId;
  std::unique_ptr<TarnFileSystem> legacy(host.AddTarnFileSystem("legacy", legacyId, {}, true));
  EXPECT_EQ(MessageOf([&] { legacy->CreateConfigTarn("x", "", 1, "", path, "", false); }),
            std::string("Tarnd does not know the container ") + SimTest::kLegacyId +
                " mounted as legacy");
  host.RemoveTarnFileSystem(SimTest::kLegacyId);
  EXPECT_EQ(MessageOf([&] { legacy->MountConfigTarn("x", "", "", false); }),
            "The container file system legacy is no longer mounted");
}

TEST_F(StorageControl, EndpointEventsMarkTheEndpointAndNameMountedContainersInMountOrder) {
  StorageInfoImpl host;
  std::string silverId = SimTest::kSilverId;
  std::string bronzeId = "2c3d4e5f-6a7b-4c8d-9e0f-a1b2c3d4e5f6";
  delete host.AddTarnFileSystem("bronze", bronzeId, {"array-c"}, true);
  delete host.AddTarnFileSystem("silver", silverId, {"array-b", "array-a"}, true);

  std::vector<std::string> containers{"kept"};
  host.NotifyTarnProtocolEndpointEvent("pe-a2", HostCtl::Storage::PE_APD_START, containers);
  EXPECT_EQ(containers, (std::vector<std::string>{"kept", "gold", "silver"}));
  EXPECT_EQ(World()["arrays"][0]["protocolEndpoints"][1]["accessible"], false);

  containers.clear();
  host.NotifyTarnProtocolEndpointEvent("pe-a2", HostCtl::Storage::PE_APD_END, containers);
  EXPECT_EQ(World()["arrays"][0]["protocolEndpoints"][1]["accessible"], true);
  containers.clear();
  host.NotifyTarnProtocolEndpointEvent("pe-c1", HostCtl::Storage::PE_APD_START, containers);
  EXPECT_EQ(containers, (std::vector<std::string>{"bronze"}));
  EXPECT_EQ(MessageOf([&] {
              host.NotifyTarnProtocolEndpointEvent("pe-zz", HostCtl::Storage::PE_APD_END,
                                                   containers);
            }),
            "No protocol endpoint has the local UID pe-zz");
}

}  // namespace
