// Texts, arrays, run-time classes and script values.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <limits>

#include "host/base/ControlID.h"
#include "host/base/HStringArray.h"
#include "host/base/TSimpleArray.h"
#include "host/command/Variable.h"
#include "host/scene/Bones.h"
#include "host/scene/Devices.h"

namespace {

using testing::ElementsAre;

TEST(HString, PartsAndComparison) {
  HString const text("Hips:Spine");
  EXPECT_EQ(text.Left(4), "Hips");
  EXPECT_EQ(text.Right(5), "Spine");
  EXPECT_EQ(text.Left(100), text);
  EXPECT_EQ(text.Right(100), text);
  EXPECT_TRUE(text.Left(0).IsEmpty() && text.Right(0).IsEmpty());
  EXPECT_EQ(text.ReverseFind(':'), 4);
  EXPECT_EQ(text.ReverseFind('i'), 7);
  EXPECT_EQ(text.ReverseFind('?'), -1);
  EXPECT_TRUE("Hips:Spine" == text && text != "hips:spine");
  HString lower("ÄBC:Xy");
  lower.MakeLower();
  EXPECT_EQ(lower, "Äbc:xy") << "bytes beyond ASCII stay";
  EXPECT_TRUE(HString(static_cast<char const*>(nullptr)).IsEmpty());
}

TEST(HString, FormatTakesItsOwnTextAndAnyLength) {
  HString text("abc");
  text.Format("%s-%d-%s", text.GetStr(), 7, std::string(5000, 'x').c_str());
  EXPECT_EQ(text.GetLength(), 5006);
  EXPECT_EQ(text.Left(6), "abc-7-");
  text.Format("%s", "");
  EXPECT_TRUE(text.IsEmpty());
}

std::vector<std::string> tokens(char const* text, HStringArray const& delimiters, bool keepEmpty, bool trim) {
  HStringArray out{"left over"};
  HStringArray::Tokenize(text, delimiters, out, keepEmpty, trim);
  std::vector<std::string> all;
  for (HString const& token : out) all.push_back(token.GetString());
  return all;
}

TEST(HStringArray, Tokenizes) {
  EXPECT_THAT(tokens("a,b;;c", {",", ";"}, false, false), ElementsAre("a", "b", "c"));
  EXPECT_THAT(tokens("a,b;;c,", {",", ";"}, true, false), ElementsAre("a", "b", "", "c", ""));
  EXPECT_THAT(tokens(" a , \t, b\t", {","}, false, true), ElementsAre("a", "b"));
  EXPECT_THAT(tokens(" a , ", {","}, true, true), ElementsAre("a", ""));
  EXPECT_THAT(tokens(" a , ", {","}, true, false), ElementsAre(" a ", " "));
  EXPECT_THAT(tokens("x<->y-z", {"-", "<->"}, false, false), ElementsAre("x", "y", "z")) << "longest wins";
  EXPECT_THAT(tokens("", {","}, false, false), ElementsAre());
  EXPECT_THAT(tokens("", {","}, true, false), ElementsAre(""));
  EXPECT_THAT(tokens("a,b", {}, false, false), ElementsAre("a,b"));
  EXPECT_THAT(tokens("a,b", {""}, false, false), ElementsAre("a,b")) << "an empty delimiter divides nothing";
}

TEST(TSimpleArray, GrowsBySixteen) {
  TSimpleArray<int> array;
  EXPECT_EQ(array.getCapacity(), 0);
  std::vector<int> capacities;
  for (int i = 0; i < 94; ++i) {
    array.add(i);
    if (capacities.empty() || capacities.back() != array.getCapacity())
      capacities.push_back(array.getCapacity());
  }
  EXPECT_THAT(capacities, ElementsAre(16, 32, 48, 64, 80, 96));
}

TEST(TSimpleArray, CopiesAndMoves) {
  TSimpleArray<int> array(2, 3), empty;
  for (int i = 0; i < 5; ++i) array.add(i * i);
  TSimpleArray<int> copy(array);
  copy[0] = 99;
  EXPECT_EQ(array[0], 0);
  TSimpleArray<int> moved(std::move(copy));
  EXPECT_THAT(std::vector<int>(moved.begin(), moved.end()), ElementsAre(99, 1, 4, 9, 16));
  array = empty;
  array.add(4);
  EXPECT_THAT(std::vector<int>(array.begin(), array.end()), ElementsAre(4));
}

TEST(RuntimeClass, KnowsItsAncestors) {
  HRuntimeClass* bone = HRuntimeClass::findClass("LabelingBone");
  ASSERT_EQ(bone, &LabelingBone::s_classLabelingBone);
  for (char const* name : {"LabelingBone", "BaseBone", "Node", "Module", "HObject"})
    EXPECT_TRUE(bone->isDerivedFrom(HRuntimeClass::findClass(name))) << name;
  for (char const* name : {"SolvingBone", "Marker", "ParameterizedSetup", "Attribute"})
    EXPECT_FALSE(bone->isDerivedFrom(HRuntimeClass::findClass(name))) << name;
  EXPECT_FALSE(bone->isDerivedFrom(nullptr));
  EXPECT_STREQ(bone->getBaseClass()->getName(), "BaseBone");
  EXPECT_EQ(HRuntimeClass::findClass("labelingbone"), nullptr);
  EXPECT_EQ(HRuntimeClass::findClass(""), nullptr);
  EXPECT_EQ(HRuntimeClass::findClass(nullptr), nullptr);
  for (char const* abstract : {"Module", "BaseBone", "ConstraintBase", "PositionConstraintBase",
                               "ParameterizedSetup", "NLEClip", "Controller", "Attribute", "Command"})
    EXPECT_EQ(HRuntimeClass::findClass(abstract)->getCreateFunction(), nullptr) << abstract;
  EXPECT_TRUE(SystemGroup::s_classSystemGroup.isSingleInstance());
  EXPECT_FALSE(bone->isSingleInstance());
}

TEST(Variable, NumbersReadAsEachOther) {
  Variable value;
  value.setValue(2.9, -1);
  EXPECT_EQ(value.getIntValue(-1), 2);
  EXPECT_EQ(value.getBoolValue(-1), Variable::Toggle);
  value.setValue(-2.9, -1);
  EXPECT_EQ(value.getIntValue(-1), -2);
  value.setValue(1e99, -1);
  EXPECT_EQ(value.getIntValue(-1), INT32_MAX);
  value.setValue(-1e99, -1);
  EXPECT_EQ(value.getIntValue(-1), INT32_MIN);
  value.setValue(std::numeric_limits<double>::quiet_NaN(), -1);
  EXPECT_EQ(value.getIntValue(-1), 0);
  value.setValue(77, -1);
  EXPECT_EQ(value.getBoolValue(-1), 77) << "no boolean, but answered as it is";
  EXPECT_EQ(value.getFloatValue(-1), 77.0);
  value.setValue(Variable::Toggle, -1);
  EXPECT_EQ(value.getIntValue(-1), 2);
  value.setValue("12", -1);
  EXPECT_EQ(value.getIntValue(-1), 0) << "a text is no number";
  EXPECT_EQ(value.getVecValue(-1), Vec3());
  EXPECT_STREQ(value.getStringValue(-1), "12");
}

TEST(Variable, ElementsTakeTheArraysType) {
  Variable ints(Variable::IntArray, 2), texts(Variable::StringArray, 2), vectors(Variable::VectorArray, 1);
  ints.setValue(3.7, 0);
  ints.setValue("9", 1);
  ints.setValue(5, 2);
  EXPECT_EQ(ints.getIntValue(0), 3);
  EXPECT_EQ(ints.getIntValue(1), 0);
  EXPECT_EQ(ints.getNumItems(), 2) << "setting outside an array sets nothing";
  texts.setValue("a", 0);
  texts.setValue(5, 1);
  EXPECT_STREQ(texts.getStringValue(0), "a");
  EXPECT_STREQ(texts.getStringValue(1), "");
  EXPECT_STREQ(texts.getStringValue(7), "");
  vectors.setValue(Vec3(1, 2, 3), 0);
  EXPECT_EQ(vectors.getVecValue(0), Vec3(1, 2, 3));
  EXPECT_EQ(vectors.getVecValue(1), Vec3());
  ints.setValue(ints.getArrayValue(0));
  EXPECT_EQ(ints.getType(), Variable::Int);
}

// Each value with what it becomes as a text, or as an array: what cannot be converted stays as it is.
TEST(Variable, ConvertsWhereNothingIsLost) {
  auto const of = [](auto given) {
    Variable value;
    value.setValue(given, -1);
    return value;
  };
  for (auto const& [value, text] : {std::pair{of(100'000'000), "100000000"},
                                    {of(-7), "-7"},
                                    {of(0.1), "0.1"},
                                    {of(Variable::Toggle), "toggle"},
                                    {of(static_cast<Variable::BoolType>(9)), "9"}}) {
    Variable converted = value;
    converted.convertToType(Variable::String);
    EXPECT_STREQ(converted.getStringValue(-1), text);
  }
  Variable array(Variable::IntArray, 2);
  array.setValue(4, 1);
  for (auto const& [from, to, becomes] : {std::tuple{of(3), Variable::Float, Variable::Float},
                                          {of(3.0), Variable::Int, Variable::Float},
                                          {of(Vec3()), Variable::Float, Variable::Vector},
                                          {of(Vec3()), Variable::String, Variable::Vector},
                                          {of(Vec3()), Variable::FloatArray, Variable::Vector},
                                          {array, Variable::FloatArray, Variable::FloatArray},
                                          {array, Variable::StringArray, Variable::StringArray},
                                          {array, Variable::VectorArray, Variable::IntArray}}) {
    Variable converted = from;
    converted.convertToType(to);
    EXPECT_EQ(converted.getType(), becomes);
    EXPECT_EQ(converted.getNumItems(), from.getNumItems());
  }
  array.convertToType(Variable::FloatArray);
  EXPECT_EQ(array.getFloatValue(1), 4.0);
  array.convertToType(Variable::StringArray);
  EXPECT_STREQ(array.getStringValue(1), "4");
}

TEST(ControlID, TextIsADecimalNumber) {
  ControlID const a(ControlID::CreateUnique), b(ControlID::CreateUnique);
  EXPECT_FALSE(a == b || a.isBlank());
  EXPECT_TRUE(ControlID(ControlID::CreateBlank).isBlank());
  std::wostringstream out;
  out << a;
  ControlID read;
  std::wistringstream(out.str()) >> read;
  EXPECT_EQ(read, a);
  for (wchar_t const* bad : {L"", L"x", L"-5", L"99999999999999999999999"}) {
    std::wistringstream in(bad);
    in >> read;
    EXPECT_EQ(read, a);
  }
  ControlID::reserveUpTo(b.getNumber() + 1000);
  EXPECT_GT(ControlID(ControlID::CreateUnique).getNumber(), b.getNumber() + 1000);
}

}  // namespace
