// Which arguments the commands accept, by the shape of their argument lists.
#include <gtest/gtest.h>
#include <set>
#include <sstream>

#include "tests/plugin/PluginLibrary.h"

namespace {

Arg const kVector = Vec3(1, 2, 3);
Arg const kStrings = Variable(Variable::StringArray, 2);

class ArgumentChecks : public testing::Test {
 protected:
  // All commands of a shape accept and refuse the same lists; each command belongs to one shape.
  void expectShape(std::string const& names, std::vector<ArgList> const& good,
                   std::vector<ArgList> const& bad) {
    std::istringstream words(names);
    for (std::string name; words >> name;) {
      EXPECT_TRUE(seen.insert(name).second) << name;
      for (size_t i = 0; i < good.size(); ++i)
        EXPECT_TRUE(accepts(commands[name], good[i])) << name << " " << i;
      for (size_t i = 0; i < bad.size(); ++i)
        EXPECT_FALSE(accepts(commands[name], bad[i])) << name << " " << i;
    }
  }

  PluginCommands commands;
  std::set<std::string> seen;
};

TEST_F(ArgumentChecks, KnowTheShapeOfEveryCommand) {
  expectShape(
      "collapse copyKeys createBoneVirts createKey cutKeys delete deleteCharacters duplicate "
      "findSelectedKeys "
      "getChannels getEditTool getModule getModules getNumModules getPriority getRate getSelectedTimeRanges "
      "getSolversFirst getTimeCodeOffset makeUnique pack parent pasteKeys reduceKeys setPriority "
      "testSceneReadPerformance unpack unparent getNamespace getNamespaces getRotationHardy getRotationHinge",
      {{}}, {{"a"}, {1}});
  expectShape(
      "exists getModuleType getParent getChildren isSelected getKeys getSelectedKeys getNumKeys getPosition "
      "getRotation getRotationAngleAxis getScale getConstraintOffset getLabelingClusterOffsets addNamespace "
      "removeNamespace getColor unsetProperty",
      {{"a"}, {""}}, {{}, {"a", "b"}, {1}, {kStrings}});
  expectShape(
      "getIntProperty getFloatProperty getProperty getStringProperty getVectorProperty "
      "getBooleanArrayProperty "
      "getIntArrayProperty getStringArrayProperty hasKey setInterpType replaceNamespace getMarkerConnection "
      "getMarkerConnectionColor setMarkerConnection transcodeVideo",
      {{"a", "b"}}, {{}, {"a"}, {"a", "b", "c"}, {"a", 1}, {1, "b"}});
  expectShape("setPosition setRotation setRotationAngleAxis setScale", {{"a", kVector}},
              {{"a"}, {"a", 1.0}, {"a", 1.0, 2.0, 3.0}, {kVector, "a"}, {"a", kVector, kVector}});
  expectShape("getProfileInt writeProfileInt", {{"s", "e", 5}},
              {{"s", "e"}, {"s", "e", "5"}, {"s", "e", 5.5}});
  expectShape("getProfileString writeProfileString", {{"s", "e", "v"}}, {{"s", "e"}, {"s", "e", 5}});
  expectShape("wait setEditTool setTimeCodeOffset", {{5}, {-1}}, {{}, {5.0}, {"5"}, {5, 5}});
  expectShape("create copyData", {{"a", "b"}, {"a", "b", "c", "d", "e", "f", "g", "h"}},
              {{}, {"a"}, {"a", 1}, {"a", "b", "c", "d", "e", "f", "g", 8}});
  expectShape("removeMarkerConnection", {{"a"}, {"a", "b", "c"}}, {{}, {1}, {"a", 1}});
  // The commands themselves say what is wrong with the number of arguments.
  expectShape("getDistance hide", {{}, {"a"}, {"a", "b"}, {"a", "b", "c"}}, {{1}, {"a", 1}, {kStrings}});
  expectShape("getBooleanProperty", {{"a", "b"}, {"a", "b", "c"}, {"a", "b", "c", "d"}},
              {{"a"}, {"a", 1}, {"a", "b", true}});
  expectShape("show", {{}, {"a"}, {kStrings, "a", kStrings}}, {{1}, {"a", kVector}});
  expectShape("getModuleRange", {{"a"}, {kStrings}},
              {{}, {"a", "b"}, {1}, {Variable(Variable::IntArray, 1)}});
  expectShape("getCount", {{1}, {"a"}, {kStrings}, {kVector}}, {{}, {kStrings, kStrings}});
  expectShape("setProperty", {{"p", 1}, {"p", "v"}, {"p", 1.0, 2.0, 3.0}, {"p", kVector}},
              {{}, {"p"}, {1, "p"}});
  expectShape("setKey", {{"p", 1}, {"p", kVector}, {"p", 1, 2, 3}}, {{"p"}, {1, 2}, {"p", 1, 2, 3, 4}});
  expectShape("resample", {{"ntsc", 30}, {"Custom", 59.5}},
              {{"ntsc"}, {"ntsc", "30"}, {30, "ntsc"}, {"ntsc", true}});
  expectShape("setSolversFirst", {{true}, {false}}, {{}, {1}, {"true"}, {true, true}});
  expectShape("setBoneLength", {{100}, {99.5}}, {{}, {"100"}, {1, 2}});
  expectShape("findPlaneCrossing", {{0, 0, 0, 0, 0, 1}, {0.5, 0, 0, 0.0, 1, 0}},
              {{}, {kVector, kVector}, {0, 0, 0, 0, 0}, {0, 0, 0, 0, 0, "1"}, {0, 0, 0, 0, 0, 0, 1}});
  expectShape("createLotsOfData", {{10, 100}}, {{10}, {10, 100.0}, {"10", "100"}});
  // A whole number is no joint angle.
  expectShape("setRotationHardy", {{0.5, 0.25}}, {{0.5}, {1, 2}, {0.5, 0.5, 0.5}});
  expectShape("setRotationHinge", {{0.5}}, {{}, {1}, {0.5, 0.5}});

  EXPECT_EQ(seen.size(), commands.inOrder().size());
}

}  // namespace
