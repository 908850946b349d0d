// The property getters on scenes that they read through the engine.
#include <array>

#include "host/scene/Devices.h"
#include "tests/plugin/SceneFixture.h"

namespace {

class PropertyReaders : public SceneFixture {
 protected:
  template <class T = Attribute>
  T* add(Module* module, Attribute::Type type, char const* name, std::vector<HString> labels = {}) {
    auto shared = std::make_shared<std::vector<HString> const>(std::move(labels));
    return static_cast<T*>(module->addCustomAttribute(Attribute::create(type, name, shared)));
  }
};

// Each kind of attribute with what the getters say of it: that they read it, or which one to use instead.
TEST_F(PropertyReaders, NameTheGetterToUseForOtherKinds) {
  static char const* const getters[] = {"Int",          "Boolean",  "String",
                                        "BooleanArray", "IntArray", "StringArray"};
  struct Kind {
    char const* name;
    std::array<std::string, 6> said;
  };
  std::string const get = "reads", either = "either", no = "-";
  std::string const Int = "Int", Bool = "Boolean", Text = "String", Bits = "BooleanArray", Ints = "IntArray";
  std::string const Float = "Float", Vector = "Vector";
  Kind const kinds[] = {{"int", {get, Int, Int, Int, Int, Int}},
                        {"enum", {get, either, get, either, either, Text}},
                        {"float", {Float, Float, Float, Float, Float, Float}},
                        {"string", {Text, Text, get, Text, Text, Text}},
                        {"multiString", {Text, Text, get, Text, Text, Text}},
                        {"bool", {Bool, get, Bool, Bool, Bool, Bool}},
                        {"vector", {Vector, Vector, Vector, Vector, Vector, Vector}},
                        {"bitField", {Bits, "a label", Bits, get, Bits, Bits}},
                        {"turn", {Vector, Vector, Vector, Vector, Vector, Vector}},
                        {"time", {get, Int, get, Int, Int, Text}},
                        {"color", {Ints, Ints, Ints, Ints, get, Ints}},
                        {"event", {no, no, no, no, no, no}},
                        {"module", {no, no, get, Text, Text, Text}},
                        {"none", {no, no, no, no, no, no}},
                        {"matrix", {no, no, no, no, no, no}},
                        {"multiModule", {no, no, no, no, no, get}},
                        {"temperature", {get, no, no, no, no, Int}}};
  auto const messageOf = [&](std::string const& said) -> std::string {
    if (said == no) return "Unsupported attribute type";
    if (said == "a label") return "Not enough arguments for getBooleanProperty command";
    std::string const use = said == either ? "either getIntProperty or getString" : "get" + said;
    return "Use " + use + "Property for this type of attribute";
  };
  Node* node = make("n");
  for (size_t i = 0; i < std::size(kinds); ++i)
    add(node, static_cast<Attribute::Type>(i), kinds[i].name, {"L"});
  for (Kind const& kind : kinds)
    for (size_t i = 0; i < std::size(getters); ++i) {
      std::string const getter = std::string("get") + getters[i] + "Property";
      std::string const said = run(getter.c_str(), {"n", kind.name});
      if (kind.said[i] == get) {
        EXPECT_EQ(said.find("error"), std::string::npos) << getter << " " << kind.name;
      } else {
        EXPECT_EQ(said, "error: " + messageOf(kind.said[i]) + "\nfailed") << getter << " " << kind.name;
      }
    }
  // The vector getter says the same of every kind that it does not read.
  EXPECT_EQ(run("getVectorProperty", {"n", "vector"}), "<0 0 0>");
  EXPECT_EQ(run("getVectorProperty", {"n", "float"}), "error: Unknown property: float\nfailed");
}

TEST_F(PropertyReaders, AnswerRotationsInDegreesInTheNodesOwnOrder) {
  Node* node = make("n");
  auto* attribute = add<RotationAttribute>(node, Attribute::Rotation, "Turn");
  constexpr double kRadians = 0.017453292519943295;
  TalixRotation rotation;
  rotation.setAsEuler(TalixRotation::ZYX, Vec3(10, 40, 70) * kRadians);
  node->getRotationChannel()->setConstValue(rotation, true);
  attribute->setValue(rotation, true, true, true, true);
  node->setRotationOrder(TalixRotation::ZYX);
  EXPECT_EQ(run("getVectorProperty", {"n", "Rotation"}), "<10 40 70>");
  EXPECT_EQ(run("getVectorProperty", {"n", "Turn"}), "<10 40 70>");
  node->setRotationOrder(TalixRotation::XYZ);
  EXPECT_NE(run("getVectorProperty", {"n", "Rotation"}), "<10 40 70>");

  // A module that is no node counts in order 0.
  rotation.setAsEuler(TalixRotation::XYZ, Vec3(10, 40, 70) * kRadians);
  auto* device = make<AnalogDevice>("device");
  add<RotationAttribute>(device, Attribute::Rotation, "Turn")->setValue(rotation, true, true, true, true);
  EXPECT_EQ(run("getVectorProperty", {"device", "Turn"}), "<10 40 70>");
}

}  // namespace
