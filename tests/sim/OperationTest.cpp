// How every host operation meets the world: one transaction that keeps
// nothing of a body that fails, one count of an arming per call, one journal
// entry per call, every look-up by the normal form of an id.
#include <sqlite3.h>

#include <fstream>
#include <memory>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "HostCtl/Lib.h"
#include "Journal.h"
#include "Operation.h"
#include "OskCtl/Storage.h"
#include "Rows.h"
#include "SimTest.h"
#include "TarnLib/TarnLib.h"

namespace {

using HostCtl::Storage::TarnFileSystem;
using OskCtl::Storage::StorageInfoImpl;
using SimTest::Opened;
using Operations = SimTest::FreshWorld;

TEST_F(Operations, ABodyFailingHalfWayKeepsNothingButTheCountAndTheJournalEntry) {
  HyraSim::ArmFailure("UpdateTarnVendorProvider", {"later", 3, 1, false});
  HyraSim::ClearJournal();
  EXPECT_THROW(
      HyraSim::RunOperation("UpdateTarnVendorProvider", HyraSim::Access::kWrite, {"vp-x"},
                            [](sqlite3* db) {
                              HyraSim::StoreProvider(db, {"vp-x", "u", "", {{"a", true, 1}}});
                              HyraSim::RemoveProviderNamed(db, "vp1");
                              throw std::runtime_error("stopped half way");
                            }),
      std::runtime_error);
  const auto providers = World()["host"]["providers"];
  ASSERT_EQ(providers.size(), 2u);
  EXPECT_EQ(providers[0]["name"], "vp1");
  EXPECT_EQ(HyraSim::ArmedFailures().at(0).second.after, 2) << "the call was counted";
  const auto journal = HyraSim::ReadJournal();
  ASSERT_EQ(journal.size(), 1u);
  EXPECT_EQ(journal[0].outcome, "refused");
  EXPECT_EQ(journal[0].message, "stopped half way");
  EXPECT_EQ(journal[0].args, std::vector<std::string>{"vp-x"});
}

TEST_F(Operations, NamesThatCannotBeArmedAreAProgrammingError) {
  EXPECT_THROW(HyraSim::CountCall("GetContainerNmae", {}), HyraSim::UnknownOperation);
  EXPECT_THROW(HyraSim::RunOperation("TarnLib_Exit", HyraSim::Access::kRead, {}, nullptr),
               HyraSim::UnknownOperation);
  EXPECT_TRUE(HyraSim::ReadJournal().size() <= 1u) << "only the fixture's own calls";
}

// The armable names are matched to their call sites by spelling alone: every
// name a call site runs under must be armable, and every armable name used.
TEST(OperationNames, EveryCallSiteRunsUnderAnArmableName) {
  const std::regex call(
      R"re((?:RunHostOperation|CountHostCall|CallDaemon|RunOperation|CountCall|QueryTarn|ActOnConfigTarn)\(\s*"(\w+)")re");
  std::set<std::string> used;
  for (const char* file :
       {"oskctl/StorageInfoImpl.cpp", "oskctl/MountedTarnFileSystem.cpp",
        "oskctl/TarnFileSystemImpl.cpp", "tarnlib/Session.cpp", "tarnlib/Containers.cpp",
        "tarnlib/Control.cpp", "tarnlib/Volumes.cpp"}) {
    std::ifstream in(std::string(HYRA_SOURCE_DIR) + "/" + file);
    ASSERT_TRUE(in) << file;
    std::ostringstream text;
    text << in.rdbuf();
    const std::string source = text.str();
    for (std::sregex_iterator it(source.begin(), source.end(), call), end; it != end; ++it) {
      used.insert((*it)[1]);
    }
  }
  const auto armable = HyraSim::ArmableOperations();
  EXPECT_EQ(used, std::set<std::string>(armable.begin(), armable.end()));
}

TEST_F(Operations, AnArmingIsCountedOncePerCallAndEachCallJournaledOnce) {
  StorageInfoImpl host;
  TarnFileSystem* gold = host.GetTarnFileSystemByPath("/hyra/volumes/gold");
  ASSERT_NE(gold, nullptr);
  Opened opened;
  std::string silver = SimTest::kSilverId;
  const std::vector<std::pair<const char*, std::function<void()> > > calls = {
      {"GetTarnFileSystems",
       [&] {
         for (auto* fs : host.GetTarnFileSystems()) delete fs;
       }},
      {"AddTarnFileSystem", [&] { delete host.AddTarnFileSystem("silver", silver, {}, true); }},
      {"GetTarnFileSystemByPath", [&] { host.GetTarnFileSystemByPath("/hyra/volumes/gold"); }},
      {"TarnVpExists", [&] { host.TarnVpExists("vp1"); }},
      {"UpdateTarnVendorProvider",
       [&] {
         host.UpdateTarnVendorProvider({{"vp5", "u", "", {}}});
       }},
      {"GetContainerName", [&] { gold->GetContainerName(); }},
      {"CheckTarnAccessibility", [&] { gold->CheckTarnAccessibility({SimTest::kGoldTarn}); }},
      {"MountConfigTarn", [&] { gold->MountConfigTarn("vm-config-1", "", "", false); }},
      {"TarnLib_Init",
       [] {
         if (TarnLib_Init(0, 0)) TarnLib_Exit();
       }},
      {"TarnLib_GetStorageContainer",
       [] {
         StorageContainerResult* result = nullptr;
         TarnLib_GetStorageContainer(1, nullptr, &result);
         TarnLib_FreeStorageContainerResult(result);
       }},
      {"TarnLib_GetTarnMetadata",
       [] {
         TarnMetadata* metadata = nullptr;
         TarnLib_GetTarnMetadata(SimTest::kGoldId, SimTest::kGoldTarn, &metadata);
         TarnLib_FreeTarnMetadata(metadata);
       }},
      {"TarnLib_NormalizeContainerIdString",
       [] {
         char normal[TARNLIB_CONTAINER_ID_TEXT_SIZE];
         TarnLib_NormalizeContainerIdString(SimTest::kGoldId, normal);
       }},
  };
  for (const auto& c : calls) {
    HyraSim::ArmFailure(c.first, {"second call", 1, 1, false});
    const size_t before = HyraSim::ReadJournal().size();
    c.second();
    const auto armed = HyraSim::ArmedFailures();
    ASSERT_EQ(armed.size(), 1u) << c.first;
    EXPECT_EQ(armed[0].second.after, 0) << c.first;
    const auto journal = HyraSim::ReadJournal();
    ASSERT_EQ(journal.size(), before + 1) << c.first;
    EXPECT_EQ(journal.back().operation, c.first);
    EXPECT_NE(journal.back().outcome, "failed") << c.first;
    try {
      c.second();
    } catch (const HostCtl::Lib::HostCtlException&) {
      // The storage-control operations fail by throwing.
    }
    EXPECT_TRUE(HyraSim::ArmedFailures().empty()) << c.first;
    EXPECT_EQ(HyraSim::ReadJournal().back().outcome, "failed") << c.first;
  }
}

TEST_F(Operations, JournalKeepsOutcomesAcrossProcessesCutsTextsAndStaysBounded) {
  HyraSim::ClearJournal();
  ASSERT_EQ(Hyrasim("fail TarnVpExists --after 1 --message gone").status, 0);
  ASSERT_EQ(Probe("vp-exists vp1").out, "true\n");
  ASSERT_EQ(Probe("vp-exists vp1").out, "error: gone\n");
  HyraSim::ArmFailure("AddTarnFileSystem", {"unused", 0, 1, true});
  StorageInfoImpl host;
  std::string silver = SimTest::kSilverId;
  EXPECT_EQ(host.AddTarnFileSystem("silver", silver, {"array-a", "array-b"}, true), nullptr);
  const std::string longName = std::string(199, 'n') + "\xC3\xA9" + "tail";
  EXPECT_FALSE(host.TarnVpExists(longName));
  EXPECT_THROW(host.RemoveTarnFileSystem(SimTest::kSilverId), HostCtl::Lib::HostCtlException);

  const SimTest::ToolResult shown = Hyrasim("journal --json");
  ASSERT_EQ(shown.status, 0);
  const auto journal = nlohmann::json::parse(shown.out);
  const nlohmann::json expected = nlohmann::json::parse(R"([
      {"seq": 1, "operation": "TarnVpExists", "args": ["vp1"], "outcome": "passed", "message": ""},
      {"seq": 2, "operation": "TarnVpExists", "args": ["vp1"], "outcome": "failed",
       "message": "gone"},
      {"seq": 3, "operation": "AddTarnFileSystem",
       "args": ["silver", "9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d", "array-a,array-b", "true"],
       "outcome": "nothing", "message": "unused"},
      {"seq": 4, "operation": "TarnVpExists", "outcome": "passed", "message": ""},
      {"seq": 5, "operation": "RemoveTarnFileSystem",
       "args": ["9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d"], "outcome": "refused",
       "message": "No container file system with id 9b8a7c6d-5e4f-4a3b-8c2d-1e0f9a8b7c6d is mounted"}
  ])");
  ASSERT_EQ(journal.size(), expected.size()) << shown.out;
  for (size_t i = 0; i < expected.size(); ++i) {
    for (const auto& field : expected[i].items()) {
      EXPECT_EQ(journal[i][field.key()], field.value()) << i << " " << field.key();
    }
  }
  // Cut before the two-byte character that would have crossed the limit.
  EXPECT_EQ(journal[3]["args"][0], std::string(199, 'n') + "...");

  // Only the latest entries stay.
  HyraSim::WithDatabase(true, true, [](sqlite3* db) {
    for (int i = 0; i < HyraSim::kJournalLimit + 5; ++i) {
      HyraSim::RecordCall(db, "TarnVpExists", {std::to_string(i)}, HyraSim::kPassed, "");
    }
  });
  const auto bounded = HyraSim::ReadJournal();
  ASSERT_EQ(bounded.size(), size_t(HyraSim::kJournalLimit));
  EXPECT_EQ(bounded.front().args[0], "5");
  EXPECT_EQ(bounded.back().seq, 5 + HyraSim::kJournalLimit + 5);
  EXPECT_EQ(Hyrasim("journal --clear").status, 0);
  EXPECT_EQ(Hyrasim("journal --json").out, "[]\n");
}

TEST_F(Operations, TwoProcessesMountingOneContainerAtOnceMakeOneMount) {
  const std::string probe = SIM_PROBE_PATH;
  const struct {
    const char* second;  // the name the second process mounts silver under
    bool bothMount;
  } rounds[] = {{"silver", true}, {"silver-2", false}};
  for (const auto& round : rounds) {
    for (int attempt = 0; attempt < 3; ++attempt) {
      HyraSim::InitDemo();
      const std::string command = "(" + probe + " mount silver " + SimTest::kSilverId + " >" +
                                  Path("a") + " 2>&1 & " + probe + " mount " + round.second +
                                  " 9B8A7C6D5E4F4A3B8C2D1E0F9A8B7C6D >" + Path("b") +
                                  " 2>&1 & wait)";
      ASSERT_EQ(std::system(command.c_str()), 0);
      const std::string a = ReadText(Path("a")), b = ReadText(Path("b"));
      EXPECT_EQ(World()["host"]["mounted"].size(), 2u) << a << b;
      if (round.bothMount) {
        EXPECT_EQ(a, "mounted silver\n");
        EXPECT_EQ(b, "mounted silver\n");
      } else {
        const bool aMounted = a.rfind("mounted ", 0) == 0;
        EXPECT_NE(aMounted, b.rfind("mounted ", 0) == 0) << a << b;
        EXPECT_NE((aMounted ? b : a).find("is already mounted as"), std::string::npos) << a << b;
      }
    }
  }
}

TEST_F(Operations, LookUpsCompareIdsByTheirNormalForm) {
  StorageInfoImpl host;
  host.RemoveTarnFileSystem(SimTest::kGoldId);
  std::string upper = "6F1C2F4E-8D3B-4C1A-9E2F-0A1B2C3D4E5F";
  std::unique_ptr<TarnFileSystem> gold(host.AddTarnFileSystem("gold", upper, {}, true));
  ASSERT_NE(gold, nullptr);
  // The config-tarn operations find the daemon's container through the mount's id.
  std::string path;
  gold->CreateConfigTarn("vm-two", "", 1, "", path, "", false);
  EXPECT_EQ(path, "/hyra/volumes/gold/vm-two");
  gold->MountConfigTarn("", "5D2F7A10-6B1C-4E3D-9A8B-7C6D5E4F3A2B", "", false);
  EXPECT_EQ(
      gold->CheckTarnAccessibility({"0C9E2D1A-3B4F-4A5E-8F70-112233445566"}),
      std::vector<HostCtl::Storage::TarnAccessibilityType>{HostCtl::Storage::TARN_ACCESSIBLE});
  const auto tarns = World()["containers"][0]["tarns"];
  ASSERT_EQ(tarns.size(), 3u);
  EXPECT_EQ(tarns[1]["configTarn"]["mounted"], true);
  EXPECT_EQ(tarns[2]["configTarn"]["name"], "vm-two");
  host.RemoveTarnFileSystem("6f1c2f4e8d3b4c1a9e2f0a1b2c3d4e5f");
  EXPECT_TRUE(World()["host"]["mounted"].empty());
}

TEST_F(Operations, AWorldOfAnOlderLayoutIsRefusedUntilInitReplacesIt) {
  sqlite3* db = nullptr;
  ASSERT_EQ(sqlite3_open(Path("old.db").c_str(), &db), SQLITE_OK);
  sqlite3_exec(db, "CREATE TABLE layout(version INTEGER NOT NULL); INSERT INTO layout VALUES(1)",
               nullptr, nullptr, nullptr);
  sqlite3_close(db);
  const std::string env = "HYRA_SIM_DB=" + Path("old.db") + " " + HYRASIM_PATH;
  const SimTest::ToolResult shown = Run(env, "show");
  EXPECT_EQ(shown.status, 1);
  EXPECT_NE(
      shown.err.find("has layout 1 but this build reads layout 2; replace it with hyrasim init"),
      std::string::npos)
      << shown.err;
  EXPECT_EQ(Run(env, "init --demo").status, 0);
  EXPECT_EQ(Run(env, "show").status, 0);
}

}  // namespace
