#include <gmock/gmock.h>

#include "host/scene/Bones.h"
#include "host/scene/Character.h"
#include "host/scene/Devices.h"
#include "host/scene/PropertyTable.h"
#include "io/scene/UpAxisConversion.h"
#include "tests/io/TakeTesting.h"
#include "tests/io/scene/SceneTesting.h"

namespace talix {

namespace {

using testing::HasSubstr;
using testing::Not;

class TakeImportTest : public SceneTest {
 protected:
  // The marker's keys in the active clip.
  KeyTrack const& keysOf(std::string const& path) {
    return *at<Marker>(path)->getTranslationChannel()->findTrack(g_db->getActiveClip(), 0);
  }
  int clips() const { return g_db->getNumClips(); }
};

Vec3 firstPosition(KeyTrack const& track) { return Vec3(track.at(0).values.data()); }

MATCHER_P3(Near, x, y, z, "") { return (arg - Vec3(x, y, z)).length() < 1e-9; }

// Hips with a leg that ends; each joint of both turns, the hips move too.
Take skeletonTake(std::string const& name) {
  Take take = smallTake(name, 2, 0);
  take.format = "BVH";
  take.up = Axis::Y;
  take.joints.resize(3);
  char const* names[] = {"Hips", "Leg", "Leg_end"};
  int64 const period = ticksPerFrameAt(take.rate);
  for (int i = 0; i < 3; ++i) {
    TakeJoint& joint = take.joints[static_cast<size_t>(i)];
    joint.name = names[i];
    joint.parent = i - 1;
    joint.offset = {0, i == 0 ? 900.0 : -400.0, 10};
    joint.endSite = i == 2;
    if (joint.endSite) continue;
    joint.channels = {"Zrotation", "Yrotation", "Xrotation"};
  }
  TakeJoint& hips = take.joints[0];
  hips.channels.insert(hips.channels.begin(), {"Xposition", "Yposition", "Zposition"});
  for (int64 frame = 0; frame < 2; ++frame) {
    KeyTrack::Values turn{};
    TalixRotation(Vec3(0, 0.1, 0.2 * static_cast<double>(frame + 1))).getQuaternion(turn.data());
    take.joints[0].rotations.set(frame * period, turn);
    take.joints[1].rotations.set(frame * period, turn);
    hips.translations.set(frame * period, {5, 950 + static_cast<double>(frame), 10});
  }
  return take;
}

TEST_F(TakeImportTest, PointsGoBelowTheirSubjectTheFileOrToTheRoot) {
  Take take = smallTake("walk");
  addPoint(take, "Bob", "LFHD", {1, 2, 3});
  addPoint(take, "", "LFHD", {4, 5, 6});
  addPoint(take, "", "", {7, 8, 9});
  addPoint(take, "", "", {7, 8, 9});
  addPoint(take, "Bob", "a\\b", {0, 0, 0});
  open(take);
  EXPECT_EQ(firstPosition(keysOf("\\Bob\\LFHD")), Vec3(1, 2, 3));
  EXPECT_EQ(firstPosition(keysOf("\\walk\\LFHD")), Vec3(4, 5, 6));
  EXPECT_TRUE(at<Marker>("\\unlabeled")->isUnlabeled());
  EXPECT_TRUE(has("\\unlabeled_1"));
  EXPECT_TRUE(has("\\Bob\\a_b"));
  EXPECT_THAT(notes(), HasSubstr("info: walk.c3d: 2 points without a label became markers at the root"));
  EXPECT_THAT(notes(), HasSubstr("held a backslash"));
  // The clip has the suffix as well, so that the path of the file's character names that alone.
  EXPECT_EQ(g_db->getActiveClip()->getName(), "walk.c3d");
  at<Character>("\\walk");
}

TEST_F(TakeImportTest, LaterTakesGiveTheirMotionToWhatIsThere) {
  Take first = smallTake("one"), second = smallTake("two", 3, 10);
  addPoint(first, "Bob", "LFHD", {1, 0, 0});
  addPoint(first, "Bob", "RFHD", {2, 0, 0});
  addPoint(second, "Bob", "LFHD", {3, 0, 0});
  addPoint(second, "Bob", "", {4, 0, 0});
  open(first);
  // Something else of that name is no marker.
  g_db->createModule(&Node::staticClass(), "CLAV", at<Character>("\\Bob"));
  addPoint(second, "Bob", "CLAV", {5, 0, 0});
  open(second);

  EXPECT_EQ(clips(), 2);
  EXPECT_EQ(g_db->getActiveClip()->getName(), "two.c3d");
  EXPECT_EQ(g_db->getMarkers().getCount(), 4);
  EXPECT_EQ(firstPosition(keysOf("\\Bob\\LFHD")), Vec3(3, 0, 0));
  EXPECT_EQ(firstPosition(keysOf("\\Bob\\CLAV")), Vec3(5, 0, 0));
  Controller const& channel = *at<Marker>("\\Bob\\LFHD")->getTranslationChannel();
  EXPECT_EQ(firstPosition(*channel.findTrack(g_db->getHeadClip(), 0)), Vec3(1, 0, 0));
  EXPECT_FALSE(at<Marker>("\\Bob\\RFHD")->getTranslationChannel()->hasKeysInClip(g_db->getActiveClip()));
}

TEST_F(TakeImportTest, RepeatedNamesStayAndAreMatchedOneByOne) {
  Take take = smallTake("walk");
  addPoint(take, "Bob", "X", {1, 0, 0});
  addPoint(take, "Bob", "X", {2, 0, 0});
  open(take);
  EXPECT_THAT(notes(), HasSubstr("the name \"\\Bob\\X\" stands more than once"));
  open(take);
  EXPECT_EQ(g_db->getMarkers().getCount(), 2);
  for (int i = 0; i < 2; ++i) {
    Marker* marker = g_db->getMarkers()[i];
    EXPECT_EQ(marker->getName(), "X");
    EXPECT_EQ(marker->getTranslationChannel()->getKeyValue(0).x, i + 1);
  }
}

TEST_F(TakeImportTest, TheFirstTakeSetsTheTimeLaterOnesKeepTheirs) {
  Take first = smallTake("one", 5, 3), second = smallTake("two", 9, 1);
  first.rate = 25;
  addPoint(first, "A", "M", {});
  addPoint(second, "A", "M", {});
  open(first);
  HTimeManager const& time = *HTimeManager::getInstance();
  int64 const period = ticksPerFrameAt(25);
  EXPECT_EQ(time.getFrameRate().getTimecodeStandard(), PAL);
  EXPECT_EQ(time.getAnimRange(), HTimeRange(3 * period, 7 * period));
  EXPECT_EQ(time.getPlayRange(), time.getAnimRange());
  open(second);
  EXPECT_EQ(time.getFrameRate().getFrameRate(), 25);
  EXPECT_EQ(time.getAnimRange(), HTimeRange(3 * period, 7 * period));
  EXPECT_EQ(keysOf("\\A\\M").timeAt(0), ticksPerFrameAt(100));
  EXPECT_THAT(notes(), HasSubstr("two.c3d: the take has 100 frames a second, the scene 25"));
}

TEST_F(TakeImportTest, OtherUpAxesAreTurnedToTheScenes) {
  Take zUp = smallTake("one"), yUp = smallTake("two");
  yUp.up = Axis::Y;
  for (Take* take : {&zUp, &yUp}) addPoint(*take, take->name, "M", {1, 2, 3});
  open(zUp);
  EXPECT_EQ(g_db->getUpAxis(), 2);
  EXPECT_THAT(notes(), Not(HasSubstr("turned")));
  EXPECT_EQ(firstPosition(keysOf("\\one\\M")), Vec3(1, 2, 3));
  open(yUp);
  EXPECT_EQ(firstPosition(keysOf("\\two\\M")), Vec3(1, -3, 2));
  EXPECT_THAT(notes(), HasSubstr("two.c3d: turned from y up to the scene's z up"));
  open(yUp, 1);
  EXPECT_TRUE(warned("what the scene held before was not turned"));
  EXPECT_EQ(firstPosition(keysOf("\\two\\M")), Vec3(1, 2, 3));
}

TEST(UpAxisConversion, AllTurnsAreProperAndAgreeWithTheirRotation) {
  Vec3 const units[] = {{1, 0, 0}, {0, 1, 0}, {0, 0, 1}};
  for (int from = 0; from < 3; ++from)
    for (int to = 0; to < 3; ++to) {
      UpAxisConversion const turn(from, to);
      EXPECT_EQ(turn(units[from]), units[to]);
      EXPECT_EQ(turn(units[0]).cross(turn(units[1])), turn(units[2]));
      Vec3 const v(1, 2, 3);
      EXPECT_LT((turn.rotation().rotate(v) - turn(v)).length(), 1e-12);
    }
}

TEST_F(TakeImportTest, MarkersBelowAMovedSubjectKeepTheirPlaceInTheWorld) {
  auto* bob = static_cast<Character*>(g_db->createModule(&Character::staticClass(), "Bob", nullptr));
  bob->setConstLocalPos({10, 20, 30});
  bob->setPreRotation(TalixRotation(Vec3(0, 0, 1)), false);
  bob->setConstLocalScale({2, 2, 2});
  Take take = smallTake("walk");
  addPoint(take, "Bob", "LFHD", {1, 2, 3});
  open(take);
  int64 const third = 3 * ticksPerFrameAt(100);
  EXPECT_THAT(at<Marker>("\\Bob\\LFHD")->getWSPos(third), Near(3.0, 2.0, 3.0));
  EXPECT_THAT(Vec3(save().points[0].positions.at(2).values.data()), Near(3.0, 2.0, 3.0));
}

TEST_F(TakeImportTest, JointsBecomeBonesWithTheOffsetAsPreTranslation) {
  open(skeletonTake("walk"));
  auto* hips = at<SolvingBone>("\\walk\\Hips");
  EXPECT_EQ(hips->getPreTranslation(), Vec3(0, 900, 10));
  EXPECT_THAT(hips->getLocalPos(0), Near(5.0, 50.0, 0.0));
  EXPECT_THAT(hips->getWSPos(0), Near(5.0, 950.0, 10.0));
  EXPECT_EQ(hips->getNumDofs(), 6);
  auto* leg = at<SolvingBone>("\\walk\\Hips\\Leg");
  EXPECT_EQ(leg->getNumDofs(), 3);
  EXPECT_FALSE(leg->getDofs()->getField("Tx"));
  EXPECT_FALSE(leg->getTranslationChannel()->hasKeysInClip(g_db->getActiveClip()));
  EXPECT_EQ(at<Node>("\\walk\\Hips\\Leg\\Leg_end")->getRuntimeClass(), &Node::staticClass());
}

TEST_F(TakeImportTest, TurnedSkeletonsMoveAsTheirFileTurned) {
  open(skeletonTake("walk"));
  int64 const time = ticksPerFrameAt(100);
  Node const* end = at<Node>("\\walk\\Hips\\Leg\\Leg_end");
  Vec3 const inFile = end->getWSPos(time);
  g_db->newScene();
  open(skeletonTake("walk"), 2);
  Vec3 const turned = UpAxisConversion(1, 2)(inFile);
  EXPECT_THAT(at<Node>("\\walk\\Hips\\Leg\\Leg_end")->getWSPos(time), Near(turned.x, turned.y, turned.z));
  // The keys are the file's.
  EXPECT_EQ(at<SolvingBone>("\\walk\\Hips")->getLocalPos(0), Vec3(5, 50, 0));

  // A take of the same skeleton that needs no turn moves the turned bones to where its file says.
  Take upright = skeletonTake("walk");
  upright.up = Axis::Z;
  open(upright);
  EXPECT_TRUE(warned("the offset of \"Hips\" differs from the scene's"));
  EXPECT_THAT(at<Node>("\\walk\\Hips\\Leg\\Leg_end")->getWSPos(time), Near(inFile.x, inFile.y, inFile.z));
}

TEST_F(TakeImportTest, ChannelsOfDevicesGetNamesThatCanStand) {
  Take take = smallTake("walk");
  take.analogRate = 100;
  for (char const* name : {"Force.Fx", "Translation", "Force.Fx", "Name", ""}) {
    TakeAnalogChannel& channel = take.analog.emplace_back();
    channel.name = name;
    channel.unit = "N";
    channel.samples.set(ticksPerFrameAt(100), {1});
  }
  ModelOutput& output = take.outputs.emplace_back();
  output.name = "Force_Fx";
  output.values.set(ticksPerFrameAt(100), {1, 2, 3});
  open(take);
  auto const* analog = at<AnalogDevice>("\\Analog");
  // The vector came first and has the name everywhere.
  EXPECT_EQ(at<AnalogDevice>("\\Outputs")->getChannel("Force_Fx")->getPropertyType(),
            DataSource::Vec3Property);
  for (char const* name : {"Force_Fx_1", "Force_Fx_2", "Translation_1", "Name_1", "channel"})
    EXPECT_NE(analog->getChannel(name), nullptr) << name;
  EXPECT_THAT(notes(), HasSubstr("the channel \"Translation\" of Analog became \"Translation_1\""));
  EXPECT_EQ(differenceOf(take, save()), "");
}

TEST_F(TakeImportTest, ATakeThatCannotComeInLeavesTheSceneAsItWas) {
  for (int i = 0; i < NLEClip::kMaximum; ++i) g_db->createModule(&Clip::staticClass(), "clip", nullptr);
  Take take = smallTake("walk");
  addPoint(take, "Bob", "LFHD", {});
  EXPECT_THAT(errorOf([&] { open(take); }), HasSubstr("folder/walk.c3d: the scene has 31 clips already"));
  EXPECT_FALSE(has("\\Bob"));

  g_db->newScene();
  open(smallTake("first"));
  NLEClip* active = g_db->getActiveClip();
  PropertyTable& table = PropertyTable::getInstance();
  for (int i = 0; table.add("n" + std::to_string(i), DataSource::IntProperty); ++i) {
  }
  int const before = g_db->getNumModules();
  take.analog.emplace_back().name = "EMG";
  EXPECT_THAT(errorOf([&] { open(take); }), HasSubstr("no channel name left for \"EMG\""));
  EXPECT_EQ(g_db->getNumModules(), before);
  EXPECT_EQ(g_db->getActiveClip(), active);
}

}  // namespace

}  // namespace talix
