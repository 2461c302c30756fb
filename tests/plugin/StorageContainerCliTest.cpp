// The storagecontainer commands end to end.
#include <nlohmann/json.hpp>
#include <string>

#include "CliSupport.h"

namespace PluginCliTest {
namespace {

using nlohmann::json;

constexpr char kSilverUpper[] = "9B8A7C6D-5E4F-4A3B-8C2D-1E0F9A8B7C6D";

// The names of the mounted containers, in mount order.
std::string MountedNames(const json& world) {
  std::string names;
  for (const json& m : world["host"]["mounted"]) names += m["name"].get<std::string>() + " ";
  return names;
}

TEST_F(CliTest, ContainersAreAddedLoadedCheckedAndRemoved) {
  EXPECT_EQ(Tarn({"storagecontainer", "add", "-n", "bronze", "-c",
                  "2c3d4e5f-6a7b-4c8d-9e0f-a1b2c3d4e5f6", "-a", "array-c"}),
            (Outcome{0, "true\n", ""}));
  EXPECT_EQ(Tarn({"storagecontainer", "load"}), (Outcome{0, R"(silver
  StorageContainer Name: silver
  StorageContainer Id: 9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d
  Max Tarn Size (MB): 1048576
  VP URL: https://vp1.example.test:8443/kiro
  Arrays:
    array-a
      ArrayId: array-a
      Name: Array A
      VendorId: ACME
      ModelId: M100
      PEInfo:
        PE #0 (localUID: pe-a1, isAccessible: 1, isConfigured: 1, type: NFS, ipAddress: 192.0.2.10, serverMount: /exports/a1)
        PE #1 (localUID: pe-a2, isAccessible: 1, isConfigured: 1, type: SCSI, lunID: lun-0001)
        PE #2 (localUID: pe-a3, isAccessible: 1, isConfigured: 0, type: NFS4x, ipAddress(es): 192.0.2.11,192.0.2.12, serverMount: /exports/a3)
    array-b
      ArrayId: array-b
      Name: Array B
      VendorId: ACME
      ModelId: M200
      PEInfo:
        PE #0 (localUID: pe-b1, isAccessible: 1, isConfigured: 1, type: SCSI, lunID: lun-0101)
        PE #1 (localUID: pe-b2, isAccessible: 0, isConfigured: 1, type: NFS4x, ipAddress(es): , serverMount: /exports/b2)
)",
                                                         ""}));
  EXPECT_EQ(Tarn({"storagecontainer", "checktarns", "-p", "/hyra/volumes/silver", "-v",
                  "4a5b6c7d-8e9f-4a0b-b1c2-d3e4f5a6b7c8", "--tarn", "nope"}),
            (Outcome{0, R"(TarnId                                Status
------------------------------------  ------------
4a5b6c7d-8e9f-4a0b-b1c2-d3e4f5a6b7c8  unconfirmed
nope                                  non-existent
)",
                     ""}));
  const json loaded = World();
  EXPECT_EQ(MountedNames(loaded), "gold bronze silver ");
  EXPECT_EQ(loaded["host"]["mounted"][2]["arrays"], json({"array-a", "array-b"}));

  EXPECT_EQ(Tarn({"storagecontainer", "remove", "-c", kSilverUpper}), (Outcome{0, "true\n", ""}));
  EXPECT_EQ(MountedNames(World()), "gold bronze ");
}

TEST_F(CliTest, ContainerFailuresEndWithTheCommandsText) {
  const std::string gold = "/hyra/volumes/gold";
  const struct {
    std::vector<std::string> arm;  // hyrasim arguments
    std::vector<std::string> args;
    std::string err;
    std::string mounted;
  } cases[] = {
      // clang-format off
      {{"fail", "AddTarnFileSystem", "--after", "1", "--message", "disk full"}, {"load"},
       "Error getting/adding tarn file system 'disk full, skipping\n", "gold silver "},
      {{"fail", "AddTarnFileSystem", "--after", "1", "--null"}, {"load"},
       "Error getting/adding tarn file system 'no file system was returned for container bronze, "
       "skipping\n", "gold silver "},
      {{"fail", "TarnLib_GetStorageContainer", "--message", "no answer"}, {"load"},
       "Unable to load Tarn datastores: no answer\n", "gold "},
      {{"fail", "RemoveTarnFileSystem", "--message", "busy"},
       {"remove", "-c", "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f"}, "busy\n", "gold "},
      // A failed query is not a container without config-tarns.
      {{"fail", "TarnLib_QueryAllConfigTarns", "--message", "query-broke"},
       {"checktarns", "-p", gold},
       "Unable to list the config-tarns of container 6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f: "
       "query-broke\n", "gold "},
      // Fewer states than tarns asked: no tarn goes missing from the table unsaid.
      {{"fail", "CheckTarnAccessibility", "--null"},
       {"checktarns", "-p", gold, "-v", "0c9e2d1a-3b4f-4a5e-8f70-112233445566", "-v", "x"},
       "The host answered 0 accessibility states for 2 tarns\n", "gold "},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.arm[1]);
    ASSERT_EQ(Sim({"init", "--demo"}).status, 0);
    ASSERT_EQ(Sim(c.arm).status, 0);
    json before = World();
    std::vector<std::string> args = c.args;
    args.insert(args.begin(), "storagecontainer");
    EXPECT_EQ(Tarn(args), (Outcome{1, "", c.err}));
    json after = World();
    EXPECT_EQ(MountedNames(after), c.mounted);
    // Only the mounts a load made before its failure may have changed.
    before["host"].erase("mounted");
    after["host"].erase("mounted");
    EXPECT_EQ(after, before);
  }
}

}  // namespace
}  // namespace PluginCliTest
