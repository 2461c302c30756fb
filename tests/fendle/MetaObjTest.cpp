#include <gtest/gtest.h>

#include "Fendle/MetaObj.h"

namespace {

using namespace Fendle::MetaObj;

std::string Text(const boost::shared_ptr<MetaObject>& value) {
  return boost::dynamic_pointer_cast<MetaString>(value)->GetValue();
}

TEST(MetaStructTest, FieldsKeepFirstSetOrderAndAreReplacedInPlace) {
  boost::shared_ptr<MetaStruct> row = MetaStruct::New("Row");
  row->SetField("Name", "a");
  row->SetField("Null", static_cast<const char*>(nullptr));
  row->SetField("Lines", std::vector<std::string>{"one", "two"});
  row->SetField("Name", std::string("b"));

  std::vector<std::string> names;
  for (const auto& field : row->GetFields()) names.push_back(field.first);
  EXPECT_EQ(names, (std::vector<std::string>{"Name", "Null", "Lines"}));
  EXPECT_EQ(Text(row->GetField("Name")), "b");
  EXPECT_EQ(Text(row->GetField("Null")), "");
  auto lines = boost::dynamic_pointer_cast<MetaList>(row->GetField("Lines"));
  ASSERT_TRUE(lines && lines->GetElementType() == MetaType::String && lines->Size() == 2);
  EXPECT_EQ(Text(lines->GetElements()[1]), "two");
  EXPECT_FALSE(row->GetField("Nothing"));
}

}  // namespace
