#include <gtest/gtest.h>

#include "Fendle/CallSpec.h"
#include "HostCtl/Lib.h"
#include "TestCommand.h"

namespace {

using namespace Fendle::CallSpec;

// Values given are read back through the parser's tests; here what was not given.
TEST(InputTest, GettersOfParametersNotGivenAnswerTheEmptyValueOfTheirType) {
  boost::shared_ptr<Input> in = Input::New();
  in->SetString("text", "x");
  in->SetInt("number", 7);
  in->SetBool("off", false);
  // Not given, or given as another type.
  EXPECT_EQ(in->GetString("missing") + in->GetString("number"), "");
  EXPECT_EQ(in->GetInt("missing") + in->GetInt("text"), 0);
  EXPECT_FALSE(in->GetBool("missing") || in->GetBool("number") || in->GetFlag("off"));
  EXPECT_TRUE(in->GetStringList("missing").empty() && in->GetIntList("text").empty() &&
              in->GetBoolList("number").empty());
  EXPECT_FALSE(in->IsSet("missing"));
  EXPECT_TRUE(in->IsSet("off"));
}

TEST(OutputTest, KeepsEveryErrorInOrderTheLastResultAndTheFinish) {
  boost::shared_ptr<Output> out = Output::New();
  EXPECT_FALSE(out->HasError() || out->GetResult() || out->IsFinished());
  auto last = Fendle::MetaObj::MetaBool::New(false);
  out->SetError("first\n");
  out->SetResult(Fendle::MetaObj::MetaBool::New(true));
  out->SetResult(last);
  out->SetError("second");
  out->Finish();
  EXPECT_EQ(out->GetErrors(), (std::vector<std::string>{"first\n", "second"}));
  EXPECT_EQ(out->GetResult(), last);
  EXPECT_TRUE(out->HasError() && out->IsFinished());
}

TEST(InputSpecTest, FindsByNameAndAliasAndRefusesAmbiguousDeclarations) {
  auto spec = FendleTest::Spec({{"path", ParameterType::String, "p", true, ""},
                                {"tarn", ParameterType::StringList, "", false, ""}});
  EXPECT_EQ(spec->FindAlias("p")->GetName(), "path");
  EXPECT_EQ(spec->FindParameter("tarn")->GetType(), ParameterType::StringList);
  // A parameter without alias must not be found by an empty one.
  EXPECT_FALSE(spec->FindAlias(""));
  EXPECT_FALSE(spec->FindParameter("p"));
  EXPECT_THROW(spec->AddParameter(ParameterSpec::New("path", ParameterType::Int)),
               HostCtl::Lib::HostCtlException);
  auto clash = ParameterSpec::New("other", ParameterType::Int);
  clash->SetAlias("p");
  EXPECT_THROW(spec->AddParameter(clash), HostCtl::Lib::HostCtlException);
  EXPECT_THROW(spec->AddParameter(nullptr), HostCtl::Lib::HostCtlException);
  EXPECT_EQ(spec->GetParameters().size(), 2u);
}

}  // namespace
