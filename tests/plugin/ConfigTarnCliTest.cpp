// The config-tarn commands and kirocontext set end to end.
#include <sys/stat.h>

#include <fstream>
#include <nlohmann/json.hpp>
#include <string>

#include "CliSupport.h"

namespace PluginCliTest {
namespace {

using nlohmann::json;

constexpr char kGold[] = "6f1c2f4e-8d3b-4c1a-9e2f-0a1b2c3d4e5f";

TEST_F(CliTest, ConfigTarnAndKiroContextStoreWhatTheySentOrReportWhy) {
  const std::string policyFile = directory_ + "/policy";
  std::ofstream(policyFile) << "rule=fast\nignored\n";
  const std::vector<std::string> steps[] = {
      {"configtarn", "add", "-n", "cfg", "-c", kGold, "-s", "2048", "-v", "vm-9", "-f", policyFile,
       "-p", "unused", "--priority"},
      {"configtarn", "mount", "--name", "cfg", "-c", kGold},
      {"configtarn", "remove", "-u", "5d2f7a10-6b1c-4e3d-9a8b-7c6d5e4f3a2b", "-c", kGold},
      {"kirocontext", "set", "-u", "zm-1"},
  };
  for (const auto& step : steps) {
    EXPECT_EQ(Tarn(step), (Outcome{0, "true\n", ""}));
  }
  const json world = World();
  const json& tarns = world["containers"][0]["tarns"];
  ASSERT_EQ(tarns.size(), 2u);
  EXPECT_EQ(tarns[1]["logicalSizeMB"], 2048);
  EXPECT_EQ(tarns[1]["configTarn"], json::parse(R"({"name": "cfg", "policy": "rule=fast",
      "vmUuid": "vm-9", "mounted": true})"));
  EXPECT_EQ(world["host"]["kiroContext"], "zm-1");

  EXPECT_EQ(Tarn({"configtarn", "umount", "-c", kGold}),
            (Outcome{1, "", "Either StorageContainer Name or UUID is required\n"}));
  EXPECT_EQ(World(), world);
}

TEST_F(CliTest, PolicyFileIsARegularFileWithAFirstLineOfAtMostOneMebibyte) {
  constexpr size_t kMiB = 1024 * 1024;
  const std::string fifo = directory_ + "/fifo";
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  const std::string link = directory_ + "/link-to-fifo";
  ASSERT_EQ(symlink(fifo.c_str(), link.c_str()), 0);
  const std::string atLimit = directory_ + "/at-limit", overLimit = directory_ + "/over-limit";
  std::ofstream(atLimit) << std::string(kMiB, 'a') << "\nrest\n";
  std::ofstream(overLimit) << std::string(kMiB + 1, 'a');

  const json demo = World();
  // Neither blocks nor reads without end: both are refused before anything is read.
  for (const std::string& path : {fifo, link, std::string("/dev/zero"), overLimit}) {
    SCOPED_TRACE(path);
    EXPECT_EQ(Tarn({"configtarn", "add", "-n", "cfg", "-c", kGold, "-f", path}),
              (Outcome{1, "", "Unable to read policy file " + path + "\n"}));
    EXPECT_EQ(World(), demo);
  }
  EXPECT_EQ(Tarn({"configtarn", "add", "-n", "cfg", "-c", kGold, "-f", atLimit}),
            (Outcome{0, "true\n", ""}));
  const json world = World();
  const json& created = world["containers"][0]["tarns"].back()["configTarn"];
  EXPECT_EQ(created["name"], "cfg");
  EXPECT_EQ(created["policy"], std::string(kMiB, 'a'));
}

}  // namespace
}  // namespace PluginCliTest
