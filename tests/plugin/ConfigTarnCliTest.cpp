// The config-tarn commands and kirocontext set end to end.
#include <fstream>
#include <nlohmann/json.hpp>

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

}  // namespace
}  // namespace PluginCliTest
