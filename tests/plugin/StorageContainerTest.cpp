// The storagecontainer commands against the simulated host: what they mount
// and unmount, their exact texts, where a failure stops them, and how the
// daemon's records are read.
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
using Fendle::CallSpec::Input;
using Fendle::MetaObj::MetaList;
using nlohmann::json;
typedef std::vector<std::string> Calls;
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
      world["host"]["mounted"].push_back({{"name", "c" + std::to_string(i)}, {"id", "x"}});
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
  struct Case {
    const char* name;
    json world;
    Arming arming;
    Calls calls;  // a result as the names of its rows
    std::string mountedAfter;
  };
  // clang-format off
  const Case cases[] = {
      {"all mounted", Containers(2, {1, 2}), {"AddTarnFileSystem", 0, false}, {"", "finish"},
       "c1 c2 "},
      {"second mounted", Containers(5, {2}), {}, {"c1 c3 c4 c5 ", "finish"}, "c2 c1 c3 c4 c5 "},
      {"listing asked with nothing exported", Containers(0, {}), {"GetTarnFileSystems", 0, false},
       {kLoadError + "boom, skipping"}, ""},
      {"third mount refused", Containers(5, {}), {"AddTarnFileSystem", 2, false},
       {kLoadError + "boom, skipping"}, "c1 c2 "},
      {"second mount yields nothing", Containers(3, {}), {"AddTarnFileSystem", 1, true},
       {kLoadError + "Unable to mount c2, skipping"}, "c1 "},
      // The row names the container as the host reports the new mount.
      {"host names a new mount blank", Containers(2, {}), {"GetContainerName", 1, true},
       {"c1  ", "finish"}, "c1 c2 "},
      {"daemon answers no result", Containers(2, {}), {"TarnLib_GetStorageContainer", 0, true},
       {"", "finish"}, ""},
      {"daemon fails", Containers(2, {}), {"TarnLib_GetStorageContainer", 0, false},
       {"error: Unable to load Tarn datastores: boom"}, ""},
  };
  // clang-format on
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    Prepare(c.world, c.arming);
    boost::shared_ptr<RecordingOutput> output = RecordingOutput::New();
    StorageContainerLoad::New()->Execute(MakeInput(nullptr), output);
    Calls calls = output->Calls();
    if (auto rows = boost::dynamic_pointer_cast<MetaList>(output->GetResult())) {
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
  boost::shared_ptr<RecordingOutput> output =
      RecordingOutput::New(RecordingOutput::ThrowOn::kResult);
  StorageContainerLoad::New()->Execute(MakeInput(nullptr), output);
  ASSERT_EQ(output->Calls().size(), 2u);
  EXPECT_EQ(output->Calls()[1], kLoadError + "sink failed, skipping");
  LoadScenario(Containers(1, {}));
  EXPECT_THROW(StorageContainerLoad::New()->Execute(
                   MakeInput(nullptr), boost::shared_ptr<RefusingOutput>(new RefusingOutput())),
               std::runtime_error);
  EXPECT_EQ(MountedNames(), "c1 ");
}

TEST(StorageContainerRecords, DescribeEndpointsAndReadMissingPartsAsEmpty) {
  char a[] = "a", b[] = "b", uid[] = "u1", m1[] = "m1", ip[] = "ip";
  char* addresses[] = {a, nullptr, b};
  struct Case {
    ProtocolEndpointAddress address;
    bool hasAddress;
    int32_t addressCount;
    std::string tail;  // what follows the isConfigured digit
  };
  // clang-format off
  const Case cases[] = {
      {{0, m1, nullptr}, true, 0, ", type: SCSI, lunID: m1)"},
      {{1, ip, m1}, true, 0, ", type: NFS, ipAddress: ip, serverMount: m1)"},
      {{2, m1, nullptr}, true, 3, ", type: NFS4x, ipAddress(es): a,,b, serverMount: m1)"},
      {{2, nullptr, nullptr}, true, 0, ", type: NFS4x, ipAddress(es): , serverMount: )"},
      {{3, m1, m1}, true, 0, ""},
      {{}, false, 0, ""},
  };
  // clang-format on
  for (Case entry : cases) {
    SCOPED_TRACE(entry.tail);
    ProtocolEndpointRecord endpoint{uid, 0, 0, addresses, entry.addressCount, 0, 0, nullptr, 7, 0};
    if (entry.hasAddress) endpoint.address = &entry.address;
    EXPECT_EQ(DescribeProtocolEndpoint(2, endpoint),
              "PE #2 (localUID: u1, isAccessible: 1, isConfigured: 0" + entry.tail);
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
  const json mount = {{"name", "silver"}, {"id", "ABC"}, {"arrays", {"b", "a"}}};
  struct Case {
    const char* name;
    Arming arming;
    RecordingOutput::ThrowOn sinkThrows;
    Calls calls;
    json mounted;  // the new mount, or null
  };
  // clang-format off
  const Case cases[] = {
      {"mounted", {}, RecordingOutput::ThrowOn::kNothing, {"result: true", "finish"}, mount},
      {"nothing mounted", {"AddTarnFileSystem", 0, true}, RecordingOutput::ThrowOn::kNothing,
       {"result: false", "finish"}, nullptr},
      {"host refuses", {"AddTarnFileSystem", 0, false}, RecordingOutput::ThrowOn::kNothing,
       {"error: boom"}, nullptr},
      {"sink refuses", {}, RecordingOutput::ThrowOn::kResult,
       {"result: true", "error: sink failed"}, mount},
  };
  // clang-format on
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    Prepare(Containers(0, {}), c.arming);
    boost::shared_ptr<RecordingOutput> output = RecordingOutput::New(c.sinkThrows);
    StorageContainerAdd::New()->Execute(MakeInput([](Input& in) {
                                          in.SetString("container-name", "silver");
                                          in.SetString("container-id", "ABC");
                                          in.AddString("array", "b");
                                          in.AddString("array", "a");
                                        }),
                                        output);
    EXPECT_EQ(output->Calls(), c.calls);
    EXPECT_EQ(World()["host"]["mounted"][0], c.mounted);
  }
}

TEST_F(StorageContainerTest, RemoveUnmountsByTheNormalForm) {
  const json demo = World();
  struct Case {
    std::string id;
    const char* armed;
    Calls calls;
    size_t mountsLeft;
  };
  // clang-format off
  const Case cases[] = {
      {"6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F", nullptr, {"result: true", "finish"}, 0},
      {"9B8A7C6D-5E4F-4A3B-8C2D-1E0F9A8B7C6D", nullptr,
       {"error: No container file system with id 9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d is mounted"},
       1},
      {"q", "RemoveTarnFileSystem", {"error: Bad CID : q"}, 1},
      {kGoldId, "TarnLib_NormalizeContainerIdString", {std::string("error: Bad CID : ") + kGoldId},
       1},
      {kGoldId, "RemoveTarnFileSystem", {"error: boom"}, 1},
  };
  // clang-format on
  for (const Case& c : cases) {
    SCOPED_TRACE(c.id + (c.armed ? c.armed : ""));
    Prepare(demo, {c.armed, 0, false});
    EXPECT_EQ(RunCommand(*StorageContainerRemove::New(),
                         [&](Input& in) { in.SetString("container-id", c.id); }),
              c.calls);
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
  struct Case {
    const char* name;
    std::string path;
    Calls tarns;
    Arming arming;
    Calls calls;
  };
  // clang-format off
  const Case cases[] = {
      {"named, every state, one twice", gold, {"t0", "t1", "t2", "t3", "t4", "t5", "t2", "x"}, {},
       rows({"t0=accessible", "t1=non-existent", "t2=inaccessible", "t3=unconfirmed", "t4=", "t5=",
             "t2=inaccessible", "x=non-existent"})},
      {"config-tarns in order", gold, {}, {}, rows({"t1=non-existent", "t3=unconfirmed", "t5="})},
      {"no config-tarn", "/hyra/volumes/silver", {}, {}, rows({})},
      {"query fails", gold, {}, {"TarnLib_QueryAllConfigTarns", 0, false}, rows({})},
      {"query answers nothing", gold, {}, {"TarnLib_QueryAllConfigTarns", 0, true}, rows({})},
      {"fewer states than ids", gold, {"t0"}, {"CheckTarnAccessibility", 0, true}, rows({})},
      {"not mounted", "/hyra/volumes/bronze", {"t0"}, {}, {"error: Bad datastore path"}},
      {"id unreadable", gold, {}, {"GetContainerIdText", 0, false}, {"error: boom"}},
      {"check fails", gold, {"t0"}, {"CheckTarnAccessibility", 0, false}, {"error: boom"}},
  };
  // clang-format on
  boost::shared_ptr<StorageContainerCheckTarns> check = StorageContainerCheckTarns::New();
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    Prepare(world, c.arming);
    EXPECT_EQ(RunCommand(*check,
                         [&](Input& in) {
                           in.SetString("path", c.path);
                           for (const auto& t : c.tarns) in.AddString("tarn", t);
                         }),
              c.calls);
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
