#include <gtest/gtest.h>

#include <sstream>

#include "TestCommand.h"
#include "fendle/ArgumentParser.h"

namespace {

using Fendle::CallSpec::ParameterType;
using Fendle::CommandLine::ArgumentParser;
using Words = std::vector<std::string>;

// One parameter of every type; only "name" is required.
ArgumentParser EveryType() {
  return ArgumentParser(FendleTest::Spec({{"name", ParameterType::String, "n", true, ""},
                                          {"count", ParameterType::Int, "t", false, ""},
                                          {"on", ParameterType::Bool, "", false, ""},
                                          {"force", ParameterType::Flag, "f", false, ""},
                                          {"tag", ParameterType::StringList, "g", false, ""},
                                          {"num", ParameterType::IntList, "", false, ""},
                                          {"bits", ParameterType::BoolList, "b", false, ""}}));
}

// What the command would read, on one line.
std::string Summary(const Fendle::CallSpec::Input& in) {
  std::ostringstream s;
  s << "name=" << in.GetString("name");
  if (in.IsSet("count")) s << " count=" << in.GetInt("count");
  if (in.IsSet("on")) s << " on=" << in.GetBool("on");
  if (in.GetFlag("force")) s << " force";
  for (const std::string& tag : in.GetStringList("tag")) s << " tag=" << tag;
  for (int64_t num : in.GetIntList("num")) s << " num=" << num;
  for (bool bit : in.GetBoolList("bits")) s << " bits=" << bit;
  return s.str();
}

TEST(ArgumentParserTest, AcceptsEveryFormOfEveryType) {
  const std::pair<Words, std::string> cases[] = {
      {{"--name", "a b"}, "name=a b"},
      {{"--name=x=y"}, "name=x=y"},
      {{"--name="}, "name="},
      {{"-n", "-x", "-t", "-5"}, "name=-x count=-5"},
      {{"-n", "--force"}, "name=--force"},
      {{"-n", "x", "--count=+7", "--on", "TRUE", "-f"}, "name=x count=7 on=1 force"},
      {{"-n", "x", "--count", "9223372036854775807"}, "name=x count=9223372036854775807"},
      {{"-n", "x", "--count", "-9223372036854775808", "--on=False"},
       "name=x count=-9223372036854775808 on=0"},
      {{"-n", "x", "-b", "yes", "--bits", "0", "-b", "No", "--bits=1"},
       "name=x bits=1 bits=0 bits=0 bits=1"},
      {{"-n", "x", "-g", "a", "--tag", "-b", "--tag=c", "--num", "3", "--num=-2", "--num", "3"},
       "name=x tag=a tag=-b tag=c num=3 num=-2 num=3"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(Summary(*EveryType().Parse(c.first)), c.second) << testing::PrintToString(c.first);
  }
}

TEST(ArgumentParserTest, RefusesWhatTheCommandCouldNotRunWith) {
  const std::pair<Words, std::string> cases[] = {
      {{"-n", "x", "--nope", "1"}, "Unknown option '--nope'"},
      {{"-n", "x", "-z"}, "Unknown option '-z'"},
      {{"-n", "x", "-nf"}, "Unknown option '-nf'"},
      {{"-n", "x", "stray"}, "Unexpected argument 'stray'"},
      // "--" ends the options; the command takes no other word.
      {{"-n", "x", "--", "-t", "1"}, "Unexpected argument '-t'"},
      {{"-n", "x", "--", "--help"}, "Unexpected argument '--help'"},
      // A mistyped long option gets the closest names, a far one none.
      {{"-n", "x", "--cuont", "1"}, "Unknown option '--cuont'\nDid you mean '--count'?"},
      {{"-n", "x", "--fource"}, "Unknown option '--fource'\nDid you mean '--force'?"},
      {{"-n", "x", "--zzzzzz"}, "Unknown option '--zzzzzz'"},
      // An echoed value is cut and its control bytes are shown escaped.
      {{"-n", "x", "-t", std::string(300, 'x') + "\x1B"},
       "Value '" + std::string(256, 'x') +
           "... (cut, 301 bytes in all)' of option --count is "
           "not an integer"},
      {{"-n", "x", "-t", "1\x1B[2J"}, "Value '1\\x1B[2J' of option --count is not an integer"},
      {{"--name"}, "Option --name needs a value"},
      {{"-n", "x", "-t"}, "Option --count needs a value"},
      {{"-n", "x", "-t", "abc"}, "Value 'abc' of option --count is not an integer"},
      {{"-n", "x", "-t", ""}, "Value '' of option --count is not an integer"},
      {{"-n", "x", "-t", "12x"}, "Value '12x' of option --count is not an integer"},
      {{"-n", "x", "-t", "+-1"}, "Value '+-1' of option --count is not an integer"},
      {{"-n", "x", "-t", "9223372036854775808"},
       "Value '9223372036854775808' of option --count is out of range for a 64-bit integer"},
      {{"-n", "x", "--num", "-9223372036854775809"},
       "Value '-9223372036854775809' of option --num is out of range for a 64-bit integer"},
      {{"-n", "x", "--on", "maybe"}, "Value 'maybe' of option --on must be true or false"},
      {{"-n", "x", "-b", ""}, "Value '' of option --bits must be true or false"},
      {{"-n", "x", "--force=x"}, "Option --force takes no value"},
      {{"--name", "a", "-n", "b"}, "Option --name is given more than once"},
      {{"-n", "x", "-f", "--force"}, "Option --force is given more than once"},
      {{"--count", "1"}, "Missing required option: --name"},
  };
  for (const auto& c : cases) {
    try {
      EveryType().Parse(c.first);
      ADD_FAILURE() << "accepted " << testing::PrintToString(c.first);
    } catch (const Fendle::CommandLine::UsageError& e) {
      EXPECT_EQ(e.what(), c.second);
    }
  }
}

}  // namespace
