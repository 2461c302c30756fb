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
  row->SetField("Size", static_cast<int64_t>(10));
  row->SetField("Flag", MetaBool::New());
  row->SetField("Name", std::string("b"));
  row->SetField("Size", MetaInt::New(20));

  const MetaStruct::Fields& fields = row->GetFields();
  ASSERT_EQ(fields.size(), 3u);
  EXPECT_EQ(fields[0].first, "Name");
  EXPECT_EQ(Text(fields[0].second), "b");
  EXPECT_EQ(fields[1].first, "Size");
  EXPECT_EQ(boost::dynamic_pointer_cast<MetaInt>(fields[1].second)->GetValue(), 20);
  EXPECT_EQ(fields[2].first, "Flag");
  EXPECT_FALSE(row->GetField("Nothing"));
  EXPECT_EQ(row->GetName(), "Row");
}

TEST(MetaStructTest, ConvenienceSettersBuildTheMatchingValues) {
  boost::shared_ptr<MetaStruct> row = MetaStruct::New("Row");
  row->SetField("Null", static_cast<const char*>(nullptr));
  row->SetField("Chars", "text");
  row->SetField("Lines", std::vector<std::string>{"one", "two"});

  EXPECT_EQ(Text(row->GetField("Null")), "");
  EXPECT_EQ(Text(row->GetField("Chars")), "text");
  boost::shared_ptr<MetaList> lines = boost::dynamic_pointer_cast<MetaList>(row->GetField("Lines"));
  ASSERT_TRUE(lines);
  EXPECT_EQ(lines->GetElementType(), MetaType::String);
  ASSERT_EQ(lines->Size(), 2u);
  EXPECT_EQ(Text(lines->GetElements()[1]), "two");
}

TEST(MetaObjectTest, CloneIsDeepAndKeepsEveryProperty) {
  boost::shared_ptr<MetaStruct> prototype = MetaStruct::New("Array");
  prototype->SetField("ArrayId", "");
  boost::shared_ptr<MetaList> arrays = MetaList::New(MetaType::Struct, prototype);
  boost::shared_ptr<MetaStruct> array = MetaStruct::New("Array");
  array->SetField("ArrayId", "A1");
  arrays->Append(array);
  boost::shared_ptr<MetaStruct> row = MetaStruct::New("Container");
  row->SetField("Arrays", arrays);
  row->SetField("Valid", MetaBool::New());

  boost::shared_ptr<MetaStruct> copy = boost::dynamic_pointer_cast<MetaStruct>(row->Clone());
  ASSERT_TRUE(copy);
  boost::shared_ptr<MetaList> copiedArrays =
      boost::dynamic_pointer_cast<MetaList>(copy->GetField("Arrays"));
  ASSERT_TRUE(copiedArrays);
  EXPECT_NE(copiedArrays, arrays);
  EXPECT_EQ(copiedArrays->GetElementType(), MetaType::Struct);
  ASSERT_TRUE(copiedArrays->GetPrototype());
  EXPECT_NE(copiedArrays->GetPrototype(), prototype);
  EXPECT_FALSE(boost::dynamic_pointer_cast<MetaBool>(copy->GetField("Valid"))->HasValue());

  // Changing the original afterwards leaves the copy as it was.
  array->SetField("ArrayId", "changed");
  arrays->Append(MetaStruct::New("Array"));
  ASSERT_EQ(copiedArrays->Size(), 1u);
  EXPECT_EQ(Text(boost::dynamic_pointer_cast<MetaStruct>(copiedArrays->GetElements()[0])
                     ->GetField("ArrayId")),
            "A1");
}

}  // namespace
