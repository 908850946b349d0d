// The property getters on scenes that they read through the engine.
#include <map>
#include <set>

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

// For each getter the kinds of attribute by what it says about them: the rows and columns of one big table,
// turned around.
TEST_F(PropertyReaders, NameTheGetterToUseForOtherKinds) {
  static char const* const kinds[] = {"int",    "enum",     "float",    "string",      "multiString", "bool",
                                      "vector", "bitField", "rotation", "time",        "color",       "event",
                                      "module", "none",     "matrix",   "multiModule", "temperature"};
  Node* node = make("n");
  for (int kind = 0; kind < 17; ++kind) add(node, static_cast<Attribute::Type>(kind), kinds[kind], {"L"});

  using Groups = std::map<std::string, std::set<std::string>>;
  const auto groupsOf = [&](char const* getter) {
    Groups groups;
    for (char const* kind : kinds) {
      const std::string text = run(getter, {"n", kind});
      const bool refused = text.rfind("error: ", 0) == 0;
      if (refused) {
        EXPECT_EQ(text.substr(text.size() - 7), "\nfailed");
      }
      groups[refused ? text.substr(7, text.size() - 14) : "reads"].insert(kind);
    }
    return groups;
  };
  const auto use = [](std::string const& getter) { return "Use " + getter + " for this type of attribute"; };
  const std::string either = use("either getIntProperty or getStringProperty"),
                    unsupported = "Unsupported attribute type";

  EXPECT_EQ(groupsOf("getIntProperty"),
            (Groups{{"reads", {"int", "enum", "temperature", "time"}},
                    {use("getFloatProperty"), {"float"}},
                    {use("getStringProperty"), {"string", "multiString"}},
                    {use("getBooleanProperty"), {"bool"}},
                    {use("getVectorProperty"), {"vector", "rotation"}},
                    {use("getBooleanArrayProperty"), {"bitField"}},
                    {use("getIntArrayProperty"), {"color"}},
                    {unsupported, {"module", "event", "none", "matrix", "multiModule"}}}));
  EXPECT_EQ(groupsOf("getBooleanProperty"),
            (Groups{{"reads", {"bool"}},
                    {"Not enough arguments for getBooleanProperty command", {"bitField"}},
                    {use("getIntProperty"), {"int", "time"}},
                    {either, {"enum"}},
                    {use("getFloatProperty"), {"float"}},
                    {use("getStringProperty"), {"string", "multiString"}},
                    {use("getVectorProperty"), {"vector", "rotation"}},
                    {use("getIntArrayProperty"), {"color"}},
                    {unsupported, {"module", "event", "none", "matrix", "multiModule", "temperature"}}}));
  EXPECT_EQ(groupsOf("getStringProperty"),
            (Groups{{"reads", {"enum", "string", "multiString", "time", "module"}},
                    {use("getIntProperty"), {"int"}},
                    {use("getFloatProperty"), {"float"}},
                    {use("getBooleanProperty"), {"bool"}},
                    {use("getVectorProperty"), {"vector", "rotation"}},
                    {use("getBooleanArrayProperty"), {"bitField"}},
                    {use("getIntArrayProperty"), {"color"}},
                    {unsupported, {"event", "none", "matrix", "multiModule", "temperature"}}}));
  EXPECT_EQ(groupsOf("getBooleanArrayProperty"),
            (Groups{{"reads", {"bitField"}},
                    {use("getIntProperty"), {"int", "time"}},
                    {either, {"enum"}},
                    {use("getFloatProperty"), {"float"}},
                    {use("getStringProperty"), {"string", "multiString", "module"}},
                    {use("getBooleanProperty"), {"bool"}},
                    {use("getVectorProperty"), {"vector", "rotation"}},
                    {use("getIntArrayProperty"), {"color"}},
                    {unsupported, {"event", "none", "matrix", "multiModule", "temperature"}}}));
  EXPECT_EQ(groupsOf("getIntArrayProperty"),
            (Groups{{"reads", {"color"}},
                    {use("getIntProperty"), {"int", "time"}},
                    {either, {"enum"}},
                    {use("getFloatProperty"), {"float"}},
                    {use("getStringProperty"), {"string", "multiString", "module"}},
                    {use("getBooleanProperty"), {"bool"}},
                    {use("getVectorProperty"), {"vector", "rotation"}},
                    {use("getBooleanArrayProperty"), {"bitField"}},
                    {unsupported, {"event", "none", "matrix", "multiModule", "temperature"}}}));
  EXPECT_EQ(groupsOf("getStringArrayProperty"),
            (Groups{{"reads", {"multiModule"}},
                    {use("getIntProperty"), {"int", "temperature"}},
                    {use("getFloatProperty"), {"float"}},
                    {use("getStringProperty"), {"enum", "string", "multiString", "module", "time"}},
                    {use("getBooleanProperty"), {"bool"}},
                    {use("getVectorProperty"), {"vector", "rotation"}},
                    {use("getBooleanArrayProperty"), {"bitField"}},
                    {use("getIntArrayProperty"), {"color"}},
                    {unsupported, {"event", "none", "matrix"}}}));
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
