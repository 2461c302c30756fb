#include <gtest/gtest.h>

#include "Fendle/CallSpec.h"
#include "HostCtl/Lib.h"
#include "TestCommand.h"

namespace {

using Fendle::CallSpec::Input;
using Fendle::CallSpec::InputSpec;
using Fendle::CallSpec::Output;
using Fendle::CallSpec::ParameterType;
using FendleTest::Parameter;

TEST(InputTest, ParametersNotGivenAnswerTheEmptyValueOfTheirType) {
  boost::shared_ptr<Input> input = Input::New();
  // Values of other names and other types must not leak into the answers.
  input->SetString("other", "x");
  input->SetInt("number", 7);
  input->SetBool("switch", true);
  input->SetFlag("flag");

  EXPECT_EQ(input->GetString("missing"), "");
  EXPECT_EQ(input->GetInt("missing"), 0);
  EXPECT_FALSE(input->GetBool("missing"));
  EXPECT_FALSE(input->GetFlag("missing"));
  EXPECT_TRUE(input->GetStringList("missing").empty());
  EXPECT_TRUE(input->GetIntList("missing").empty());
  EXPECT_TRUE(input->GetBoolList("missing").empty());
  EXPECT_FALSE(input->IsSet("missing"));
  EXPECT_EQ(input->GetString("number"), "");
  EXPECT_EQ(input->GetInt("other"), 0);
  EXPECT_FALSE(input->GetFlag("switch"));

  for (const char* name : {"other", "number", "switch", "flag"}) {
    EXPECT_TRUE(input->IsSet(name)) << name;
  }
}

TEST(InputTest, SettersReplaceAndAddersAppendInOrder) {
  boost::shared_ptr<Input> input = Input::New();
  input->SetString("name", "first");
  input->SetString("name", "second");
  input->AddString("tag", "a");
  input->AddString("tag", "b");
  input->AddInt("num", -1);
  input->AddInt("num", 5);
  input->AddBool("bits", true);
  input->AddBool("bits", false);
  input->SetBool("on", false);

  EXPECT_EQ(input->GetString("name"), "second");
  EXPECT_EQ(input->GetStringList("name"), std::vector<std::string>{"second"});
  EXPECT_EQ(input->GetStringList("tag"), (std::vector<std::string>{"a", "b"}));
  EXPECT_EQ(input->GetIntList("num"), (std::vector<int64_t>{-1, 5}));
  EXPECT_EQ(input->GetBoolList("bits"), (std::vector<bool>{true, false}));
  // A false value that was given is still set.
  EXPECT_TRUE(input->IsSet("on"));
  EXPECT_FALSE(input->GetBool("on"));
}

TEST(OutputTest, KeepsEveryErrorInOrderTheLastResultAndTheFinish) {
  boost::shared_ptr<Output> output = Output::New();
  EXPECT_FALSE(output->HasError());
  EXPECT_FALSE(output->GetResult());
  EXPECT_FALSE(output->IsFinished());

  output->SetError("first\n");
  output->SetResult(Fendle::MetaObj::MetaBool::New(true));
  boost::shared_ptr<Fendle::MetaObj::MetaObject> last = Fendle::MetaObj::MetaBool::New(false);
  output->SetResult(last);
  output->SetError("second");
  output->Finish();

  EXPECT_TRUE(output->HasError());
  EXPECT_EQ(output->GetErrors(), (std::vector<std::string>{"first\n", "second"}));
  EXPECT_EQ(output->GetResult(), last);
  EXPECT_TRUE(output->IsFinished());
}

TEST(InputSpecTest, FindsByNameAndAliasAndRefusesAmbiguousDeclarations) {
  boost::shared_ptr<InputSpec> spec = InputSpec::New();
  spec->AddParameter(Parameter("path", ParameterType::String, "p", true));
  spec->AddParameter(Parameter("tarn", ParameterType::StringList, "", false));

  EXPECT_EQ(spec->FindParameter("tarn")->GetType(), ParameterType::StringList);
  EXPECT_EQ(spec->FindAlias("p")->GetName(), "path");
  // A parameter without alias must not be found by an empty one.
  EXPECT_FALSE(spec->FindAlias(""));
  EXPECT_FALSE(spec->FindParameter("p"));

  EXPECT_THROW(spec->AddParameter(Parameter("path", ParameterType::Int, "", false)),
               HostCtl::Lib::HostCtlException);
  EXPECT_THROW(spec->AddParameter(Parameter("other", ParameterType::Int, "p", false)),
               HostCtl::Lib::HostCtlException);
  EXPECT_THROW(spec->AddParameter(boost::shared_ptr<Fendle::CallSpec::ParameterSpec>()),
               HostCtl::Lib::HostCtlException);
  EXPECT_EQ(spec->GetParameters().size(), 2u);
  EXPECT_FALSE(spec->GetParameters()[1]->IsRequired());
}

}  // namespace
