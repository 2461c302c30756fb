// The six kiroprovider commands against the simulated host: the order of
// their checks, their exact texts, and what they leave stored.
#include <optional>

#include "HostCtl/Lib.h"
#include "PluginTestSupport.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibSim.h"
#include "VendorProviderActivate.h"
#include "VendorProviderAdd.h"
#include "VendorProviderDeactivate.h"
#include "VendorProviderInjectFault.h"
#include "VendorProviderRemove.h"
#include "VendorProviderSet.h"
#include "World.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using Fendle::CallSpec::Input;
using nlohmann::json;
typedef std::vector<std::string> Calls;

constexpr char kVp1Url[] = "https://vp1.example.test:8443/kiro";
constexpr char kMismatch[] =
    "Missing one of the  parameter arrayIdor priority or isActive for an Array ";

// The array options of one invocation, each list as given on the command line.
struct Arrays {
  std::vector<std::string> ids;
  std::vector<int64_t> priorities;
  std::vector<bool> flags;
};

InputFiller ProviderInput(const std::string& name, std::optional<std::string> url,
                          const Arrays& arrays = {}) {
  return [=](Input& in) {
    in.SetString("vp-name", name);
    if (url) in.SetString("vp-url", *url);
    for (const auto& id : arrays.ids) in.AddString("arrayid", id);
    for (int64_t p : arrays.priorities) in.AddInt("priority", p);
    for (bool f : arrays.flags) in.AddBool("isactive", f);
  };
}

InputFiller InjectInput(const std::string& name, std::optional<std::string> status,
                        const std::vector<std::string>& ids = {},
                        const std::vector<bool>& flags = {}) {
  return [=](Input& in) {
    in.SetString("vp-name", name);
    if (status) in.SetString("status", *status);
    for (const auto& id : ids) in.AddString("arrayid", id);
    for (bool f : flags) in.AddBool("isactive", f);
  };
}

// A provider record as the world shows it.
struct StoredArray {
  std::string id;
  bool active;
  int32_t priority;
};
json Provider(const std::string& name, const std::string& url,
              const std::vector<StoredArray>& arrays) {
  json list = json::array();
  for (const auto& a : arrays) {
    list.push_back({{"arrayId", a.id}, {"isActive", a.active}, {"priority", a.priority}});
  }
  return {{"name", name}, {"url", url}, {"arrays", list}};
}

std::string Text(const std::string& text) { return "result: \"" + text + "\""; }

class KiroProviderTest : public SimWorldTest {
 protected:
  static json Providers() { return World()["host"]["providers"]; }
  static json ProviderNamed(const std::string& name) {
    for (const json& p : Providers()) {
      if (p["name"] == name) return p;
    }
    return nullptr;
  }
  static json Daemon() { return World()["daemon"]; }
};

TEST_F(KiroProviderTest, AddRefusesBadInputInOrderAndStoresNothing) {
  struct Case {
    const char* name;
    InputFiller input;
    const char* armed;  // a host operation that must not be reached, or null
    std::string error;
  };
  const Case cases[] = {
      {"empty name, before the host is asked", ProviderInput("", "u"), "TarnVpExists",
       "Empty VP Name not allowed."},
      {"known name, before the lists are read",
       ProviderInput("vp1", "u", {{"A", "B"}, {1, 2}, {true}}), nullptr,
       "Cannot Add VP as : vp1 already exists\n"},
      {"one flag short", ProviderInput("vp9", "u", {{"A", "B"}, {1, 2}, {true}}), nullptr,
       kMismatch},
      {"priorities missing", ProviderInput("vp9", "u", {{"A"}, {}, {true}}), nullptr, kMismatch},
      {"ids missing", ProviderInput("vp9", "u", {{}, {1}, {true}}), nullptr, kMismatch},
      {"priority above 32 bits", ProviderInput("vp9", "u", {{"A"}, {4294967297}, {true}}), nullptr,
       "Invalid value for parameter priority: 4294967297 is outside the range -2147483648 to "
       "2147483647"},
      {"priority 2^31", ProviderInput("vp9", "u", {{"A", "B"}, {1, 2147483648}, {true, true}}),
       nullptr,
       "Invalid value for parameter priority: 2147483648 is outside the range -2147483648 to "
       "2147483647"},
      {"priority below -2^31", ProviderInput("vp9", "u", {{"A"}, {-2147483649}, {true}}), nullptr,
       "Invalid value for parameter priority: -2147483649 is outside the range -2147483648 to "
       "2147483647"},
  };
  boost::shared_ptr<VendorProviderAdd> add = VendorProviderAdd::New();
  const json before = Providers();
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    HyraSim::ClearFailures();
    if (c.armed) Arm(c.armed);
    EXPECT_EQ(RunCommand(*add, c.input), Calls{"error: " + c.error});
    EXPECT_EQ(Providers(), before);
  }
}

TEST_F(KiroProviderTest, AddStoresTheProviderWithItsArraysPairedInOrder) {
  struct Case {
    const char* name;
    InputFiller input;
    json stored;
  };
  const Case cases[] = {
      {"no arrays", ProviderInput("vp9", "https://vp9"), Provider("vp9", "https://vp9", {})},
      {"repeated id kept",
       ProviderInput("vp9", "u", {{"A", "B", "A"}, {1, 2, 3}, {true, false, true}}),
       Provider("vp9", "u", {{"A", true, 1}, {"B", false, 2}, {"A", true, 3}})},
      {"32-bit limits and empty values",
       ProviderInput("vp9", "", {{"", "B"}, {-2147483648LL, 2147483647}, {false, false}}),
       Provider("vp9", "", {{"", false, -2147483648}, {"B", false, 2147483647}})},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    HyraSim::InitDemo();
    boost::shared_ptr<VendorProviderAdd> add = VendorProviderAdd::New();
    EXPECT_EQ(RunCommand(*add, c.input),
              (Calls{Text("Succesfully Added VP with name : vp9\n"), "finish"}));
    EXPECT_EQ(ProviderNamed("vp9"), c.stored);
    EXPECT_EQ(Providers().size(), 3u);
  }
}

TEST_F(KiroProviderTest, AddReportsHostFailuresBehindItsPrefix) {
  struct Case {
    const char* name;
    InputFiller input;
    const char* operation;
    int64_t after;
    RecordingOutput::ThrowOn sinkThrows;
    Calls calls;
    bool stored;
  };
  const Arrays one{{"A"}, {1}, {true}};
  const Case cases[] = {
      {"first update",
       ProviderInput("vp9", "u"),
       "UpdateTarnVendorProvider",
       0,
       RecordingOutput::ThrowOn::kNothing,
       {"error: Failed to add VP: boom"},
       false},
      // Without arrays the provider is read back and stored a second time.
      {"read back",
       ProviderInput("vp9", "u"),
       "GetTarnVendorProviders",
       0,
       RecordingOutput::ThrowOn::kNothing,
       {"error: Failed to add VP: boom"},
       true},
      {"second update",
       ProviderInput("vp9", "u"),
       "UpdateTarnVendorProvider",
       1,
       RecordingOutput::ThrowOn::kNothing,
       {"error: Failed to add VP: boom"},
       true},
      {"no second update with arrays",
       ProviderInput("vp9", "u", one),
       "UpdateTarnVendorProvider",
       1,
       RecordingOutput::ThrowOn::kNothing,
       {Text("Succesfully Added VP with name : vp9\n"), "finish"},
       true},
      {"sink refuses the result",
       ProviderInput("vp9", "u", one),
       nullptr,
       0,
       RecordingOutput::ThrowOn::kResult,
       {Text("Succesfully Added VP with name : vp9\n"), "error: Failed to add VP: sink failed"},
       true},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    HyraSim::InitDemo();
    HyraSim::ClearFailures();
    if (c.operation) Arm(c.operation, "boom", c.after);
    boost::shared_ptr<RecordingOutput> output = RecordingOutput::New(c.sinkThrows);
    VendorProviderAdd::New()->Execute(MakeInput(c.input), output);
    EXPECT_EQ(output->Calls(), c.calls);
    EXPECT_EQ(ProviderNamed("vp9").is_null(), !c.stored);
  }
}

TEST_F(KiroProviderTest, SetRefusesBadInputInOrderAndStoresNothing) {
  struct Case {
    const char* name;
    InputFiller input;
    const char* operation;  // armed to answer nothing, or null
    std::string error;
  };
  const Case cases[] = {
      {"unknown name, before the lists are read",
       ProviderInput("vp9", std::nullopt, {{"A", "B", "C"}, {1, 2, 3}, {}}), nullptr,
       "Cannot Update VP as : vp9 does not exist\n"},
      {"empty name is looked up like any other", ProviderInput("", std::nullopt), nullptr,
       "Cannot Update VP as :  does not exist\n"},
      {"flags missing", ProviderInput("vp1", std::nullopt, {{"A", "B", "C"}, {1, 2, 3}, {}}),
       nullptr, kMismatch},
      {"priority out of range", ProviderInput("vp1", std::nullopt, {{"A"}, {4294967297}, {true}}),
       nullptr,
       "Invalid value for parameter priority: 4294967297 is outside the range -2147483648 to "
       "2147483647"},
      {"known but without a record", ProviderInput("vp1", std::nullopt), "GetTarnVendorProviders",
       "Cannot Update VP as : vp1 does not exist\n"},
  };
  boost::shared_ptr<VendorProviderSet> set = VendorProviderSet::New();
  const json before = Providers();
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    HyraSim::ClearFailures();
    if (c.operation) Arm(c.operation, "", 0, /*null=*/true);
    EXPECT_EQ(RunCommand(*set, c.input), Calls{"error: " + c.error});
    EXPECT_EQ(Providers(), before);
  }
}

TEST_F(KiroProviderTest, SetReplacesTheArraysAndKeepsTheStoredUrl) {
  struct Case {
    const char* name;
    Arrays arrays;
    json stored;
  };
  const Case cases[] = {
      {"no arrays", {}, Provider("vp1", kVp1Url, {})},
      {"given arrays only",
       {{"array-c", "X"}, {7, -1}, {false, true}},
       Provider("vp1", kVp1Url, {{"array-c", false, 7}, {"X", true, -1}})},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    HyraSim::InitDemo();
    const json vp2 = ProviderNamed("vp2");
    EXPECT_EQ(RunCommand(*VendorProviderSet::New(), ProviderInput("vp1", std::nullopt, c.arrays)),
              (Calls{Text("Successfully Updated VP with name : vp1\n"), "finish"}));
    EXPECT_EQ(ProviderNamed("vp1"), c.stored);
    EXPECT_EQ(ProviderNamed("vp2"), vp2);
  }
}

TEST_F(KiroProviderTest, SetReportsHostFailuresBehindItsPrefixWithoutSeparator) {
  const char* const operations[] = {"GetTarnVendorProviders", "UpdateTarnVendorProvider"};
  const json before = Providers();
  for (const char* operation : operations) {
    SCOPED_TRACE(operation);
    HyraSim::ClearFailures();
    Arm(operation, "boom");
    EXPECT_EQ(RunCommand(*VendorProviderSet::New(), ProviderInput("vp1", std::nullopt)),
              Calls{"error: Failed to update VPboom"});
    EXPECT_EQ(Providers(), before);
  }
}

TEST_F(KiroProviderTest, ExistenceTestFailuresAreNotCaughtByAddSetOrInjectFault) {
  Arm("TarnVpExists", "host down", 0);
  EXPECT_THROW(RunCommand(*VendorProviderAdd::New(), ProviderInput("vp9", "u")),
               HostCtl::Lib::HostCtlException);
  Arm("TarnVpExists", "host down", 0);
  EXPECT_THROW(RunCommand(*VendorProviderSet::New(), ProviderInput("vp1", std::nullopt)),
               HostCtl::Lib::HostCtlException);
  Arm("TarnVpExists", "host down", 0);
  EXPECT_THROW(RunCommand(*VendorProviderInjectFault::New(), InjectInput("vp1", std::nullopt)),
               HostCtl::Lib::HostCtlException);
}

TEST_F(KiroProviderTest, RemoveUnregistersOrReportsTheHostsTextAlone) {
  boost::shared_ptr<VendorProviderRemove> remove = VendorProviderRemove::New();
  auto named = [](const std::string& name) {
    return [=](Input& in) { in.SetString("vp-name", name); };
  };
  EXPECT_EQ(RunCommand(*remove, named("vp2")), (Calls{"result: true", "finish"}));
  EXPECT_TRUE(ProviderNamed("vp2").is_null());

  Arm("UnRegisterVendorProvider", "no such provider: vp1");
  EXPECT_EQ(RunCommand(*remove, named("vp1")), Calls{"error: no such provider: vp1"});
  EXPECT_FALSE(ProviderNamed("vp1").is_null());
}

// The daemon client library is held open as the tree's other commands do.
class DaemonOpenTest : public KiroProviderTest {
 protected:
  void SetUp() override {
    KiroProviderTest::SetUp();
    ASSERT_TRUE(TarnLib_Init(0, 0));
  }
  void TearDown() override {
    TarnLib_Exit();
    KiroProviderTest::TearDown();
  }
};

TEST_F(DaemonOpenTest, ActivateAndDeactivatePassTheirValuesAndReportDaemonErrors) {
  boost::shared_ptr<VendorProviderActivate> activate = VendorProviderActivate::New();
  boost::shared_ptr<VendorProviderDeactivate> deactivate = VendorProviderDeactivate::New();
  auto args = [](const std::string& name, const std::string& array,
                 std::optional<std::string> url) {
    return [=](Input& in) {
      in.SetString("vp-name", name);
      in.SetString("arrayid", array);
      if (url) in.SetString("activevpurl", *url);
    };
  };

  EXPECT_EQ(RunCommand(*activate, args("vp1", "array-a", std::nullopt)),
            (Calls{"result: true", "finish"}));
  EXPECT_EQ(RunCommand(*activate, args("vp2", "array-c", "https://old")),
            (Calls{"result: true", "finish"}));
  EXPECT_EQ(RunCommand(*deactivate, args("vp1", "array-b", std::nullopt)),
            (Calls{"result: true", "finish"}));
  EXPECT_EQ(Daemon()["activations"], json::parse(R"([
              {"arrayId": "array-a", "provider": "vp1", "active": true, "activeProviderUrl": ""},
              {"arrayId": "array-c", "provider": "vp2", "active": true,
               "activeProviderUrl": "https://old"},
              {"arrayId": "array-b", "provider": "vp1", "active": false, "activeProviderUrl": ""}
            ])"));

  struct Case {
    const char* operation;
    boost::shared_ptr<Fendle::AutoCli::Command> command;
    const char* prefix;
  };
  const Case cases[] = {
      {"TarnLib_ActivateProvider", activate, "TarnLib_ActivateProvider failed with error "},
      {"TarnLib_DeactivateProvider", deactivate, "TarnLib_DeactivateProvider failed with error "},
  };
  const json activations = Daemon()["activations"];
  for (const Case& c : cases) {
    SCOPED_TRACE(c.operation);
    Arm(c.operation, "array busy");
    EXPECT_EQ(RunCommand(*c.command, args("vp1", "array-a", std::nullopt)),
              Calls{std::string("error: ") + c.prefix + "array busy\n"});
    EXPECT_EQ(Daemon()["activations"], activations);
  }
}

TEST_F(DaemonOpenTest, InjectFaultRefusesBeforeTheDaemonIsCalled) {
  struct Case {
    const char* name;
    InputFiller input;
    const char* operation;  // armed, or null
    bool null;
    std::string error;
  };
  const Case cases[] = {
      {"unknown provider, before the lists are read",
       InjectInput("vp9", "offline", {"A", "B"}, {true}), nullptr, false,
       "VP : vp9 does not exist\n"},
      {"one flag short", InjectInput("vp1", "offline", {"A", "B"}, {true}), nullptr, false,
       "Missing one of the parameter arrayId or isActive"},
      {"flags without ids", InjectInput("vp1", std::nullopt, {}, {true}), nullptr, false,
       "Missing one of the parameter arrayId or isActive"},
      {"lookup fails", InjectInput("vp1", "offline", {"A"}, {true}), "GetTarnVendorProviders",
       false, "InjectFault failed for VPboom"},
      {"known but without a record", InjectInput("vp1", "offline"), "GetTarnVendorProviders", true,
       "VP : vp1 does not exist\n"},
  };
  boost::shared_ptr<VendorProviderInjectFault> inject = VendorProviderInjectFault::New();
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    HyraSim::ClearFailures();
    if (c.operation) Arm(c.operation, "boom", 0, c.null);
    EXPECT_EQ(RunCommand(*inject, c.input), Calls{"error: " + c.error});
    EXPECT_EQ(Daemon()["providerFaults"], json::array());
  }
}

TEST_F(DaemonOpenTest, InjectFaultHandsTheDaemonNameUrlStatusAndArrays) {
  struct Case {
    const char* name;
    InputFiller input;
    json fault;
  };
  const Case cases[] = {
      {"no status, no arrays",
       InjectInput("vp1", std::nullopt),
       {{"provider", "vp1"}, {"url", kVp1Url}, {"status", "default"}, {"arrays", json::array()}}},
      {"empty status",
       InjectInput("vp1", ""),
       {{"provider", "vp1"}, {"url", kVp1Url}, {"status", "default"}, {"arrays", json::array()}}},
      {"arrays in order",
       InjectInput("vp1", "syncError", {"array-b", "Q"}, {false, true}),
       {{"provider", "vp1"},
        {"url", kVp1Url},
        {"status", "syncError"},
        {"arrays",
         {{{"arrayId", "array-b"}, {"isActive", false}}, {{"arrayId", "Q"}, {"isActive", true}}}}}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    HyraSim::InitDemo();
    EXPECT_EQ(RunCommand(*VendorProviderInjectFault::New(), c.input),
              (Calls{Text("Successfully Injected fault for VP with name : vp1\n"), "finish"}));
    EXPECT_EQ(Daemon()["providerFaults"], json::array({c.fault}));
  }
}

TEST_F(DaemonOpenTest, InjectFaultReportsADaemonErrorWithoutLineFeed) {
  Arm("TarnLib_VendorProviderInjectFault", "provider offline");
  EXPECT_EQ(RunCommand(*VendorProviderInjectFault::New(), InjectInput("vp2", "online")),
            Calls{"error: VendorProviderInjectFault failed for VP with name : vp2 with error: "
                  "provider offline"});
}

}  // namespace
}  // namespace PluginTest
