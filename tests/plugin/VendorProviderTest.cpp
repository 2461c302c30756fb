// The kiroprovider commands against the simulated host: the order of their
// checks, their exact texts, and what they leave stored. Activate, deactivate
// and remove are checked end to end.
#include <optional>

#include "HostCtl/Lib.h"
#include "PluginTestSupport.h"
#include "TarnLib/TarnLib.h"
#include "VendorProviderAdd.h"
#include "VendorProviderInjectFault.h"
#include "VendorProviderSet.h"
#include "World.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using nlohmann::json;

constexpr char kVp1Url[] = "https://vp1.example.test:8443/kiro";
constexpr char kMismatch[] =
    "Missing one of the  parameter arrayIdor priority or isActive for an Array ";
const std::string kAdded = "result: \"Succesfully Added VP with name : vp9\n\"";
const auto kNone = std::nullopt;

std::string OutOfRange(const std::string& value) {
  return "Invalid value for parameter priority: " + value +
         " is outside the range -2147483648 to 2147483647";
}

// The array options of one invocation, each list as given on the command line.
struct Arrays {
  std::vector<std::string> ids;
  std::vector<int64_t> priorities;
  std::vector<bool> flags;
};

// vp-name, the text option (vp-url for add and set, status for injectfault)
// when given, then the array lists.
InputFiller Vp(const std::string& name, std::optional<std::string> text, const Arrays& arrays = {},
               const char* textOption = "vp-url") {
  return [=](Fendle::CallSpec::Input& in) {
    in.SetString("vp-name", name);
    if (text) in.SetString(textOption, *text);
    for (const auto& id : arrays.ids) in.AddString("arrayid", id);
    for (int64_t p : arrays.priorities) in.AddInt("priority", p);
    for (bool f : arrays.flags) in.AddBool("isactive", f);
  };
}

InputFiller Inject(const std::string& name, std::optional<std::string> status,
                   const Arrays& arrays = {}) {
  return Vp(name, status, arrays, "status");
}

// A provider record as the world shows it, from {id, isActive, priority} rows.
json Provider(const std::string& name, const std::string& url, const json& rows) {
  json arrays = json::array();
  for (const json& r : rows)
    arrays.push_back({{"arrayId", r[0]}, {"isActive", r[1]}, {"priority", r[2]}});
  return {{"name", name}, {"url", url}, {"arrays", arrays}};
}

// injectfault needs the daemon client library open, as the tree's other
// commands hold it on a host.
class KiroProviderTest : public SimWorldTest {
 protected:
  void SetUp() override {
    SimWorldTest::SetUp();
    ASSERT_TRUE(TarnLib_Init(0, 0));
  }
  void TearDown() override {
    TarnLib_Exit();
    SimWorldTest::TearDown();
  }
  static json Providers() { return World()["host"]["providers"]; }
  static json ProviderNamed(const std::string& name) {
    for (const json& p : Providers()) {
      if (p["name"] == name) return p;
    }
    return nullptr;
  }
  static json Faults() { return World()["daemon"]["providerFaults"]; }
};

TEST_F(KiroProviderTest, AddAndSetRefuseBadInputInOrderAndStoreNothing) {
  struct Case {
    boost::shared_ptr<Fendle::AutoCli::Command> command;
    InputFiller input;
    const char* armed;  // armed to fail (add) or to answer nothing (set), or null
    std::string error;
  };
  const auto add = VendorProviderAdd::New();
  const auto set = VendorProviderSet::New();
  // clang-format off
  const Case cases[] = {
      // The empty name is refused before the host is asked.
      {add, Vp("", "u"), "TarnVpExists", "Empty VP Name not allowed."},
      // Existence is checked before the lists are read.
      {add, Vp("vp1", "u", {{"A", "B"}, {1, 2}, {true}}), nullptr,
       "Cannot Add VP as : vp1 already exists\n"},
      {add, Vp("vp9", "u", {{"A", "B"}, {1, 2}, {true}}), nullptr, kMismatch},
      {add, Vp("vp9", "u", {{"A"}, {}, {true}}), nullptr, kMismatch},
      {add, Vp("vp9", "u", {{}, {1}, {true}}), nullptr, kMismatch},
      {add, Vp("vp9", "u", {{"A", "B"}, {1, 2147483648}, {true, true}}), nullptr,
       OutOfRange("2147483648")},
      {add, Vp("vp9", "u", {{"A"}, {-2147483649}, {true}}), nullptr, OutOfRange("-2147483649")},
      {set, Vp("vp9", kNone, {{"A", "B", "C"}, {1, 2, 3}, {}}), nullptr,
       "Cannot Update VP as : vp9 does not exist\n"},
      {set, Vp("", kNone), nullptr, "Cannot Update VP as :  does not exist\n"},
      {set, Vp("vp1", kNone, {{"A", "B", "C"}, {1, 2, 3}, {}}), nullptr, kMismatch},
      {set, Vp("vp1", kNone, {{"A"}, {4294967297}, {true}}), nullptr, OutOfRange("4294967297")},
      // A known provider without a record is not read.
      {set, Vp("vp1", kNone), "GetTarnVendorProviders",
       "Cannot Update VP as : vp1 does not exist\n"},
  };
  // clang-format on
  const json before = Providers();
  for (const Case& c : cases) {
    HyraSim::ClearFailures();
    if (c.armed) Arm(c.armed, "boom", 0, c.command == set);
    EXPECT_EQ(RunCommand(*c.command, c.input), Calls{"error: " + c.error});
    EXPECT_EQ(Providers(), before);
  }
}

TEST_F(KiroProviderTest, AddStoresTheProviderWithItsArraysPairedInOrderOrReportsHostFailures) {
  using T = RecordingOutput::ThrowOn;
  const Calls added{kAdded, "finish"}, failed{"error: Failed to add VP: boom"};
  const Arrays one{{"A"}, {1}, {true}};
  const json bare = Provider("vp9", "u", json::array()),
             single = Provider("vp9", "u", {{"A", true, 1}});
  const struct {
    InputFiller input;
    const char* operation;  // armed to fail with "boom" after `after` calls, or null
    int64_t after;
    T sinkThrows;
    Calls calls;
    json stored;
  } cases[] = {
      // clang-format off
      {Vp("vp9", "u"), nullptr, 0, T::kNothing, added, bare},
      {Vp("vp9", "u", {{"A", "B", "A"}, {1, 2, 3}, {true, false, true}}), nullptr, 0, T::kNothing,
       added, Provider("vp9", "u", {{"A", true, 1}, {"B", false, 2}, {"A", true, 3}})},
      {Vp("vp9", "", {{"", "B"}, {-2147483648LL, 2147483647}, {false, false}}), nullptr, 0,
       T::kNothing, added,
       Provider("vp9", "", {{"", false, -2147483648LL}, {"B", false, 2147483647}})},
      {Vp("vp9", "u"), "UpdateTarnVendorProvider", 0, T::kNothing, failed, nullptr},
      // Without arrays the provider is read back and stored a second time.
      {Vp("vp9", "u"), "GetTarnVendorProviders", 0, T::kNothing, failed, bare},
      {Vp("vp9", "u"), "UpdateTarnVendorProvider", 1, T::kNothing, failed, bare},
      {Vp("vp9", "u", one), "UpdateTarnVendorProvider", 1, T::kNothing, added, single},
      {Vp("vp9", "u", one), nullptr, 0, T::kResult,
       {kAdded, "error: Failed to add VP: sink failed"}, single},
      // clang-format on
  };
  for (const auto& c : cases) {
    HyraSim::InitDemo();
    HyraSim::ClearFailures();
    if (c.operation) Arm(c.operation, "boom", c.after);
    EXPECT_EQ(RunCommand(*VendorProviderAdd::New(), c.input, c.sinkThrows), c.calls);
    EXPECT_EQ(ProviderNamed("vp9"), c.stored);
    EXPECT_EQ(Providers().size(), c.stored.is_null() ? 2u : 3u);
  }
}

TEST_F(KiroProviderTest, SetWithoutArraysClearsThemAndKeepsTheUrlOrReportsTheHostsFailure) {
  const Calls updated{"result: \"Successfully Updated VP with name : vp1\n\"", "finish"};
  const json vp2 = ProviderNamed("vp2");
  EXPECT_EQ(RunCommand(*VendorProviderSet::New(), Vp("vp1", kNone)), updated);
  EXPECT_EQ(ProviderNamed("vp1"), Provider("vp1", kVp1Url, json::array()));
  EXPECT_EQ(ProviderNamed("vp2"), vp2);

  const json before = Providers();
  for (const char* operation : {"GetTarnVendorProviders", "UpdateTarnVendorProvider"}) {
    Arm(operation, "boom");
    EXPECT_EQ(RunCommand(*VendorProviderSet::New(), Vp("vp1", kNone)),
              Calls{"error: Failed to update VPboom"});
    EXPECT_EQ(Providers(), before);
  }
}

TEST_F(KiroProviderTest, ExistenceTestFailuresAreNotCaughtByAddSetOrInjectFault) {
  const std::pair<boost::shared_ptr<Fendle::AutoCli::Command>, InputFiller> runs[] = {
      {VendorProviderAdd::New(), Vp("vp9", "u")},
      {VendorProviderSet::New(), Vp("vp1", kNone)},
      {VendorProviderInjectFault::New(), Inject("vp1", kNone)},
  };
  for (const auto& run : runs) {
    Arm("TarnVpExists", "host down");
    EXPECT_THROW(RunCommand(*run.first, run.second), HostCtl::Lib::HostCtlException);
  }
}

TEST_F(KiroProviderTest, InjectFaultRefusesBeforeTheDaemonIsCalled) {
  const struct {
    InputFiller input;
    const char* armed;  // GetTarnVendorProviders fails with "boom", or answers nothing
    bool null;
    std::string error;
  } cases[] = {
      // Existence is checked before the lists are read.
      {Inject("vp9", "offline", {{"A", "B"}, {}, {true}}), nullptr, false,
       "VP : vp9 does not exist\n"},
      {Inject("vp1", "offline", {{"A", "B"}, {}, {true}}), nullptr, false,
       "Missing one of the parameter arrayId or isActive"},
      {Inject("vp1", kNone, {{}, {}, {true}}), nullptr, false,
       "Missing one of the parameter arrayId or isActive"},
      {Inject("vp1", "offline", {{"A"}, {}, {true}}), "GetTarnVendorProviders", false,
       "InjectFault failed for VPboom"},
      {Inject("vp1", "offline"), "GetTarnVendorProviders", true, "VP : vp1 does not exist\n"},
  };
  const auto inject = VendorProviderInjectFault::New();
  for (const auto& c : cases) {
    HyraSim::ClearFailures();
    if (c.armed) Arm(c.armed, "boom", 0, c.null);
    EXPECT_EQ(RunCommand(*inject, c.input), Calls{"error: " + c.error});
    EXPECT_EQ(Faults(), json::array());
  }
}

// Arrays and a given status are checked end to end.
TEST_F(KiroProviderTest, InjectFaultSendsTheDefaultStatusOrReportsTheDaemonsError) {
  const json fault = {
      {"provider", "vp1"}, {"url", kVp1Url}, {"status", "default"}, {"arrays", json::array()}};
  for (const InputFiller& input : {Inject("vp1", kNone), Inject("vp1", "")}) {
    HyraSim::InitDemo();
    EXPECT_EQ(
        RunCommand(*VendorProviderInjectFault::New(), input),
        (Calls{"result: \"Successfully Injected fault for VP with name : vp1\n\"", "finish"}));
    EXPECT_EQ(Faults(), json::array({fault}));
  }
  Arm("TarnLib_VendorProviderInjectFault", "provider offline");
  EXPECT_EQ(RunCommand(*VendorProviderInjectFault::New(), Inject("vp2", "online")),
            Calls{"error: VendorProviderInjectFault failed for VP with name : vp2 with error: "
                  "provider offline"});
}

}  // namespace
}  // namespace PluginTest
