// Transform commands on what scripts cannot make: sources and targets that are missing, bad numbers.
#include <limits>

#include "host/scene/Constraints.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"
#include "tests/plugin/SceneFixture.h"

namespace {

class TransformCommands : public SceneFixture {};

TEST_F(TransformCommands, OffsetsAreThoseOfTheTimeAndOfMissingMarkersNone) {
  auto* bone = make<SolvingBone>("bone");
  auto* constraint = make<SolvingConstraint>("tie", bone);
  EXPECT_TRUE(constraint->setConstraintOffset({1, 2, 3}));
  constraint->setTarget(bone);
  make<Clip>("take");
  int64 const time = HTimeManager::getInstance()->getTime(5);
  HTimeManager::getInstance()->setTime(time, true);
  bone->setLocalPos(time, {200, 0, 0});
  bone->setConstLocalScale({2, 2, 2});
  EXPECT_EQ(run("getConstraintOffset", {"tie"}, {{"ws"}}), "<202 4 6>");
  auto* cluster = make<LabelingCluster>("cluster");
  TSimpleArray<Module*> markers;
  for (Module* module : {make<Marker>("a"), static_cast<Marker*>(nullptr)}) markers.add(module);
  static_cast<MultiModAttribute*>(cluster->getAttribute("Markers"))
      ->setValue(markers, true, true, true, true);
  EXPECT_EQ(run("getLabelingClusterOffsets", {"cluster"}), "[<0 0 0> <0 0 0>]");
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

}  // namespace
