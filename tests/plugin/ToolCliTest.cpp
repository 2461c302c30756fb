// hyracli itself around the plug-in's commands: the versions, the formats read
// back by their parsers, a stopped daemon, and output that cannot be written.
#include <sys/wait.h>

#include <cstdlib>
#include <fstream>
#include <nlohmann/json.hpp>
#include <sstream>
#include <string>
#include <vector>

#include "CliSupport.h"

namespace PluginCliTest {
namespace {

using nlohmann::json;

TEST_F(CliTest, VersionsComeFromTheBuildForTheToolAndThePlugin) {
  const std::string version = HYRA_VERSION;
  EXPECT_EQ(Tool(HYRACLI_PATH, {"--version"}),
            (Outcome{0, "hyracli " + version + "\ntarn.plugin.so " + version + "\n", ""}));
}

// The containers a load mounts, in each format for programs, parsed back by
// the format's own reader into one line per container: name and array ids.
TEST_F(CliTest, LoadReadsBackThroughEachFormatsParser) {
  const std::string script = directory_ + "/rendered";
  const std::string expected =
      "silver array-a array-b\nbronze array-c\n";  // gold is mounted already
  const std::pair<std::string, std::string> readers[] = {
      {"json",
       "python3 -c 'import json,sys\n"
       "for r in json.load(open(sys.argv[1])):\n"
       "  print(r[\"StorageContainer Name\"], *[a[\"ArrayId\"] for a in r[\"Arrays\"]])'"},
      {"xml",
       "xmllint --noout {} && python3 -c 'import sys,xml.etree.ElementTree as E\n"
       "for r in E.parse(sys.argv[1]).getroot().find(\"list\"):\n"
       "  f={x.get(\"name\"):x for x in r.findall(\"field\")}\n"
       "  print(r.get(\"heading\"), *[a.find(\"field/string\").text for a in "
       "f[\"Arrays\"].find(\"list\")])'"},
      {"csv",
       "python3 -c 'import csv,json,sys\n"
       "for r in csv.DictReader(open(sys.argv[1], newline=\"\")):\n"
       "  print(r[\"StorageContainer Name\"], *[a[\"ArrayId\"] for a in "
       "json.loads(r[\"Arrays\"])])'"},
      {"keyvalue",
       "python3 -c 'import re,sys\n"
       "rows=dict()\n"
       "for line in open(sys.argv[1]):\n"
       "  key,value=line.rstrip(\"\\n\").split(\"=\",1)\n"
       "  m=re.fullmatch(r\"(\\d+)\\.(StorageContainer Name|Arrays\\.\\d+\\.ArrayId)\",key)\n"
       "  if m: rows.setdefault(int(m[1]),[]).append(value)\n"
       "for k in sorted(rows): print(*rows[k])'"},
  };
  for (const auto& reader : readers) {
    ASSERT_EQ(Sim({"init", "--demo"}).status, 0);
    const Outcome load = Tarn({"storagecontainer", "load", "--formatter", reader.first});
    ASSERT_EQ(load.status, 0) << reader.first << ": " << load.err;
    std::ofstream(script, std::ios::binary) << load.out;
    std::string command = reader.second;
    for (std::string::size_type at; (at = command.find("{}")) != std::string::npos;) {
      command.replace(at, 2, "'" + script + "'");
    }
    const Outcome read = Tool("/bin/sh", {"-c", command + " '" + script + "'"});
    EXPECT_EQ(read, (Outcome{0, expected, ""})) << reader.first;
  }
}

TEST_F(CliTest, StoppedDaemonStillAnswersHelpAndSaysHowToStartIt) {
  ASSERT_EQ(Sim({"daemon", "stop"}).status, 0);
  const std::string failure =
      "hyracli: Cannot register plug-in " + std::string(PLUGIN_PATH) +
      ": Unable to initialize tarnLib (internal/VendorProviderRemove:35)\n"
      "hyracli: hint: if the simulated Tarnd is stopped, start it with 'hyrasim daemon start'\n";
  const Outcome help = Tool(HYRACLI_PATH, {"--help"});
  EXPECT_EQ(help.status, 0);
  EXPECT_EQ(help.out.substr(0, 15), "Usage: hyracli ");
  EXPECT_EQ(help.err, failure);
  EXPECT_EQ(Provider({"remove", "-v", "vp1"}), (Outcome{3, "", failure}));
  ASSERT_EQ(Sim({"daemon", "start"}).status, 0);
  EXPECT_EQ(Provider({"remove", "-v", "vp1"}), (Outcome{0, "true\n", ""}));
}

TEST_F(CliTest, OutputThatCannotBeWrittenFailsTheRun) {
  const std::string err = directory_ + "/err";
  const std::string command = std::string("'") + HYRACLI_PATH +
                              "' storage internal tarn storagecontainer load >/dev/full 2>'" + err +
                              "'";
  const int raw = std::system(command.c_str());
  std::stringstream text;
  text << std::ifstream(err).rdbuf();
  EXPECT_EQ(WIFEXITED(raw) ? WEXITSTATUS(raw) : -1, 1);
  EXPECT_EQ(text.str(), "hyracli: cannot write the output: No space left on device\n");
}

}  // namespace
}  // namespace PluginCliTest
