// The storagecontainer commands against the simulated host: what they mount
// and unmount, their exact texts, where a failure stops them, and how the
// daemon's records are read.
#include <boost/make_shared.hpp>
#include <stdexcept>

#include "PluginTestSupport.h"
#include "StorageContainerAdd.h"
#include "StorageContainerCheckTarns.h"
#include "StorageContainerLoad.h"
#include "StorageContainerRemove.h"
#include "World.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using nlohmann::json;
using T = RecordingOutput::ThrowOn;
typedef std::vector<HostCtl::Storage::TarnAccessibilityType> States;

constexpr char kGoldId[] = "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f";
const std::string kLoadError = "error: Error getting/adding tarn file system '";

// An operation armed to fail with "boom" (or to answer nothing) after some
// calls pass; no operation when null.
struct Arming {
  const char* operation;
  int64_t after;
  bool null;
};

// A sink whose SetResult throws something other than a host failure.
class RefusingOutput : public Fendle::CallSpec::Output {
 public:
  void SetResult(const boost::shared_ptr<Fendle::MetaObj::MetaObject>&) override {
    throw std::runtime_error("refused");
  }
};

class StorageContainerTest : public SimWorldTest {
 protected:
  static void Prepare(const json& world, const Arming& arming) {
    LoadScenario(world);
    HyraSim::ClearFailures();
    if (arming.operation) Arm(arming.operation, "boom", arming.after, arming.null);
  }
  // The demo world exporting c1..c<count> instead, those in mounted mounted.
  static json Containers(int count, const std::vector<int>& mounted) {
    json world = World();
    world["containers"] = world["host"]["mounted"] = json::array();
    for (int i = 1; i <= count; ++i) {
      world["containers"].push_back(
          {{"name", "c" + std::to_string(i)},
           {"id", "00000000-0000-4000-8000-00000000000" + std::to_string(i)},
           {"vpUrl", "https://vp2.example.test:8443/kiro"}});
    }
    for (int i : mounted) {
      world["host"]["mounted"].push_back(
          {{"name", "c" + std::to_string(i)},
           {"id", "00000000-0000-4000-8000-00000000000" + std::to_string(i)}});
    }
    return world;
  }
  static std::string MountedNames() {
    const json world = World();
    std::string names;
    for (const json& m : world["host"]["mounted"]) names += m["name"].get<std::string>() + " ";
    return names;
  }
};

TEST_F(StorageContainerTest, LoadMountsWhatIsNotMountedAndStopsAtTheFirstFailure) {
  const struct {
    json world;
    Arming arming;
    Calls calls;  // a result as the names of its rows
    std::string mountedAfter;
  } cases[] = {
      // clang-format off
      {Containers(2, {1, 2}), {"AddTarnFileSystem", 0, false}, {"", "finish"}, "c1 c2 "},
      {Containers(5, {2}), {}, {"c1 c3 c4 c5 ", "finish"}, "c2 c1 c3 c4 c5 "},
      // The listing is asked for even with nothing exported.
      {Containers(0, {}), {"GetTarnFileSystems", 0, false}, {kLoadError + "boom, skipping"}, ""},
      {Containers(5, {}), {"AddTarnFileSystem", 2, false}, {kLoadError + "boom, skipping"},
       "c1 c2 "},
      {Containers(3, {}), {"AddTarnFileSystem", 1, true},
       {kLoadError + "no file system was returned for container c2, skipping"}, "c1 "},
      // The row names the container as the host reports the new mount.
      {Containers(2, {}), {"GetContainerName", 1, true}, {"c1  ", "finish"}, "c1 c2 "},
      {Containers(2, {}), {"TarnLib_GetStorageContainer", 0, true}, {"", "finish"}, ""},
      {Containers(2, {}), {"TarnLib_GetStorageContainer", 0, false},
       {"error: Unable to load Tarn datastores: boom"}, ""},
      // clang-format on
  };
  for (const auto& c : cases) {
    Prepare(c.world, c.arming);
    boost::shared_ptr<RecordingOutput> output = RecordingOutput::New();
    StorageContainerLoad::New()->Execute(Fendle::CallSpec::Input::New(), output);
    Calls calls = output->GetCalls();
    if (auto rows = boost::dynamic_pointer_cast<Fendle::MetaObj::MetaList>(output->GetResult())) {
      calls[0].clear();
      for (const auto& row : rows->GetElements()) {
        const std::string text = Describe(row);  // StorageContainer{StorageContainer Name="..."
        const size_t from = text.find('"') + 1;
        calls[0] += text.substr(from, text.find('"', from) - from) + " ";
      }
    }
    EXPECT_EQ(calls, c.calls);
    EXPECT_EQ(MountedNames(), c.mountedAfter);
  }
}

TEST_F(StorageContainerTest, LoadReportsAFailingSinkAndLetsOtherExceptionsPass) {
  const Calls calls = RunCommand(*StorageContainerLoad::New(), nullptr, T::kResult);
  ASSERT_EQ(calls.size(), 2u);
  EXPECT_EQ(calls[1], kLoadError + "sink failed, skipping");
  LoadScenario(Containers(1, {}));
  EXPECT_THROW(StorageContainerLoad::New()->Execute(Fendle::CallSpec::Input::New(),
                                                    boost::make_shared<RefusingOutput>()),
               std::runtime_error);
  EXPECT_EQ(MountedNames(), "c1 ");
}

// Well-formed endpoints are checked end to end; these are the parts the
// daemon may leave out.
TEST_F(StorageContainerTest, RecordsDescribeEndpointsAndReadMissingPartsAsEmpty) {
  char a[] = "a", b[] = "b", uid[] = "u1", m1[] = "m1";
  char* addresses[] = {a, nullptr, b};
  ProtocolEndpointAddress nfs4{2, m1, nullptr}, bare4{2, nullptr, nullptr}, other{3, m1, m1};
  const std::pair<ProtocolEndpointAddress*, std::string> cases[] = {
      {&nfs4, ", type: NFS4x, ipAddress(es): a,,b, serverMount: m1)"},
      {&bare4, ", type: NFS4x, ipAddress(es): , serverMount: )"},
      {&other, ""},
      {nullptr, ""},
  };
  for (const auto& c : cases) {
    const int32_t count = c.first == &nfs4 ? 3 : 0;
    ProtocolEndpointRecord endpoint{uid, 0, 0, addresses, count, 0, 0, c.first, 7, 0};
    EXPECT_EQ(DescribeProtocolEndpoint(2, endpoint),
              "PE #2 (localUID: u1, isAccessible: 1, isConfigured: 0" + c.second);
  }
  // Missing arrays and endpoints are skipped; the others keep their index.
  ProtocolEndpointRecord bare{nullptr, 0, 0, nullptr, 0, 0, 0, nullptr, 0, 1};
  ProtocolEndpointRecord* endpoints[] = {nullptr, &bare};
  StorageArrayRecord array{a, nullptr, nullptr, nullptr, 2, endpoints};
  StorageArrayRecord* arrays[] = {nullptr, &array};
  StorageContainerRecord container{nullptr, nullptr, nullptr, 2, 0, 0, arrays};
  EXPECT_EQ(ReadArrayIds(container), Calls{"a"});
  EXPECT_EQ(ReadStorageArrays(container).at(0).peInfo,
            Calls{"PE #1 (localUID: , isAccessible: 0, isConfigured: 1"});
  container.arrayCount = -1;
  EXPECT_TRUE(ReadStorageArrays(container).empty());
}

TEST_F(StorageContainerTest, AddMountsAsGivenAndAnswersWhetherTheHostMounted) {
  // The id is mounted in the form given, not in its normal form.
  const std::string id = "9B8A7C6D5E4F4A3B8C2D1E0F9A8B7C6D";
  const json mount = {{"name", "silver"}, {"id", id}, {"arrays", {"b", "a"}}};
  const struct {
    Arming arming;
    T sinkThrows;
    Calls calls;
    json mounted;  // the new mount, or null
  } cases[] = {
      {{}, T::kNothing, {"result: true", "finish"}, mount},
      {{"AddTarnFileSystem", 0, true}, T::kNothing, {"result: false", "finish"}, nullptr},
      {{"AddTarnFileSystem", 0, false}, T::kNothing, {"error: boom"}, nullptr},
      {{}, T::kResult, {"result: true", "error: sink failed"}, mount},
  };
  const json args = {{"container-name", "silver"}, {"container-id", id}, {"array", {"b", "a"}}};
  for (const auto& c : cases) {
    Prepare(Containers(0, {}), c.arming);
    EXPECT_EQ(RunCommand(*StorageContainerAdd::New(), Args(args), c.sinkThrows), c.calls);
    EXPECT_EQ(World()["host"]["mounted"][0], c.mounted);
  }
}

TEST_F(StorageContainerTest, RemoveUnmountsByTheNormalForm) {
  const json demo = World();
  const std::string bad = "error: Bad CID : ";
  const struct {
    std::string id;
    const char* armed;
    Calls calls;
    size_t mountsLeft;
  } cases[] = {
      {"6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F", nullptr, {"result: true", "finish"}, 0},
      {"9B8A7C6D-5E4F-4A3B-8C2D-1E0F9A8B7C6D",
       nullptr,
       {"error: No container file system with id 9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d is mounted"},
       1},
      {"q", "RemoveTarnFileSystem", {bad + "q"}, 1},
      {kGoldId, "TarnLib_NormalizeContainerIdString", {bad + kGoldId}, 1},
  };
  for (const auto& c : cases) {
    Prepare(demo, {c.armed, 0, false});
    EXPECT_EQ(RunCommand(*StorageContainerRemove::New(), Args({{"container-id", c.id}})), c.calls);
    EXPECT_EQ(World()["host"]["mounted"].size(), c.mountsLeft);
  }
}

TEST_F(StorageContainerTest, CheckTarnsListsEachTarnWithItsState) {
  json world = World();
  json& tarns = world["containers"][0]["tarns"] = json::array();
  const int states[] = {3, 0, 2, 1, 4, -1};
  for (int i = 0; i < 6; ++i) {
    tarns.push_back({{"uuid", "t" + std::to_string(i)}, {"accessibility", states[i]}});
    if (i % 2 == 1) tarns.back()["configTarn"] = {{"name", "cfg" + std::to_string(i)}};
  }
  world["host"]["mounted"].push_back(
      {{"name", "silver"}, {"id", "9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d"}});
  // A result list of "id=status" rows behind its prototype.
  auto table = [](const Calls& rows) {
    std::string text = "[<TarnsAreAccessible{TarnId=\"\",Status=\"\"}>";
    for (size_t i = 0; i < rows.size(); ++i) {
      const size_t at = rows[i].find('=');
      text += std::string(i == 0 ? "" : ",") + "TarnsAreAccessible{TarnId=\"" +
              rows[i].substr(0, at) + "\",Status=\"" + rows[i].substr(at + 1) + "\"}";
    }
    return text + "]";
  };
  auto rows = [&](const Calls& r) { return Calls{"result: " + table(r), "finish"}; };
  const std::string gold = "/hyra/volumes/gold";
  const struct {
    std::string path;
    Calls tarns;
    Arming arming;
    Calls calls;
  } cases[] = {
      // clang-format off
      // Named tarns in every state, one twice, one unknown.
      {gold, {"t0", "t1", "t2", "t3", "t4", "t5", "t2", "x"}, {},
       rows({"t0=accessible", "t1=non-existent", "t2=inaccessible", "t3=unconfirmed", "t4=", "t5=",
             "t2=inaccessible", "x=non-existent"})},
      // No tarn named: the container's config-tarns in order.
      {gold, {}, {}, rows({"t1=non-existent", "t3=unconfirmed", "t5="})},
      {"/hyra/volumes/silver", {}, {}, rows({})},
      {gold, {}, {"TarnLib_QueryAllConfigTarns", 0, false},
       {"error: Unable to list the config-tarns of container " + std::string(kGoldId) + ": boom"}},
      {gold, {}, {"TarnLib_QueryAllConfigTarns", 0, true}, rows({})},
      {gold, {"t0"}, {"CheckTarnAccessibility", 0, true},
       {"error: The host answered 0 accessibility states for 1 tarn"}},
      {"/hyra/volumes/bronze", {"t0"}, {}, {"error: Bad datastore path"}},
      {gold, {}, {"GetContainerIdText", 0, false}, {"error: boom"}},
      {gold, {"t0"}, {"CheckTarnAccessibility", 0, false}, {"error: boom"}},
      // clang-format on
  };
  const auto check = StorageContainerCheckTarns::New();
  for (const auto& c : cases) {
    Prepare(world, c.arming);
    EXPECT_EQ(RunCommand(*check, Args({{"path", c.path}, {"tarn", c.tarns}})), c.calls);
  }
  // Ids and states pair by position, never past the end of either list.
  EXPECT_EQ(Describe(check->GetAccessibilityList({"a", "b"},
                                                 States(1, HostCtl::Storage::TARN_ACCESSIBLE))),
            table({"a=accessible"}));
  EXPECT_EQ(
      Describe(check->GetAccessibilityList({"a"}, States(3, HostCtl::Storage::TARN_INACCESSIBLE))),
      table({"a=inaccessible"}));
}

}  // namespace
}  // namespace PluginTest
