#include <gmock/gmock.h>

#include "host/keys/KeyReduction.h"
#include "host/scene/Bones.h"
#include "host/scene/Character.h"
#include "host/scene/Devices.h"
#include "tests/io/TakeTesting.h"
#include "tests/io/scene/SceneTesting.h"

namespace talix {

namespace {

class TakeExportTest : public SceneTest {
 protected:
  int64 at100(int64 frame) const { return frame * ticksPerFrameAt(100); }
  // A blank for each of the frames 1 to 5 without a position.
  std::string seen(KeyTrack const& track) const {
    std::string text;
    for (int64 frame = 1; frame <= 5; ++frame) text += track.find(at100(frame)) >= 0 ? 'x' : ' ';
    return text;
  }
  KeyTrack onlyPoint() {
    Take const take = save();
    EXPECT_EQ(take.points.size(), 1u);
    return take.points.at(0).positions;
  }
};

TEST_F(TakeExportTest, LayersAndPartialKeysAreEvaluated) {
  Take take = smallTake("walk");
  addPoint(take, "Bob", "M", {0, 0, 0}, "xx xx");
  open(take);
  Vec3Controller* channel = at<Marker>("\\Bob\\M")->getTranslationChannel();
  g_db->getActiveClip()->addLayer();
  KeyTrack raised(KeyTrack::Shape::Vector);
  raised.set(at100(3), {0, 0, 7});
  channel->setTrack(g_db->getActiveClip(), 1, raised);
  KeyTrack const made = onlyPoint();
  EXPECT_EQ(seen(made), "xx xx");
  EXPECT_EQ(Vec3(made.at(3).values.data()), Vec3(4, 0, 7));

  channel->setTrack(g_db->getActiveClip(), 1, KeyTrack(KeyTrack::Shape::Vector));
  channel->deleteKey(at100(2), 1);  // x comes from its neighbours
  EXPECT_EQ(onlyPoint().at(1).components, KeyTrack::kAll);
}

TEST_F(TakeExportTest, FramesAreThoseOfTheFileAndOfKeysBeyond) {
  Take take = smallTake("walk");
  addPoint(take, "Bob", "M", {0, 0, 0});
  open(take);
  KeyTrack track = *at<Marker>("\\Bob\\M")->getTranslationChannel()->findTrack(g_db->getActiveClip(), 0);
  track.set(at100(2) + 5, {});
  track.set(at100(9), {});
  at<Marker>("\\Bob\\M")->getTranslationChannel()->setTrack(g_db->getActiveClip(), 0, track);
  Take made = save();
  EXPECT_EQ(made.frameCount, 9);
  EXPECT_EQ(made.points[0].positions.count(), 6);
  EXPECT_TRUE(warned("1 key between or outside them was left out"));
  HTimeManager::getInstance()->setAnimRange(HTimeRange(at100(2), at100(4)), true);
  made = save();
  EXPECT_EQ(made.firstFrame, 2);
  EXPECT_EQ(made.frameCount, 3);
  EXPECT_TRUE(warned("the animation range leaves out 6 of the clip's 9 frames"));
}

// A second take at another rate has data at all times between its samples, and is saved as it was read.
TEST_F(TakeExportTest, AClipKeepsItsOwnFrames) {
  Take first = smallTake("first", 20), second = smallTake("second", 6, 3);
  addPoint(first, "Ann", "M", {});
  second.rate = 50;
  second.analogRate = 200;
  addPoint(second, "Bob", "M", {}, "xx  xx");
  addPoint(second, "Bob", "never seen", {}, "      ");
  TakeAnalogChannel& analog = second.analog.emplace_back();
  analog.name = "emg";
  for (int i = 0; i < 24; ++i)
    analog.samples.set(3 * ticksPerFrameAt(50) + i * ticksPerFrameAt(200), {i % 5 / 1.0});
  open(first);
  open(second);
  EXPECT_EQ(differenceOf(second, save()), "");
  auto const* marker = at<Marker>("\\Bob\\M");
  for (int const frame : {5, 6, 7, 8, 9, 13, 14, 15, 16, 17}) {
    bool const isSeen = (frame >= 6 && frame <= 8) || (frame >= 14 && frame <= 16);
    EXPECT_EQ(!marker->getOccludedChannel()->getValue(at100(frame)), isSeen) << frame;
  }

  g_db->getActiveClip()->setSelected(true);
  g_db->duplicateSelectedObjects();
  g_db->setActiveClip(objectAs<NLEClip>(g_db->getSelectedModule(0)));
  EXPECT_EQ(differenceOf(second, save()), "");

  // Thinned, its samples come back.
  auto* channel = at<AnalogDevice>("\\Analog")->getChannel("emg");
  HTimeRange const all[] = {HTimeRange::forever()};
  EXPECT_EQ(channel->reduceKeys(all, {.length = 0, .angle = 0, .ofRange = 1e-9}), 14);
  KeyTrack const samples = save().analog.at(0).samples;
  ASSERT_EQ(samples.count(), 24);
  for (int64 i = 0; i < 24; ++i) EXPECT_NEAR(samples.at(i).values[0], static_cast<double>(i % 5), 1e-9);
}

TEST_F(TakeExportTest, OnlyWhatBelongsToTheActiveClipGoesOut) {
  Take first = smallTake("one"), second = smallTake("two");
  addPoint(first, "Ann", "M", {});
  addPoint(second, "Bob", "M", {});
  addPoint(second, "Bob", "never seen", {}, "     ");
  open(first);
  open(second);
  Take const made = save();
  EXPECT_EQ(differenceOf(second, made), "");
  g_db->setActiveClip(g_db->getHeadClip());
  EXPECT_EQ(differenceOf(first, save()), "");
}

TEST_F(TakeExportTest, WithoutAClipDefaultValuesLastThroughTheRange) {
  auto* bob = g_db->createModule(&Character::staticClass(), "Bob", nullptr);
  static_cast<Node*>(g_db->createModule(&Marker::staticClass(), "M", bob))->setConstLocalPos({1, 2, 3});
  HTimeManager::getInstance()->setAnimRange(HTimeRange(0, 4 * ticksPerFrameAt(120)), true);
  Take const take = save();
  EXPECT_EQ(take.frameCount, 5);
  ASSERT_EQ(take.points.size(), 1u);
  EXPECT_EQ(take.points[0].subject, "Bob");
  EXPECT_EQ(take.points[0].positions.count(), 5);
  EXPECT_EQ(take.points[0].positions.at(4).values[2], 3);
}

TEST_F(TakeExportTest, SubjectsAndLabelsFollowTheNamesInTheScene) {
  Take take = smallTake("walk");
  addPoint(take, "", "A", {});
  addPoint(take, "", "", {});
  open(take);
  at<Marker>("\\unlabeled")->setName("Wand");
  EXPECT_EQ(save().points[0].subject, "");
  EXPECT_EQ(save().points[1].label, "Wand");
  at<Character>("\\walk")->setName("Bob");
  EXPECT_EQ(save().points[0].subject, "Bob");
}

TEST_F(TakeExportTest, MarkersBelowMovingBonesAreInTheWorld) {
  openFile("two_frames_01.bvh");
  auto* head = at<SolvingBone>("\\two_frames_01\\Hips\\Chest\\Neck\\Head");
  auto* marker = static_cast<Marker*>(g_db->createModule(&Marker::staticClass(), "Top", head));
  marker->setLocalPos(0, {0, 100, 0});
  Take const made = save();
  ASSERT_EQ(made.points.size(), 1u);
  Vec3 const world = marker->getWSPos(0);
  EXPECT_LT((Vec3(made.points[0].positions.at(0).values.data()) - world).length(), 1e-9);
  EXPECT_GT((world - Vec3(0, 100, 0)).length(), 1);
}

TEST_F(TakeExportTest, ChangedBonesGetTheChannelsThatTheyNeed) {
  openFile("two_frames_01.bvh");
  auto* chest = at<SolvingBone>("\\two_frames_01\\Hips\\Chest");
  size_t const index = 1;
  EXPECT_EQ(save().joints[index].channels.size(), 3u);
  Vec3 const offset = chest->getPreTranslation();
  chest->setLocalPos(0, {1, 0, 0});
  Take const moved = save();
  EXPECT_TRUE(moved.joints[index].channels.empty());
  EXPECT_EQ(moved.joints[index].translations.count(), moved.frameCount);
  EXPECT_EQ(Vec3(moved.joints[index].translations.at(1).values.data()), offset + Vec3(1, 0, 0));

  // A turn before the bone's own shows in its orientation.
  chest->setPreRotation(TalixRotation(Vec3(0.5, 0, 0)), false);
  EXPECT_FALSE(moved.joints[index].rotations == save().joints[index].rotations);
  chest->setConstLocalScale({2, 2, 2});
  save();
  EXPECT_TRUE(warned("takes hold no scale of joints; that of 1 joint was left out"));
}

}  // namespace

}  // namespace talix
