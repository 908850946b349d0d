// Transform commands on what scripts cannot make: sources and targets that are missing, bad numbers.
#include <limits>

#include "host/scene/Constraints.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"
#include "tests/plugin/SceneFixture.h"

namespace {

class TransformCommands : public SceneFixture {};

TEST_F(TransformCommands, OffsetsOfConstraintsAndClusters) {
  auto* bone = make<SolvingBone>("bone");
  auto* labeling = make<LabelingConstraint>("tie");
  EXPECT_TRUE(labeling->setConstraintOffset({7, 8, 9}));
  EXPECT_EQ(run("getConstraintOffset", {"tie"}), "<7 8 9>");
  auto* solving = make<SolvingConstraint>("tie", bone);
  EXPECT_TRUE(solving->setConstraintOffset({1, 2, 3}));
  EXPECT_EQ(run("getConstraintOffset", {"tie"}), "<1 2 3>") << "the solving one goes first";
  EXPECT_EQ(run("getConstraintOffset", {"tie"}, {{"ws"}}), "<1 2 3>");
  solving->setTarget(bone);
  make<Clip>("take");
  bone->setConstLocalPos({100, 0, 0});
  bone->setLocalPos(HTimeManager::getInstance()->getTime(5), {200, 0, 0});
  bone->setConstLocalScale({2, 2, 2});
  HTimeManager::getInstance()->setTime(HTimeManager::getInstance()->getTime(5), true);
  EXPECT_EQ(run("getConstraintOffset", {"tie"}, {{"ws"}}), "<202 4 6>");

  auto* cluster = make<LabelingCluster>("cluster", bone);
  EXPECT_EQ(run("getLabelingClusterOffsets", {"cluster"}), "[]");
  auto *a = make<Marker>("a"), *b = make<Marker>("b");
  TSimpleArray<Module*> markers;
  for (Module* module : {static_cast<Module*>(b), static_cast<Module*>(nullptr), static_cast<Module*>(a)})
    markers.add(module);
  static_cast<MultiModAttribute*>(cluster->getAttribute("Markers"))
      ->setValue(markers, true, true, true, true);
  a->setConstLocalPos({100, 0, 10});
  b->setConstLocalPos({104, 2, 0});
  a->setLocalPos(0, {5, 5, 5});
  EXPECT_EQ(run("getLabelingClusterOffsets", {"cluster"}), "[<2 1 0> <0 0 0> <0 0 5>]");
  const std::string refused =
      "error: a is not a valid path to a LabelingConstraint or SolvingConstraint in the scene\nfailed";
  EXPECT_EQ(run("getLabelingClusterOffsets", {"a"}), refused);
  EXPECT_EQ(run("getConstraintOffset", {"a"}), refused);
}

TEST_F(TransformCommands, NumbersThatAreNotFiniteChangeNothing) {
  constexpr double nan = std::numeric_limits<double>::quiet_NaN(), huge = 1.7e308;
  make<Clip>("take");
  auto* marker = make<Marker>("marker");
  auto* bone = make<LabelingBone>("bone");
  auto* child = make("child", bone);
  auto* grandchild = make("grandchild", child);
  child->setPreTranslation({0, 0, 10});
  grandchild->setPreTranslation({0, 0, 10});
  bone->setSelected(true);
  // A rotation vector of which only the length is too large is none either.
  for (Vec3 const& bad : {Vec3(0, nan, 0), Vec3(huge, huge, huge)})
    for (char const* name : {"setPosition", "setRotation", "setRotationAngleAxis", "setScale"})
      for (GivenOption const& option :
           {GivenOption{"ws"}, {name == std::string("setPosition") ? "default" : "def"}})
        EXPECT_EQ(run(name, {"marker", bad}, {option}),
                  "error: " + std::string(name) + " needs finite numbers.\nfailed");
  EXPECT_TRUE(marker->getDataRange().isEmpty());
  EXPECT_EQ(marker->getConstLocalPos(), Vec3());
  EXPECT_EQ(marker->getFillType(0), Marker::Recorded);
  EXPECT_EQ(run("setRotationHardy", {0.5, nan}), "error: setRotationHardy needs finite numbers.\nfailed");
  EXPECT_EQ(run("setRotationHinge", {nan}), "error: setRotationHinge needs finite numbers.\nfailed");
  EXPECT_EQ(run("setBoneLength", {nan}), "error: setBoneLength needs finite numbers.\nfailed");
  EXPECT_EQ(run("setBoneLength", {huge}, {{"relative"}, {"adjustChildren"}}),
            "error: setBoneLength needs finite numbers.\nfailed");
  EXPECT_EQ(child->getPreTranslation(), Vec3(0, 0, 10));
  EXPECT_EQ(grandchild->getPreTranslation(), Vec3(0, 0, 10));
}

// Another kind of property has the name of the fill type.
TEST_F(TransformCommands, AMarkerThatCannotHoldAFillTypeIsMovedAllTheSame) {
  make<Clip>("take");
  auto* marker = make<Marker>("marker");
  marker->addCustomAttribute(Attribute::create(Attribute::Integer, "FillType"));
  EXPECT_EQ(run("setPosition", {"marker", Vec3(1, 2, 3)}), "nothing");
  EXPECT_EQ(marker->getLocalPos(0), Vec3(1, 2, 3));
}

}  // namespace
