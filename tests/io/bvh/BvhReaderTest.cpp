#include <array>
#include <cmath>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <numbers>

#include "host/math/TalixRotation.h"
#include "io/TakeFormats.h"
#include "tests/io/TakeTesting.h"

namespace talix {
namespace {

using testing::HasSubstr;

constexpr double kRadians = std::numbers::pi / 180;

// Every key is at its frame, of unit length, and no further from the key before than its negative would be.
TEST(BvhReader, QuaternionsRunOnSmoothly) {
  for (char const* file : {"gesture_01.bvh", "jump_01.bvh", "mixed_order_01.bvh", "yxz_01.bvh"}) {
    Take const take = readBVH(dataFile(file));
    int64 const period = ticksPerFrameAt(take.rate);
    for (TakeJoint const& joint : take.joints)
      for (int64 i = 0; i < joint.rotations.count(); ++i) {
        KeyTrack::Key const key = joint.rotations.at(i),
                            before = joint.rotations.at(std::max<int64>(i - 1, 0));
        double length = 0, dot = 0;
        for (size_t c = 0; c < 4; ++c)
          length += key.values[c] * key.values[c], dot += key.values[c] * before.values[c];
        ASSERT_EQ(key.time, i * period);
        ASSERT_NEAR(length, 1, 1e-12);
        ASSERT_GE(dot, 0);
      }
  }
}

using Matrix3 = std::array<std::array<double, 3>, 3>;

Matrix3 turn(char axis, double degrees) {
  double const c = std::cos(degrees * kRadians), s = std::sin(degrees * kRadians);
  if (axis == 'X') return {{{1, 0, 0}, {0, c, -s}, {0, s, c}}};
  if (axis == 'Y') return {{{c, 0, s}, {0, 1, 0}, {-s, 0, c}}};
  return {{{c, -s, 0}, {s, c, 0}, {0, 0, 1}}};
}

Matrix3 operator*(Matrix3 const& a, Matrix3 const& b) {
  Matrix3 product{};
  for (size_t row = 0; row < 3; ++row)
    for (size_t column = 0; column < 3; ++column)
      for (size_t i = 0; i < 3; ++i) product[row][column] += a[row][i] * b[i][column];
  return product;
}

TalixRotation rotationAt(TakeJoint const& joint, int64 frame) {
  TalixRotation rotation;
  rotation.setQuaternion(joint.rotations.at(frame).values.data());
  return rotation;
}

void expectRotation(TakeJoint const& joint, int64 frame, Matrix3 const& expected) {
  TalixRotation const rotation = rotationAt(joint, frame);
  for (int column = 0; column < 3; ++column) {
    Vec3 unit;
    unit[column] = 1;
    Vec3 const image = rotation.rotate(unit);
    for (int row = 0; row < 3; ++row)
      EXPECT_NEAR(image[row], expected[static_cast<size_t>(row)][static_cast<size_t>(column)], 1e-12)
          << joint.name << " row " << row << " column " << column;
  }
}

// A skeleton of one joint with these channels and rows.
std::string oneJoint(std::string const& channels, std::string const& rows, int frames = 1) {
  return "HIERARCHY\nROOT a\n{\n OFFSET 1 2 3\n CHANNELS " + channels +
         "\n}\nMOTION\nFrames: " + std::to_string(frames) + "\nFrame Time: 0.01\n" + rows;
}

Take readWith(ReadOptions const& options, std::string const& text) {
  TempFolder const folder;
  return readBVH(folder.file("take.bvh", text), options);
}
Take read(std::string const& text) { return readWith({}, text); }

TEST(BvhRotations, EveryOrderMatchesItsEulerAngles) {
  for (std::string const order : {"XYZ", "XZY", "YXZ", "YZX", "ZXY", "ZYX"}) {
    // Channels name the axis that turns last first.
    std::string channels = "3", row;
    Vec3 const degrees(20, -50, 75);
    for (auto axis = order.rbegin(); axis != order.rend(); ++axis) {
      channels += std::string(" ") + *axis + "rotation";
      row += std::to_string(degrees[*axis - 'X']) + " ";
    }
    Take const take = read(oneJoint(channels, row));
    Vec3 angles;
    auto const rotationOrder = static_cast<TalixRotation::RotOrder>(take.joints[0].rotationOrder);
    rotationAt(take.joints[0], 0).getAsEuler(rotationOrder, angles);
    for (int axis = 0; axis < 3; ++axis) EXPECT_NEAR(angles[axis], degrees[axis] * kRadians, 1e-12) << order;
  }
}

TEST(BvhRotations, FewerOrRepeatedAxesStillCompose) {
  Take const two = read(oneJoint("2 Zrotation Xrotation", "100 170"));
  expectRotation(two.joints[0], 0, turn('Z', 100) * turn('X', 170));
  EXPECT_EQ(two.joints[0].rotationOrder, TalixRotation::XYZ);
  Take const one = read(oneJoint("1 Yrotation", "-120"));
  expectRotation(one.joints[0], 0, turn('Y', -120));
  EXPECT_EQ(one.joints[0].rotationOrder, TalixRotation::YXZ);
  Take const repeated = read(oneJoint("3 Zrotation Xrotation Zrotation", "10 20 30"));
  expectRotation(repeated.joints[0], 0, turn('Z', 10) * turn('X', 20) * turn('Z', 30));
}

TEST(BvhText, UnitScalesOffsetsAndPositions) {
  std::string const text = oneJoint("3 Xposition Yposition Zposition", "4 5 6");
  Take const inches = readWith({.unit = "in"}, text);
  EXPECT_EQ(inches.fileUnit, "in");
  EXPECT_FALSE(inches.unitAssumed);
  EXPECT_EQ(inches.joints[0].offset, Vec3(25.4, 50.8, 3 * 25.4));
  EXPECT_DOUBLE_EQ(inches.joints[0].translations.at(0).values[2], 6 * 25.4);
  EXPECT_THAT(errorOf([&] { readWith({.unit = "ell"}, text); }), HasSubstr("the unit \"ell\" is not known"));
  EXPECT_THAT(notesOf(read(text).notes),
              HasSubstr("info: the file names no length unit; centimetres were assumed"));
}

TEST(BvhReader, DamagedFilesGiveATakeOrAnError) {
  auto const reader = [](std::string const& path) { return readBVH(path); };
  std::string const small = readText(dataFile("frametime_precise_01.bvh"));
  expectSurvivesDamage(small, ".bvh", 1, 1500, reader);
  expectSurvivesDamage(readText(dataFile("two_frames_01.bvh")), ".bvh", 17, 500, reader);
}

}  // namespace
}  // namespace talix
