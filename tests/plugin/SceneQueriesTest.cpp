// Questions about scenes of several classes and of repeated names.
#include "host/scene/Devices.h"
#include "tests/plugin/SceneFixture.h"

namespace {

class SceneQueries : public SceneFixture {};

// \left\m, \right\m and, below the right one, \right\m\device, which is no node.
class TwoOfAName : public SceneQueries {
 protected:
  Node* left = make("left");
  Node* leftM = make("m", left);
  Node* right = make("right");
  Marker* rightM = make<Marker>("m", right);
  AnalogDevice* device = make<AnalogDevice>("device", rightM);
};

TEST_F(TwoOfAName, ListsPathsInTheFormAskedForLast) {
  EXPECT_EQ(run("getModules"), "[\"left\" \"left\\m\" \"right\" \"right\\m\" \"device\"]");
  EXPECT_EQ(run("getModules", {}, {{"fullPath"}, {"nameOnly"}}),
            "[\"left\" \"m\" \"right\" \"m\" \"device\"]");
  EXPECT_EQ(run("getModules", {}, {{"nameOnly"}, {"fullPath"}}),
            "[\"\\left\" \"\\left\\m\" \"\\right\" \"\\right\\m\" \"\\right\\m\\device\"]");
  rightM->setSelected(true);
  EXPECT_EQ(run("getModule"), "\"right\\m\"");
  EXPECT_EQ(run("getModule", {}, {{"nameOnly"}}), "\"m\"");
  EXPECT_EQ(run("getParent", {"device"}, {{"fullPath"}}), "\"\\right\\m\"");
  EXPECT_EQ(run("getParent", {"device"}, {{"fullPath"}, {"nameOnly"}}), "\"m\"");
  EXPECT_EQ(run("getChildren", {"left"}, {{"nameOnly"}, {"fullPath"}}), "[\"\\left\\m\"]");
}

TEST_F(TwoOfAName, TellsParentsAndChildren) {
  EXPECT_EQ(run("getParent", {"left"}), "nothing");
  EXPECT_EQ(run("getParent", {"device"}), "\"right\\m\"");
  make("late", right);
  make("later", rightM);
  EXPECT_EQ(run("getChildren", {"right"}), "[\"right\\m\" \"late\"]");
  EXPECT_EQ(run("getChildren", {"right\\m"}), "[\"device\" \"later\"]");
  EXPECT_EQ(run("getChildren", {"right\\m"}, {{"nodesOnly"}}), "[\"later\"]");
  EXPECT_EQ(run("getChildren", {"device"}), "[]");
}

TEST_F(TwoOfAName, FailsForPathsThatNameNoneOrSeveral) {
  for (std::string path : {"m", "nope", "\\m"}) {
    const std::string one =
        "error: " + path + " is not a valid unique path to a Module in the scene.\nfailed";
    const std::string two =
        "error: " + path + "  is not a valid unique path to a Module in the scene.\nfailed";
    EXPECT_EQ(run("getParent", {path.c_str()}), one);
    EXPECT_EQ(run("isSelected", {path.c_str()}), one);
    EXPECT_EQ(run("getChildren", {path.c_str()}), two);
    EXPECT_EQ(run("getModuleType", {path.c_str()}), two);
    EXPECT_EQ(run("exists", {path.c_str()}), "false");
  }
}

TEST_F(TwoOfAName, ExistsByTypeAndPriority) {
  EXPECT_EQ(run("exists", {"left\\m"}), "true");
  EXPECT_EQ(run("exists", {"m"}, {{"type", {"Marker"}}}), "true");  // one marker among two of that name
  EXPECT_EQ(run("exists", {"m"}, {{"type", {"Node"}}}), "false");   // both are nodes
  EXPECT_EQ(run("exists", {"device"}, {{"type", {"Module"}}}), "true");
  EXPECT_EQ(run("exists", {"device"}, {{"type", {"Node"}}}), "false");
  EXPECT_EQ(run("exists", {"device"}, {{"type", {"Controller"}}}), "false");  // a class, though of no module
  EXPECT_EQ(run("exists", {"device"}, {{"type", {"marker"}}}), "error: marker is not a Module type\nfailed");

  EXPECT_EQ(run("exists", {"left"}, {{"priorityOnly"}}), "true");
  right->setSelected(true);
  EXPECT_EQ(run("setPriority"), "info: \"right\" set as priority module\nnothing");
  EXPECT_EQ(run("getPriority"), "\"right\"");
  EXPECT_EQ(run("exists", {"left"}), "true");
  EXPECT_EQ(run("exists", {"left"}, {{"priorityOnly"}}), "false");
  EXPECT_EQ(run("exists", {"m"}), "true");
  EXPECT_EQ(run("getModuleType", {"m"}), "\"Marker\"");
  right->setSelected(false);
  EXPECT_EQ(run("setPriority"), "info: Priority search module reset\nnothing");
  EXPECT_EQ(run("getPriority"), "\"\"");
  EXPECT_EQ(run("exists", {"m"}), "false");
}

TEST_F(SceneQueries, ListExactlyATypeButCountItsSubtypesToo) {
  make("node");
  make<Marker>("marker");
  make<Character>("character")->setSelected(true);
  make<AnalogDevice>("device")->setSelected(true);
  EXPECT_EQ(run("getModules", {}, {{"type", {"Node"}}}), "[\"node\"]");
  EXPECT_EQ(run("getNumModules", {}, {{"type", {"Node"}}}), "3");
  EXPECT_EQ(run("getNumModules", {}, {{"type", {"Node"}}, {"selected"}}), "1");
  EXPECT_EQ(run("getNumModules"), "4");
  EXPECT_EQ(run("getModules", {}, {{"type", {"Module"}}}), "[]");  // abstract: nothing is exactly that
  EXPECT_EQ(run("getNumModules", {}, {{"type", {"Marker"}}, {"type", {"Module"}}}), "4");  // the last decides

  for (char const* type : {"node", "Controller", ""}) {
    const std::string message = std::string("error: \"") + type + "\" is not a Module type name\nfailed";
    EXPECT_EQ(run("getModules", {}, {{"type", {type}}}), message);
    EXPECT_EQ(run("getNumModules", {}, {{"type", {type}}}), message);
  }
  EXPECT_EQ(run("getModuleType", {"device"}), "\"AnalogDevice\"");
}

}  // namespace
