// The daemon client library's records as the plug-in is compiled against
// them. The library is closed and built apart, so these layouts are its ABI:
// a field moved, widened or narrowed in our declarations would read another
// field of the real library's records without a compiler noticing. The host
// is 32-bit x86, where the offsets are fixed exactly; elsewhere the order of
// fields and their widths still hold. And 64-bit sizes must come through the
// 32-bit build whole.
#include <cstddef>
#include <cstdint>
#include <type_traits>

#include "ConfigTarnAdd.h"
#include "PluginTestSupport.h"
#include "StorageContainerLoad.h"
#include "TarnLib/TarnLib.h"
#include "VirtualVolumeGet.h"

namespace PluginTest {
namespace {

// Fields the daemon keeps in 32 bits, whatever the build.
template <typename T>
constexpr bool kIs32 = std::is_same_v<T, int32_t> || std::is_same_v<T, uint32_t>;
static_assert(kIs32<decltype(StorageContainerResult::containerCount)>);
static_assert(kIs32<decltype(StorageContainerRecord::arrayCount)>);
static_assert(kIs32<decltype(StorageContainerRecord::reserved)>);
static_assert(kIs32<decltype(StorageArrayRecord::peCount)>);
static_assert(kIs32<decltype(ProtocolEndpointRecord::nfs4xAddressCount)>);
static_assert(kIs32<decltype(ProtocolEndpointAddress::type)>);
static_assert(kIs32<decltype(QueryResult::entryCount)>);
static_assert(kIs32<decltype(KiroFaultArrayEntry::reserved)>);
static_assert(kIs32<TarnLib_Status>);
static_assert(std::is_same_v<decltype(StorageContainerRecord::maxTarnSizeMB), int64_t>);
static_assert(sizeof(KiroFaultArrayEntry::isActive) == 1);
static_assert(sizeof(ProtocolEndpointRecord::isAccessible) == 1);
// The configured flag is the byte right after the accessible one.
static_assert(offsetof(ProtocolEndpointRecord, isConfigured) ==
              offsetof(ProtocolEndpointRecord, isAccessible) + 1);
// The first field is what the commands read of a config-tarn entry and of the
// metadata record.
static_assert(offsetof(ConfigTarnEntry, tarnId) == 0);
static_assert(offsetof(TarnMetadata, first) == 0);
static_assert(TARNLIB_CONTAINER_ID_TEXT_SIZE == 37);
static_assert(TARNLIB_ACTIVATION_BLOCK_SIZE == 64);

#if defined(__i386__)
// The host's ABI: 4-byte pointers, and 64-bit integers aligned to 4 bytes.
static_assert(sizeof(KiroFaultArrayEntry) == 12);
static_assert(offsetof(KiroFaultArrayEntry, arrayId) == 0);
static_assert(offsetof(KiroFaultArrayEntry, isActive) == 4);
static_assert(offsetof(KiroFaultArrayEntry, reserved) == 8);

static_assert(offsetof(StorageContainerResult, containers) == 4);
static_assert(offsetof(StorageContainerRecord, vpUrl) == 4);
static_assert(offsetof(StorageContainerRecord, containerId) == 8);
static_assert(offsetof(StorageContainerRecord, arrayCount) == 12);
static_assert(offsetof(StorageContainerRecord, maxTarnSizeMB) == 16);
static_assert(offsetof(StorageContainerRecord, reserved) == 24);
static_assert(offsetof(StorageContainerRecord, arrays) == 28);
static_assert(offsetof(StorageArrayRecord, modelId) == 12);
static_assert(offsetof(StorageArrayRecord, peCount) == 16);
static_assert(offsetof(StorageArrayRecord, protocolEndpoints) == 20);
static_assert(offsetof(ProtocolEndpointRecord, nfs4xAddresses) == 12);
static_assert(offsetof(ProtocolEndpointRecord, nfs4xAddressCount) == 16);
static_assert(offsetof(ProtocolEndpointRecord, address) == 28);
static_assert(offsetof(ProtocolEndpointRecord, isAccessible) == 32);
static_assert(offsetof(ProtocolEndpointAddress, firstText) == 4);
static_assert(offsetof(ProtocolEndpointAddress, secondText) == 8);
static_assert(offsetof(QueryResult, entries) == 4);
static_assert(offsetof(TarnMetadataEntry, value) == 4);
static_assert(offsetof(TarnMetadataEntry, next) == 8);
static_assert(offsetof(TarnSpaceStatsInfo, committedSizeMB) == 8);
static_assert(offsetof(TarnSpaceStatsInfo, unsharedSizeMB) == 16);
static_assert(offsetof(TarnSpaceStatsInfo, unsharedSizeValid) == 24);
#endif

using namespace HalvikCli::TarnNamespace;

constexpr char kGold[] = "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f";
constexpr char kTarn[] = "0c9e2d1a-3b4f-4a5e-8f70-112233445566";

class WideSizeTest : public SimWorldTest {};

// Sizes past 32 bits, where a size_t or long on the way would cut them.
TEST_F(WideSizeTest, SizesPast32BitsReachTheResultAndTheHostWhole) {
  nlohmann::json world = World();
  nlohmann::json& gold = world["containers"][0];
  gold["maxTarnSizeMB"] = INT64_MAX;
  world["containers"][1]["maxTarnSizeMB"] = INT64_MAX - 1;  // silver, mounted by the load
  nlohmann::json& tarn = gold["tarns"][0];
  ASSERT_EQ(tarn["uuid"], kTarn);
  tarn["logicalSizeMB"] = int64_t{1} << 42;
  tarn["committedSizeMB"] = (int64_t{1} << 32) + 1;
  tarn["unsharedSizeMB"] = int64_t{1} << 33;
  tarn["blockSize"] = int64_t{1} << 32;
  LoadScenario(world);

  const Calls got = RunCommand(*VirtualVolumeGet::New(), Args({{"container-id", kGold},
                                                               {"uuid", kTarn}}));
  ASSERT_EQ(got.size(), 2u);
  EXPECT_NE(got[0].find("Logical Size=4398046511104,Committed Size=4294967297,"
                        "Unshared Size=8589934592,Unshared Size Valid=true"),
            std::string::npos)
      << got[0];
  EXPECT_NE(got[0].find("Block Size=4294967296}"), std::string::npos) << got[0];

  const Calls loaded = RunCommand(*StorageContainerLoad::New(), nullptr);
  ASSERT_FALSE(loaded.empty());
  EXPECT_NE(loaded[0].find("Max Tarn Size (MB)=9223372036854775806,"), std::string::npos)
      << loaded[0];

  EXPECT_EQ(RunCommand(*ConfigTarnAdd::New(),
                       Args({{"name", "wide"}, {"container-id", kGold}, {"size", INT64_MAX}})),
            (Calls{"result: true", "finish"}));
  bool stored = false;
  world = World();
  for (const nlohmann::json& t : world["containers"][0]["tarns"]) {
    if (t.value("configTarn", nlohmann::json::object()).value("name", "") == "wide") {
      EXPECT_EQ(t["logicalSizeMB"], INT64_MAX);
      stored = true;
    }
  }
  EXPECT_TRUE(stored);
}

}  // namespace
}  // namespace PluginTest
