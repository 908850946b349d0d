#include <cmath>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <numbers>

#include "host/math/TalixRotation.h"
#include "io/TakeFormats.h"
#include "io/bvh/BvhChannels.h"
#include "io/bvh/EulerFilter.h"
#include "tests/io/TakeTesting.h"

namespace talix {
namespace {

using testing::HasSubstr;

constexpr double kPi = std::numbers::pi;

TEST(BvhWriter, KeepsRealTakes) {
  TempFolder const folder;
  for (char const* file : {"pose_t_01.bvh", "walk_hand_01.bvh", "mixed_order_01.bvh", "yxz_01.bvh",
                           "frametime_precise_01.bvh", "no_endsite_01.bvh", "jump_01.bvh"})
    for (char const* unit : {"", "m", "in"}) {
      Take const take = readBVH(dataFile(file), {.unit = unit});
      std::vector<TakeNote> notes;
      writeBVH(sourceOf(take), folder.path("copy.bvh"), notes);
      EXPECT_EQ(
          notesOf(notes),
          *unit ? "warning: BVH names no length unit; the lengths are in " + std::string(unit) + "\n" : "");
      EXPECT_EQ(differenceOf(take, readBVH(folder.path("copy.bvh"), {.unit = unit}), 1e-6), "") << file;
    }
}

TakeJoint joint(std::string const& name, int parent) {
  TakeJoint made;
  made.name = name;
  made.parent = parent;
  return made;
}

// A take of three frames at 100 a second.
Take takeOf(std::vector<TakeJoint> joints) {
  Take take;
  take.rate = 100;
  take.frameCount = 3;
  take.fileUnit = "cm";
  take.unitInMillimetres = 10;
  take.up = Axis::Y;
  take.joints = std::move(joints);
  return take;
}

std::string written(Take const& take, std::string* notes = nullptr) {
  TempFolder const folder;
  std::vector<TakeNote> list;
  writeTake(sourceOf(take), folder.path("out.BVH"), list);
  if (notes) *notes = notesOf(list);
  return readText(folder.path("out.BVH"));
}

constexpr int64 kPeriod = kTicksPerSecond / 100;

void turn(TakeJoint& of, int64 frame, Vec3 degrees) {
  TalixRotation rotation;
  rotation.setAsEuler(static_cast<TalixRotation::RotOrder>(of.rotationOrder), degrees * (kPi / 180));
  KeyTrack::Values values{};
  rotation.getQuaternion(values.data());
  of.rotations.set(frame * kPeriod, values);
}

TEST(BvhWriter, UsualChannelsWhereAJointNamesNone) {
  TakeJoint root = joint("hip", -1), free = joint("free", 0), bound = joint("bound", 1),
            end = joint("bound_end", 2);
  root.rotationOrder = TalixRotation::YXZ;
  bound.offset = Vec3(12.5, 0, -1.0 / 3);
  end.endSite = true;
  free.translations.set(0, {10, 0, 0});
  free.translations.set(2 * kPeriod, {30, 5, 0});
  turn(root, 0, {10, 20, 30});
  std::string notes;
  EXPECT_EQ(written(takeOf({root, free, bound, end}), &notes),
            "HIERARCHY\n"
            "ROOT hip\n{\n\tOFFSET 0 0 0\n"
            "\tCHANNELS 6 Xposition Yposition Zposition Zrotation Xrotation Yrotation\n"
            "\tJOINT free\n\t{\n\t\tOFFSET 0 0 0\n"
            "\t\tCHANNELS 6 Xposition Yposition Zposition Zrotation Yrotation Xrotation\n"
            "\t\tJOINT bound\n\t\t{\n\t\t\tOFFSET 1.25 0 -0.033333333\n\t\t\tCHANNELS 3 Zrotation Yrotation "
            "Xrotation\n"
            "\t\t\tEnd Site\n\t\t\t{\n\t\t\t\tOFFSET 0 0 0\n\t\t\t}\n\t\t}\n\t}\n}\n"
            "MOTION\nFrames: 3\nFrame Time: 0.01\n"
            "0 0 0 30 10 20 1 0 0 0 0 0 0 0 0\n"
            "0 0 0 30 10 20 2 0.25 0 0 0 0 0 0 0\n"
            "0 0 0 30 10 20 3 0.5 0 0 0 0 0 0 0\n");
  EXPECT_EQ(notes, "");
}

TEST(BvhWriter, SiblingsKeepTheirOrderHoweverTheListIsSorted) {
  Take take = takeOf({joint("r", -1), joint("s", -1), joint("a", 0), joint("b", 0), joint("aa", 2)});
  take.joints[2].endSite = true;  // it has a child, so it is written as a joint
  std::string const text = written(take);
  size_t at = 0;
  for (char const* name : {"ROOT r\n", "JOINT a\n", "JOINT aa\n", "JOINT b\n", "ROOT s\n"}) {
    ASSERT_NE(text.find(name, at), std::string::npos) << name << text;
    at = text.find(name, at);
  }
}

TEST(BvhWriter, FewerRotationChannelsKeepWhatTheyCan) {
  TakeJoint twist = joint("twist", -1), bend = joint("bend", 0), lost = joint("lost", 0);
  twist.channels = {"Zrotation"};
  bend.channels = {"Zrotation", "Xrotation"};
  lost.channels = {"Yrotation"};
  lost.rotationOrder = TalixRotation::YXZ;
  bend.rotationOrder = TalixRotation::XYZ;
  for (int frame = 0; frame < 3; ++frame) {
    turn(twist, frame, {0, 0, 130.0 * frame});
    turn(bend, frame, {170.0 * frame, 0, 160.0 * frame});
    turn(lost, frame, {0.1, 5, 0});
  }
  std::string notes;
  EXPECT_THAT(written(takeOf({twist, bend, lost}), &notes),
              HasSubstr("\n0 0 0 5\n130 160 170 5\n260 320 340 5\n"));
  EXPECT_EQ(notes, "warning: \"lost\" turns about an axis that has no channel; that turn was left out\n");
}

TEST(BvhWriter, SaysWhatItCannotHold) {
  Take take = takeOf({joint("a{b", -1), joint("tip", 0)});
  take.joints[0].channels = {"Zrotation", "Xrotation", "Zrotation"};
  take.joints[1].endSite = true;
  turn(take.joints[0], 1, {0, 0, 1});
  turn(take.joints[0], 2, {0, 0, 1});
  take.joints[0].rotations.set(kPeriod * 3 / 2, {0, 0, 0, 1});
  take.joints[0].rotations.set(kPeriod * 9, {0, 0, 0, 1});
  take.points.resize(2);
  take.outputs.resize(1);
  take.analog.resize(4);
  take.events.resize(5);
  take.firstFrame = 1;
  take.fileUnit = "mm";
  take.unitInMillimetres = 1;
  take.up = Axis::Z;
  std::string notes;
  written(take, &notes);
  for (char const* text :
       {"BVH holds no points; 2 left out", "no computed outputs; 1 left", "no analog channels; 4 left",
        "no events; 5 left", "names of end sites; 1 left", "the first frame was 1", "the lengths are in mm",
        "BVH names no up axis; up is z", "2 keys between or outside the frames",
        "\"a{b\" was written as \"a_b\"", "the channels of \"a{b\" were replaced by the usual ones"})
    EXPECT_THAT(notes, HasSubstr(text));

  TempFolder const folder;
  std::vector<TakeNote> list;
  EXPECT_THAT(errorOf([&] { writeBVH(TakeSource(), folder.path("x.bvh"), list); }),
              HasSubstr("BVH holds joints only"));
  EXPECT_THAT(errorOf([&] { writeBVH(sourceOf(takeOf({joint("a", 0)})), folder.path("x.bvh"), list); }),
              HasSubstr("joint \"a\" comes before its parent"));
  EXPECT_THAT(errorOf([&] { writeBVH(sourceOf(takeOf({joint("a", -1)})), folder.path("none/x.bvh"), list); }),
              HasSubstr("none/x.bvh: cannot be written"));
  EXPECT_TRUE(std::filesystem::is_empty(folder.path("")));
}

// A joint that turns on for several turns, passes the poles and stops in gimbal lock: angles follow without a
// jump and make the same rotation.
TEST(EulerFilter, FollowsWithoutJumps) {
  for (int order = 0; order < 6; ++order) {
    auto const rotationOrder = static_cast<TalixRotation::RotOrder>(order);
    int const middle = kOrderAxes[order][1];
    EulerFilter unroller(order, true);
    Vec3 before;
    for (int frame = 0; frame <= 720; ++frame) {
      Vec3 angles(frame * 0.03, frame * 0.02, frame * -0.01);
      angles[middle] = frame % 90 == 45 ? kPi / 2 : frame * 0.025;
      TalixRotation rotation, again;
      rotation.setAsEuler(rotationOrder, angles);
      double q[4], p[4];
      rotation.getQuaternion(q);
      Vec3 const got = unroller.next(q);
      again.setAsEuler(rotationOrder, got);
      again.getQuaternion(p);
      EXPECT_NEAR(std::abs(q[0] * p[0] + q[1] * p[1] + q[2] * p[2] + q[3] * p[3]), 1, 1e-14)
          << order << " " << frame;
      if (frame % 90 == 45 || frame % 90 == 46) {
        before = got;
        continue;  // the lock itself is a jump that the test makes
      }
      for (int axis = 0; axis < 3; ++axis) EXPECT_NEAR(got[axis], before[axis], 0.1) << order << " " << frame;
      before = got;
    }
  }
  // Standing in gimbal lock, the first angle keeps still and the last one turns.
  EulerFilter unroller(TalixRotation::XYZ, true);
  TalixRotation rotation;
  for (int frame = 0; frame < 100; ++frame) {
    double q[4];
    rotation.setAsEuler(TalixRotation::XYZ, Vec3(0.3, frame == 0 ? 1.0 : kPi / 2, frame * 0.1));
    rotation.getQuaternion(q);
    Vec3 const got = unroller.next(q);
    EXPECT_NEAR(got.x, 0.3, 1e-7);
    EXPECT_NEAR(got.z, frame * 0.1, 1e-7);
  }
}

}  // namespace
}  // namespace talix
