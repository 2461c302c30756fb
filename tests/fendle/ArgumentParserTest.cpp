#include <gtest/gtest.h>

#include <functional>

#include "TestCommand.h"
#include "fendle/ArgumentParser.h"

namespace {

using Fendle::CallSpec::Input;
using Fendle::CallSpec::ParameterType;
using Fendle::CommandLine::ArgumentParser;
using Fendle::CommandLine::UsageError;
using FendleTest::Parameter;

typedef std::vector<std::string> Words;

// One parameter of every type; only "name" is required.
boost::shared_ptr<Fendle::CallSpec::InputSpec> EveryType() {
  boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = Fendle::CallSpec::InputSpec::New();
  spec->AddParameter(Parameter("name", ParameterType::String, "n", true));
  spec->AddParameter(Parameter("count", ParameterType::Int, "t", false));
  spec->AddParameter(Parameter("on", ParameterType::Bool, "", false));
  spec->AddParameter(Parameter("force", ParameterType::Flag, "f", false));
  spec->AddParameter(Parameter("tag", ParameterType::StringList, "g", false));
  spec->AddParameter(Parameter("num", ParameterType::IntList, "", false));
  spec->AddParameter(Parameter("bits", ParameterType::BoolList, "b", false));
  return spec;
}

Words With(Words words) {
  words.insert(words.begin(), {"--name", "x"});
  return words;
}

struct Accepted {
  Words words;
  std::function<void(const Input&)> check;
};

TEST(ArgumentParserTest, AcceptsEveryFormOfEveryType) {
  const Accepted cases[] = {
      {{"--name", "a b"}, [](const Input& in) { EXPECT_EQ(in.GetString("name"), "a b"); }},
      {{"--name=x=y"}, [](const Input& in) { EXPECT_EQ(in.GetString("name"), "x=y"); }},
      {{"-n", "-x"}, [](const Input& in) { EXPECT_EQ(in.GetString("name"), "-x"); }},
      {{"--name", "--force"},
       [](const Input& in) {
         EXPECT_EQ(in.GetString("name"), "--force");
         EXPECT_FALSE(in.IsSet("force"));
       }},
      {{"--name="},
       [](const Input& in) {
         EXPECT_TRUE(in.IsSet("name"));
         EXPECT_EQ(in.GetString("name"), "");
       }},
      {With({"-t", "-5"}), [](const Input& in) { EXPECT_EQ(in.GetInt("count"), -5); }},
      {With({"--count=+7"}), [](const Input& in) { EXPECT_EQ(in.GetInt("count"), 7); }},
      {With({"--count", "9223372036854775807"}),
       [](const Input& in) { EXPECT_EQ(in.GetInt("count"), INT64_MAX); }},
      {With({"--count", "-9223372036854775808"}),
       [](const Input& in) { EXPECT_EQ(in.GetInt("count"), INT64_MIN); }},
      {With({"--on", "TRUE"}), [](const Input& in) { EXPECT_TRUE(in.GetBool("on")); }},
      {With({"--on", "False"}),
       [](const Input& in) {
         EXPECT_TRUE(in.IsSet("on"));
         EXPECT_FALSE(in.GetBool("on"));
       }},
      {With({"--on=yes"}), [](const Input& in) { EXPECT_TRUE(in.GetBool("on")); }},
      {With({"--on", "0"}), [](const Input& in) { EXPECT_FALSE(in.GetBool("on")); }},
      {With({"-f"}), [](const Input& in) { EXPECT_TRUE(in.GetFlag("force")); }},
      {With({}),
       [](const Input& in) {
         EXPECT_FALSE(in.GetFlag("force"));
         EXPECT_FALSE(in.IsSet("count"));
       }},
      {With({"-g", "a", "--tag", "-b", "--tag=c"}),
       [](const Input& in) {
         EXPECT_EQ(in.GetStringList("tag"), (Words{"a", "-b", "c"}));
       }},
      {With({"--num", "3", "--num=-2", "--num", "3"}),
       [](const Input& in) {
         EXPECT_EQ(in.GetIntList("num"), (std::vector<int64_t>{3, -2, 3}));
       }},
      {With({"-b", "no", "--bits", "1"}),
       [](const Input& in) {
         EXPECT_EQ(in.GetBoolList("bits"), (std::vector<bool>{false, true}));
       }},
  };
  ArgumentParser parser(EveryType());
  for (const Accepted& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.words));
    boost::shared_ptr<Input> input;
    ASSERT_NO_THROW(input = parser.Parse(c.words));
    c.check(*input);
  }
}

struct Refused {
  Words words;
  const char* message;  // a text the message must hold
};

TEST(ArgumentParserTest, RefusesWhatTheCommandCouldNotRunWith) {
  const Refused cases[] = {
      {With({"--nope", "1"}), "Unknown option '--nope'"},
      {With({"-z"}), "Unknown option '-z'"},
      {With({"-ng"}), "Unknown option '-ng'"},
      {With({"stray"}), "Unexpected argument 'stray'"},
      {With({"-"}), "Unexpected argument '-'"},
      {With({"--"}), "Unexpected argument '--'"},
      {{"--name"}, "--name needs a value"},
      {With({"-t"}), "--count needs a value"},
      {With({"--count", "abc"}), "'abc' of option --count is not an integer"},
      {With({"--count", "12x"}), "is not an integer"},
      {With({"--count", ""}), "is not an integer"},
      {With({"--count", " 5"}), "is not an integer"},
      {With({"--count", "0x10"}), "is not an integer"},
      {With({"--count", "1e3"}), "is not an integer"},
      {With({"--count", "+-1"}), "is not an integer"},
      {With({"--count", "+"}), "is not an integer"},
      {With({"--count", "9223372036854775808"}), "out of range"},
      {With({"--num", "-9223372036854775809"}), "out of range"},
      {With({"--on", "maybe"}), "'maybe' of option --on must be true or false"},
      {With({"--bits", ""}), "must be true or false"},
      {With({"--force=x"}), "--force takes no value"},
      {With({"--force="}), "--force takes no value"},
      {{"--name", "a", "-n", "b"}, "--name is given more than once"},
      {With({"-f", "--force"}), "--force is given more than once"},
      {With({"--count", "1", "--count", "1"}), "--count is given more than once"},
      {With({"--on", "true", "--on=true"}), "--on is given more than once"},
      {{}, "Missing required option: --name"},
      {{"--count", "1"}, "Missing required option: --name"},
  };
  ArgumentParser parser(EveryType());
  for (const Refused& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.words));
    try {
      parser.Parse(c.words);
      ADD_FAILURE() << "accepted";
    } catch (const UsageError& e) {
      EXPECT_NE(std::string(e.what()).find(c.message), std::string::npos) << e.what();
    }
  }
}

TEST(ArgumentParserTest, NamesEveryMissingRequiredOption) {
  boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = Fendle::CallSpec::InputSpec::New();
  spec->AddParameter(Parameter("path", ParameterType::String, "p", true));
  spec->AddParameter(Parameter("level", ParameterType::Int, "", false));
  spec->AddParameter(Parameter("uuid", ParameterType::StringList, "u", true));
  try {
    ArgumentParser(spec).Parse({"--level", "2"});
    ADD_FAILURE() << "accepted";
  } catch (const UsageError& e) {
    EXPECT_STREQ(e.what(), "Missing required option: --path, --uuid");
  }
  EXPECT_TRUE(ArgumentParser(Fendle::CallSpec::InputSpec::New()).Parse({}));
}

}  // namespace
