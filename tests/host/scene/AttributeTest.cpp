// Attributes of every kind.
#include <limits>

#include "host/scene/Devices.h"
#include "host/scene/Setups.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

constexpr double kNotANumber = std::numeric_limits<double>::quiet_NaN();

Attribute::Labels labels(std::vector<HString> texts) {
  return std::make_shared<std::vector<HString> const>(std::move(texts));
}

class AttributeTest : public SceneTest {
 protected:
  Node* m_node = create<Node>("node");

  template <class T>
  T* add(char const* name, Attribute::Type type, Attribute::Labels texts = nullptr) {
    return objectAs<T>(
        static_cast<HObject*>(m_node->addCustomAttribute(Attribute::create(type, name, std::move(texts)))));
  }
  template <class T>
  static T* attributeOf(Module* module, char const* name) {
    return objectAs<T>(static_cast<HObject*>(module->getAttribute(name)));
  }
};

TEST_F(AttributeTest, EveryKindCanBeAddedSetAndUnset) {
  for (int type = Attribute::Integer; type <= Attribute::Temperature; ++type) {
    HString const name("custom" + std::to_string(type));
    Attribute* attribute = m_node->addCustomAttribute(
        Attribute::create(static_cast<Attribute::Type>(type), name, labels({"one", "two"})));
    ASSERT_NE(attribute, nullptr);
    EXPECT_EQ(attribute->getType(), type);
    EXPECT_EQ(m_node->getAttribute(name.GetStr()), attribute);
    EXPECT_EQ(m_node->getAttribute(attribute->getID()), attribute);
    EXPECT_EQ(attribute->getModule(), m_node);
    EXPECT_TRUE(attribute->isCustom() && attribute->canBeUnset() && !attribute->isSet());
    Attribute::Value const before = attribute->getRawValue();
    attribute->store(before, true, true);
    EXPECT_TRUE(attribute->isSet());
    attribute->unset(true, true, true);
    EXPECT_TRUE(!attribute->isSet() && attribute->getRawValue() == before);
  }
}

TEST_F(AttributeTest, ValuesReadBackAndBadOnesAreRefused) {
  auto* number = add<IntAttribute>("i", Attribute::Integer);
  EXPECT_TRUE(number->setValue(-7, true, true, true, false));
  EXPECT_EQ(number->getValue(), -7);
  EXPECT_FALSE(number->isSet()) << "asked not to be marked";
  number->takeAsDefault();
  number->setValue(9, true, true, true, true);
  number->unset(true, true, true);
  EXPECT_EQ(number->getValue(), -7);

  auto* choice = add<EnumAttribute>("e", Attribute::Enumeration, labels({"low", "high"}));
  EXPECT_TRUE(choice->setValue("high", true, true, true, true));
  EXPECT_FALSE(choice->setIndex(2, true, true, true, true));
  EXPECT_FALSE(choice->setIndex(-1, true, true, true, true));
  EXPECT_TRUE(choice->getIndex() == 1 && choice->getEnumValue() == "high");
  EXPECT_TRUE(add<EnumAttribute>("none", Attribute::Enumeration)->getEnumValue().IsEmpty());

  auto* real = add<FloatAttribute>("f", Attribute::Float);
  EXPECT_TRUE(real->setValue(1e300, true, true, true, true));
  EXPECT_FALSE(real->setValue(kNotANumber, true, true, true, true));
  EXPECT_EQ(real->getValue(), 1e300);
  auto* vector = add<VectorAttribute>("v", Attribute::Vector);
  vector->setValue({1, 2, 3}, true, true, true, true);
  EXPECT_FALSE(vector->setValue({1, kNotANumber, 3}, true, true, true, true));
  EXPECT_EQ(vector->getValue(), Vec3(1, 2, 3));
  auto* matrix = add<MatrixAttribute>("m", Attribute::MatrixKind);
  Matrix values(2);
  values[1][0] = 5;
  matrix->setValue(values, true, true, true, true);
  values[0][1] = kNotANumber;
  EXPECT_FALSE(matrix->setValue(values, true, true, true, true));
  EXPECT_TRUE(matrix->getValue().rows() == 2 && matrix->getValue()[1][0] == 5 &&
              matrix->getValue()[0][1] == 0);
}

TEST_F(AttributeTest, TimesAreFramesAndTimecode) {
  HFrameRate rate;
  rate.setTimecodeStandard(NTSC_DROP);
  HTimeManager::getInstance()->setFrameRate(rate);
  auto* moment = add<TimeAttribute>("t", Attribute::Time);
  moment->setValue(HTimeManager::getInstance()->getTime(1800), true, true, true, true);
  EXPECT_EQ(moment->getValue(), 1800);
  EXPECT_EQ(moment->getStringValue(), "00:01:00;02");
  auto* length = objectAs<TimeAttribute>(static_cast<HObject*>(
      m_node->addCustomAttribute(std::make_unique<TimeAttribute>(moment->getTime(), true))));
  EXPECT_EQ(length, nullptr) << "an attribute without a name";
  TimeAttribute relative(moment->getTime(), true);
  EXPECT_EQ(relative.getStringValue(), "00:01:00:00");
  EXPECT_FALSE(moment->setValue(std::numeric_limits<int64>::min(), true, true, true, true));
  EXPECT_EQ(moment->getValue(), 1800);
}

TEST_F(AttributeTest, BuiltInOnes) {
  auto* bone = create<SolvingBone>("bone");
  EXPECT_EQ(bone->getNumDofs(), 3);
  EXPECT_EQ(bone->getMajorAxisIndex(), 0);
  attributeOf<EnumAttribute>(bone, "MajorAxis")->setValue("Z", true, true, true, true);
  EXPECT_EQ(bone->getMajorAxisIndex(), 2);
  EXPECT_EQ(m_node->getNumDofs(), 0);

  EXPECT_FALSE(m_node->getAttribute("RotationOrder")->canBeUnset());

  auto* camera = create<OpticalCamera>("camera");
  auto* focal = static_cast<FloatController*>(camera->getChannel("FocalLength"));
  focal->setConstValue(35, true);
  attributeOf<EventAttribute>(camera, "Reset")->doCallBack();
  EXPECT_EQ(focal->getConstValue(), 0);
}

TEST_F(AttributeTest, ParametersAreTheNumbersOfASetup) {
  auto* setup = create<SolvingSetup>("setup");
  EXPECT_EQ(setup->getNumParameters(), 0);
  setup->addCustomAttribute(Attribute::create(Attribute::String, "text"));
  setup->addCustomAttribute(Attribute::create(Attribute::Float, "gain"));
  setup->addCustomAttribute(Attribute::create(Attribute::Boolean, "on"));
  attributeOf<FloatAttribute>(setup, "gain")->setValue(0.5, true, true, true, true);
  ASSERT_EQ(setup->getNumParameters(), 2);
  EXPECT_EQ(setup->getParameter(0)->getValue(), 0.5);
  EXPECT_EQ(setup->getParameter("on")->getName(), "on");
  EXPECT_EQ(setup->getParameter("text"), nullptr);
  EXPECT_EQ(setup->getParameter(2), nullptr);
  EXPECT_EQ(setup->getParameter(-1), nullptr);
}

}  // namespace
