#include <array>
#include <cmath>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <map>
#include <numbers>

#include "host/math/TalixRotation.h"
#include "io/TakeFormats.h"
#include "tests/io/TakeTesting.h"

namespace talix {
namespace {

using testing::HasSubstr;

constexpr double kRadians = std::numbers::pi / 180;

// ---------------------------------------------------------------------------------------------- real files

struct RealTake {
  const char* file;
  size_t joints, endSites, channels;
  int64 frames;
  double rate;
  std::map<std::string, int> channelLists;  // joints by their channels' initials
};

void PrintTo(const RealTake& take, std::ostream* out) { *out << take.file; }

class BvhRealTake : public testing::TestWithParam<RealTake> {};

TEST_P(BvhRealTake, HasTheFileFigures) {
  const RealTake& expected = GetParam();
  const Take take = readBVH(dataFile(expected.file));
  size_t joints = 0, endSites = 0, channels = 0;
  std::map<std::string, int> lists;
  for (size_t i = 0; i < take.joints.size(); ++i) {
    const TakeJoint& joint = take.joints[i];
    ASSERT_LT(joint.parent, static_cast<int>(i));
    ++(joint.endSite ? endSites : joints);
    channels += joint.channels.size();
    std::string list;
    for (const std::string& channel : joint.channels)
      list += std::string(1, channel[0]) + (channel[1] == 'p' ? "p" : "");
    if (!joint.endSite) ++lists[list];
    const bool moves = list.size() > 3;
    EXPECT_EQ(joint.translations.count(), moves ? expected.frames : 0) << joint.name;
    EXPECT_EQ(joint.rotations.count(), joint.endSite ? 0 : expected.frames) << joint.name;
  }
  EXPECT_EQ(joints, expected.joints);
  EXPECT_EQ(endSites, expected.endSites);
  EXPECT_EQ(channels, expected.channels);
  EXPECT_EQ(lists, expected.channelLists);
  EXPECT_EQ(take.frameCount, expected.frames);
  EXPECT_DOUBLE_EQ(take.rate, expected.rate);
  EXPECT_EQ(take.firstFrame, 0);
  EXPECT_EQ(take.up, Axis::Y);
  EXPECT_EQ(take.fileUnit, "cm");
  EXPECT_TRUE(take.unitAssumed);
}

// Every key is at its frame, of unit length, and no further from the key before than its negative would be.
TEST_P(BvhRealTake, QuaternionsRunOnSmoothly) {
  const Take take = readBVH(dataFile(GetParam().file));
  const int64 period = ticksPerFrameAt(take.rate);
  for (const TakeJoint& joint : take.joints)
    for (int64 i = 0; i < joint.rotations.count(); ++i) {
      const KeyTrack::Key key = joint.rotations.at(i), before = joint.rotations.at(std::max<int64>(i - 1, 0));
      double length = 0, dot = 0;
      for (size_t c = 0; c < 4; ++c)
        length += key.values[c] * key.values[c], dot += key.values[c] * before.values[c];
      ASSERT_EQ(key.time, i * period);
      ASSERT_NEAR(length, 1, 1e-12);
      ASSERT_GE(dot, 0);
    }
}

INSTANTIATE_TEST_SUITE_P(
    Files, BvhRealTake,
    testing::Values(
        RealTake{"pose_t_01.bvh", 173, 49, 951, 1, 24, {{"XpYpZpXYZ", 144}, {"XYZ", 29}}},
        RealTake{"walk_hand_01.bvh", 75, 16, 228, 14, 24, {{"XpYpZpXYZ", 1}, {"XYZ", 74}}},
        RealTake{"two_frames_01.bvh", 18, 5, 57, 2, 30, {{"XpYpZpZXY", 1}, {"ZXY", 17}}},
        RealTake{"mixed_order_01.bvh",
                 24,
                 5,
                 75,
                 75,
                 30,
                 {{"XpYpZpXZY", 1}, {"XZY", 15}, {"YZX", 2}, {"ZYX", 2}, {"XYZ", 4}}},
        RealTake{"yxz_01.bvh", 23, 5, 72, 61, 120, {{"XpYpZpYXZ", 1}, {"YXZ", 22}}},
        RealTake{"rest_skeleton_01.bvh", 24, 5, 75, 1, 120, {{"XpYpZpZYX", 1}, {"ZYX", 23}}},
        RealTake{"frametime_precise_01.bvh", 2, 1, 9, 3, 23.976, {{"XpYpZpZYX", 1}, {"ZYX", 1}}},
        RealTake{"no_endsite_01.bvh", 4, 0, 15, 120, 60, {{"XpYpZpXYZ", 1}, {"XYZ", 3}}},
        RealTake{"gesture_01.bvh", 27, 7, 84, 339, 30, {{"XpYpZpXYZ", 1}, {"XYZ", 24}, {"YXZ", 2}}},
        RealTake{"jump_01.bvh", 27, 7, 84, 654, 119.88, {{"XpYpZpXYZ", 1}, {"XYZ", 24}, {"YXZ", 2}}}),
    [](const auto& given) {
      const std::string name = given.param.file;
      return name.substr(0, name.find('.'));
    });

// ---------------------------------------------------------------------------------------------- rotations

using Matrix3 = std::array<std::array<double, 3>, 3>;

Matrix3 turn(char axis, double degrees) {
  const double c = std::cos(degrees * kRadians), s = std::sin(degrees * kRadians);
  if (axis == 'X') return {{{1, 0, 0}, {0, c, -s}, {0, s, c}}};
  if (axis == 'Y') return {{{c, 0, s}, {0, 1, 0}, {-s, 0, c}}};
  return {{{c, -s, 0}, {s, c, 0}, {0, 0, 1}}};
}

Matrix3 operator*(const Matrix3& a, const Matrix3& b) {
  Matrix3 product{};
  for (size_t row = 0; row < 3; ++row)
    for (size_t column = 0; column < 3; ++column)
      for (size_t i = 0; i < 3; ++i) product[row][column] += a[row][i] * b[i][column];
  return product;
}

TalixRotation rotationAt(const TakeJoint& joint, int64 frame) {
  TalixRotation rotation;
  rotation.setQuaternion(joint.rotations.at(frame).values.data());
  return rotation;
}

void expectRotation(const TakeJoint& joint, int64 frame, const Matrix3& expected) {
  const TalixRotation rotation = rotationAt(joint, frame);
  for (int column = 0; column < 3; ++column) {
    Vec3 unit;
    unit[column] = 1;
    const Vec3 image = rotation.rotate(unit);
    for (int row = 0; row < 3; ++row)
      EXPECT_NEAR(image[row], expected[static_cast<size_t>(row)][static_cast<size_t>(column)], 1e-12)
          << joint.name << " row " << row << " column " << column;
  }
}

// A skeleton of one joint with these channels and rows.
std::string oneJoint(const std::string& channels, const std::string& rows, int frames = 1) {
  return "HIERARCHY\nROOT a\n{\n OFFSET 1 2 3\n CHANNELS " + channels +
         "\n}\nMOTION\nFrames: " + std::to_string(frames) + "\nFrame Time: 0.01\n" + rows;
}

Take readWith(const ReadOptions& options, const std::string& text) {
  const TempFolder folder;
  return readBVH(folder.file("take.bvh", text), options);
}
Take read(const std::string& text) { return readWith({}, text); }

TEST(BvhRotations, ChannelsComposeFromLeftToRight) {
  const Take take = readBVH(dataFile("two_frames_01.bvh"));
  // the first row: 8.03 35.01 88.36 -3.41 14.78 -164.35 13.09 40.30 -24.60 ...
  expectRotation(take.joints[0], 0, turn('Z', -3.41) * turn('X', 14.78) * turn('Y', -164.35));
  expectRotation(take.joints[1], 0, turn('Z', 13.09) * turn('X', 40.30) * turn('Y', -24.60));
  EXPECT_EQ(take.joints[0].rotationOrder, TalixRotation::YXZ);
  const KeyTrack::Values place = take.joints[0].translations.at(0).values;
  EXPECT_DOUBLE_EQ(place[0], 80.3);
  EXPECT_DOUBLE_EQ(place[1], 350.1);
  EXPECT_DOUBLE_EQ(place[2], 883.6);
  EXPECT_DOUBLE_EQ(take.joints[1].offset.y, 52.1);
}

TEST(BvhRotations, EveryOrderMatchesItsEulerAngles) {
  for (const std::string order : {"XYZ", "XZY", "YXZ", "YZX", "ZXY", "ZYX"}) {
    // Channels name the axis that turns last first.
    std::string channels = "3", row;
    const Vec3 degrees(20, -50, 75);
    for (auto axis = order.rbegin(); axis != order.rend(); ++axis) {
      channels += std::string(" ") + *axis + "rotation";
      row += std::to_string(degrees[*axis - 'X']) + " ";
    }
    const Take take = read(oneJoint(channels, row));
    Vec3 angles;
    const auto rotationOrder = static_cast<TalixRotation::RotOrder>(take.joints[0].rotationOrder);
    rotationAt(take.joints[0], 0).getAsEuler(rotationOrder, angles);
    for (int axis = 0; axis < 3; ++axis) EXPECT_NEAR(angles[axis], degrees[axis] * kRadians, 1e-12) << order;
  }
}

TEST(BvhRotations, FewerOrRepeatedAxesStillCompose) {
  const Take two = read(oneJoint("2 Zrotation Xrotation", "100 170"));
  expectRotation(two.joints[0], 0, turn('Z', 100) * turn('X', 170));
  EXPECT_EQ(two.joints[0].rotationOrder, TalixRotation::XYZ);
  const Take one = read(oneJoint("1 Yrotation", "-120"));
  expectRotation(one.joints[0], 0, turn('Y', -120));
  EXPECT_EQ(one.joints[0].rotationOrder, TalixRotation::YXZ);
  const Take repeated = read(oneJoint("3 Zrotation Xrotation Zrotation", "10 20 30"));
  expectRotation(repeated.joints[0], 0, turn('Z', 10) * turn('X', 20) * turn('Z', 30));
}

TEST(BvhRotations, PositionsMayStandAnywhereAndMissingOnesAreTheOffset) {
  const Take take = read(oneJoint("4 Zrotation Yposition Xrotation Yrotation", "10 7 20 30"));
  expectRotation(take.joints[0], 0, turn('Z', 10) * turn('X', 20) * turn('Y', 30));
  const KeyTrack::Values place = take.joints[0].translations.at(0).values;
  EXPECT_EQ(Vec3(place.data()), Vec3(10, 70, 30));
}

// ---------------------------------------------------------------------------------------------- layout

TEST(BvhText, LayoutDoesNotMatter) {
  const std::string plain =
      "HIERARCHY\nROOT Left Hip:a\n{\nOFFSET 0 0 0\nCHANNELS 3 Xrotation Yrotation Zrotation\nJOINT "
      "7\n{\nOFFSET 1 2 3\n"
      "CHANNELS 1 Zrotation\nEnd Site\n{\nOFFSET 4 5 6\n}\nEnd Site\n{\nOFFSET 7 8 9\n}\n}\n}\n"
      "ROOT Füße\n{\nOFFSET 0 0 0\nCHANNELS 0\n}\n"
      "MOTION\nFrames: 2\nFrame Time: 0.04\n1 2 3 4\n5 6 7 8\n";
  std::string crlf, cr;
  for (const char c : plain) crlf += c == '\n' ? "\r\n" : std::string(1, c), cr += c == '\n' ? '\r' : c;
  const std::string odd =
      "\xEF\xBB\xBFhierarchy\n\n  Root \t Left Hip:a {Offset 0 0 0 channels 3 xrotation YROTATION Zrotation\n"
      "JOINT 7{\n\tOFFSET +1 2.0e0 3\n\nCHANNELS\t1\tZrotation End Site{OFFSET 4 5 6}\nEND SITE\n{OFFSET 7 8 "
      "9\n} } }\n"
      "ROOT Füße\n{OFFSET 0 0 0}\n motion\nFrames:2\nFrame  Time:\t.04\n1 2  \n\n3 4 5\n6\t7\t8 \t \n\n";
  const Take expected = read(plain);
  ASSERT_EQ(expected.joints.size(), 5u);
  EXPECT_EQ(expected.joints[0].name, "Left Hip:a");
  EXPECT_EQ(expected.joints[2].name, "7_end");
  EXPECT_EQ(expected.joints[3].name, "7_end2");
  EXPECT_EQ(expected.joints[4].name, "Füße");
  EXPECT_EQ(expected.joints[4].parent, -1);
  for (const std::string& text : {crlf, cr, odd}) {
    const Take take = read(text);
    ASSERT_EQ(take.joints.size(), expected.joints.size());
    EXPECT_EQ(take.rate, 25);
    for (size_t i = 0; i < take.joints.size(); ++i) {
      EXPECT_EQ(take.joints[i].name, expected.joints[i].name);
      EXPECT_EQ(take.joints[i].parent, expected.joints[i].parent);
      EXPECT_EQ(take.joints[i].endSite, expected.joints[i].endSite);
      EXPECT_EQ(take.joints[i].offset, expected.joints[i].offset);
      EXPECT_EQ(take.joints[i].channels, expected.joints[i].channels);
      EXPECT_EQ(take.joints[i].rotations, expected.joints[i].rotations);
    }
  }
}

TEST(BvhText, UnitScalesOffsetsAndPositions) {
  const std::string text = oneJoint("3 Xposition Yposition Zposition", "4 5 6");
  const Take inches = readWith({.unit = "in"}, text);
  EXPECT_EQ(inches.fileUnit, "in");
  EXPECT_FALSE(inches.unitAssumed);
  EXPECT_EQ(inches.joints[0].offset, Vec3(25.4, 50.8, 3 * 25.4));
  EXPECT_DOUBLE_EQ(inches.joints[0].translations.at(0).values[2], 6 * 25.4);
  EXPECT_THAT(errorOf([&] { readWith({.unit = "ell"}, text); }), HasSubstr("the unit \"ell\" is not known"));
  EXPECT_THAT(notesOf(read(text).notes),
              HasSubstr("info: the file names no length unit; centimetres were assumed"));
}

TEST(BvhText, FrameTimesMeanUsualRatesWithinTheirPrecision) {
  const std::pair<const char*, double> cases[] = {{"0.033333", 30},
                                                  {"0.033", 30},
                                                  {"0.03336", 29.97},
                                                  {"0.0083", 120},
                                                  {"0.008342", 119.88},
                                                  {"8.3333e-3", 120},
                                                  {"0.0417083333333333", 24000 / 1001.0},
                                                  {"0.017", 60},
                                                  {"0.016683350", 59.94},
                                                  {"0.0083330000", 120},
                                                  {"0.0142872247", 1 / 0.0142872247},
                                                  {"0.0125", 80},
                                                  {"0.015", 1 / 0.015}};
  for (const auto& [frameTime, rate] : cases) {
    std::string text = oneJoint("1 Xrotation", "1");
    text.replace(text.find("0.01\n"), 4, frameTime);
    EXPECT_DOUBLE_EQ(read(text).rate, rate) << frameTime;
  }
  EXPECT_THAT(notesOf(readBVH(dataFile("jump_01.bvh")).notes),
              HasSubstr("info: the frame time 0.008342 s was taken as 119.88 frames a second"));
  EXPECT_THAT(notesOf(readBVH(dataFile("frametime_precise_01.bvh")).notes),
              testing::Not(HasSubstr("frame time")));
}

// ---------------------------------------------------------------------------------------------- errors

TEST(BvhErrors, NameLineAndExpectation) {
  const std::string head = "HIERARCHY\nROOT a\n{\nOFFSET 0 0 0\nCHANNELS 2 Xrotation Yrotation\n}\n";
  const std::string motion = head + "MOTION\nFrames: 2\nFrame Time: 0.1\n";
  std::string deep = "HIERARCHY\nROOT a\n{\n";
  for (int i = 0; i < 600; ++i) deep += "JOINT a {";
  const std::pair<std::string, const char*> cases[] = {
      {"LOWERARCHY", "line 1: HIERARCHY expected"},
      {"HIERARCHY\nJOINT a", "line 2: ROOT expected, not \"JOINT\""},
      {"HIERARCHY\nMOTION", "line 2: ROOT expected before MOTION"},
      {"HIERARCHY\nROOT a\n", "line 3: \"{\" expected after \"a\", not the end of the file"},
      {"HIERARCHY\nROOT\n{\n", "line 2: a joint name expected"},
      {"HIERARCHY\nROOT a\n{\nOFFSET 0 0",
       "line 4: an OFFSET of three numbers expected, not the end of the file"},
      {"HIERARCHY\nROOT a\n{\nOFFSET 0 0,5 0", "line 4: an OFFSET of three numbers expected, not \"0,5\""},
      {"HIERARCHY\nROOT a\n{\nOFFSET 0 nan 0", "line 4: an OFFSET of three numbers expected, not \"nan\""},
      {"HIERARCHY\nROOT a\n{\nOFFSET 0 0 0\nOFFSET 0 0 0", "line 5: a second OFFSET"},
      {"HIERARCHY\nROOT a\n{\nCHANNELS 1.5", "line 4: the number of channels expected"},
      {"HIERARCHY\nROOT a\n{\nCHANNELS 1 Wrotation", "line 4: a channel expected (Xposition, "},
      {"HIERARCHY\nROOT a\n{\nCHANNELS 9999999999 Xrotation }", "not \"}\""},
      {"HIERARCHY\nROOT a\n{\nCHANNELS 2 Xposition Xposition", "line 4: Xposition is given twice"},
      {"HIERARCHY\nROOT a\n{\nCHANNELS 1 Xrotation Yrotation",
       "line 4: OFFSET, CHANNELS, JOINT, End Site or \"}\" "
       "expected, not \"Yrotation\"; \"a\" of line 2 is still open"},
      {"HIERARCHY\nROOT a\n{\nEnd Site\n{\nJOINT b", "line 6: OFFSET or \"}\" expected, not \"JOINT\""},
      {head.substr(0, head.size() - 2) + "MOTION", "not \"MOTION\"; \"a\" of line 2 is still open"},
      {head + "}\n", "line 7: ROOT or MOTION expected, not \"}\""},
      {head, "line 7: ROOT or MOTION expected, not the end of the file"},
      {deep, "line 4: joints nested deeper than 500"},
      {head + "MOTION\nFrame Time: 1", "line 8: Frames: after MOTION expected, not \"Frame\""},
      {head + "MOTION\nFrames: x", "line 8: the number of frames expected, not \"x\""},
      {head + "MOTION\nFrames: -1", "line 8: the number of frames expected"},
      {head + "MOTION\nFrames: 1\n1 2", "line 9: Frame Time: after Frames: expected, not \"1\""},
      {head + "MOTION\nFrames: 1\nFrame Time: 0\n1 2",
       "line 9: a frame time above 0 in seconds expected, not \"0\""},
      {head + "MOTION\nFrames: 1\nFrame Time: inf\n1 2", "line 9: a frame time above 0"},
      {head + "MOTION\nFrames: 1\nFrame Time: 1e-9\n1 2",
       "line 9: a frame time that makes a frame rate from 0.001"},
      {head + "MOTION\nFrames: 4000000000\nFrame Time: 0.1\n1 2",
       "line 9: 2 values expected for each of 4000000000 frames, but only 4 bytes follow"},
      {motion + "1 2\n3     \n",
       "line 12: 2 values expected for each of 2 frames; the motion ends in frame 2; line 11 is the first "
       "that does "
       "not hold one whole frame"},
      {motion + "1 2\n3 4\n5 6\n",
       "line 12: 2 values expected for each of 2 frames; the motion goes on with \"5\""},
      {motion + "1 2\n3 4x\n", "line 11: a number expected, not \"4x\", in frame 2"},
      {motion + "1 2\nnan 4\n", "line 11: a finite number expected, not \"nan\", in frame 2"},
      {motion + "1 2\n3 1e999\n", "line 11: a finite number expected, not \"1e999\", in frame 2"},
  };
  const TempFolder folder;
  for (const auto& [text, error] : cases) {
    const std::string path = folder.file("bad.bvh", text);
    const std::string got = errorOf([&] { readBVH(path); });
    EXPECT_THAT(got, HasSubstr(error)) << text;
    EXPECT_THAT(got, testing::StartsWith(path + ", line "));
  }
}

TEST(BvhErrors, DamagedFilesGiveATakeOrAnError) {
  const auto reader = [](const std::string& path) { return readBVH(path); };
  const std::string small = readText(dataFile("frametime_precise_01.bvh"));
  expectSurvivesDamage(small, ".bvh", 1, 1500, reader);
  expectSurvivesDamage(readText(dataFile("two_frames_01.bvh")), ".bvh", 17, 500, reader);
}

}  // namespace
}  // namespace talix
