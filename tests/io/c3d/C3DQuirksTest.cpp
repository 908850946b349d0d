// Small files made by hand: what header and parameters may say, and disagree about.
#include <gtest/gtest.h>
#include <limits>

#include "host/time/Ticks.h"
#include "io/TakeFormats.h"
#include "io/c3d/C3DParameterWriter.h"
#include "tests/io/c3d/C3DTestFiles.h"

namespace talix {
namespace {

constexpr auto kInfo = TakeNote::Level::Info;
constexpr auto kWarning = TakeNote::Level::Warning;

class C3DQuirks : public testing::Test {
 protected:
  Take read() {
    folder.file("small.c3d", file.bytes());
    return readC3D(path);
  }
  std::string error() {
    folder.file("small.c3d", file.bytes());
    return errorOf([this] { readC3D(path); });
  }
  // One frame of each fourth value, for two points that stand still.
  void setFourths(std::vector<int> const& fourths) {
    file.data.clear();
    for (int const fourth : fourths)
      for (int point = 0; point < 2; ++point)
        for (int const value : {10, 20, 30, fourth}) appendC3DWord(file.data, static_cast<unsigned>(value));
  }

  TempFolder const folder;
  std::string const path = folder.path("small.c3d");
  SmallC3D file;
};

C3DParameter texts(std::string const& name, int length, std::vector<std::string> const& values) {
  C3DParameter parameter{name, C3DParameter::Type::Text, {length, static_cast<int>(values.size())}, {}, {}};
  for (std::string value : values) {
    value.resize(static_cast<size_t>(length), ' ');
    parameter.characters += value;
  }
  return parameter;
}

TEST_F(C3DQuirks, ScalesIntegersAndKeepsTheirFrames) {
  Take const take = read();
  EXPECT_FALSE(hasNote(take.notes, kWarning, "")) << take.notes.back().text;
  KeyTrack const& positions = take.points[1].positions;
  ASSERT_EQ(positions.count(), 4);
  EXPECT_EQ(positions.timeAt(0), ticksPerFrameAt(100));
  // Values count up by 8 in a frame; point 1 starts at 4.
  EXPECT_EQ(positions.at(2).values, (KeyTrack::Values{10, 10.5, 11, 0}));
}

TEST_F(C3DQuirks, PartsTheFourthValueIntoResidualAndCameras) {
  setFourths({0, 3, -1, 0x7f05});
  Take const take = read();
  TakePoint const& point = take.points[0];
  ASSERT_EQ(point.positions.count(), 3);
  ASSERT_EQ(point.residuals.count(), 3);
  EXPECT_EQ(point.residuals.at(0).values[0], 0);
  EXPECT_EQ(point.residuals.at(1).values[0], 1.5);
  EXPECT_EQ(point.residuals.at(2).values[0], 2.5);
  EXPECT_EQ(point.residuals.timeAt(2), 4 * ticksPerFrameAt(100));
  EXPECT_EQ(point.cameras, (std::vector<unsigned char>{0, 0, 0, 0x7f}));
  setFourths({0, 0, -1, 0});
  EXPECT_TRUE(read().points[0].residuals.empty());
}

TEST_F(C3DQuirks, TakesOriginAsDataAndWarns) {
  file.data.assign(4 * 16, '\0');
  Take const take = read();
  EXPECT_EQ(take.points[0].positions.count(), 4);
  EXPECT_TRUE(hasNote(take.notes, kWarning, "8 of 8 point-frames lie at exactly 0, 0, 0"));
}

TEST_F(C3DQuirks, AssumesMillimetresAndZUp) {
  file.set("POINT", text("UNITS", "furlong"));
  Take const take = read();
  EXPECT_TRUE(take.unitAssumed);
  EXPECT_TRUE(take.upAssumed);
  EXPECT_EQ(take.fileUnit, "furlong");
  EXPECT_TRUE(hasNote(take.notes, kInfo, "\"furlong\" is unknown; mm is assumed"));
  file.set("POINT", text("Y_SCREEN", "-y"));
  EXPECT_EQ(read().up, Axis::Y);
}

TEST_F(C3DQuirks, PartsSubjectsFromLabels) {
  file.set("POINT", texts("LABELS", 12, {"Ann:LFHD", "LFHD"}));
  Take take = read();
  EXPECT_EQ(take.points[0].subject, "Ann");
  EXPECT_EQ(take.points[0].label, "LFHD");
  EXPECT_EQ(take.points[1].subject, "");
  file.set("SUBJECTS", texts("NAMES", 8, {"Bob"}));
  file.set("SUBJECTS", integers("USES_PREFIXES", {0}));
  take = read();
  EXPECT_EQ(take.points[0].subject, "Ann");
  EXPECT_EQ(take.points[1].subject, "Bob");
  file.set("POINT", texts("LABELS", 12, {"AnnLFHD", "*12"}));
  file.set("SUBJECTS", texts("LABEL_PREFIXES", 8, {"Ann"}));
  file.set("SUBJECTS", integers("USES_PREFIXES", {1}));
  take = read();
  EXPECT_EQ(take.points[0].subject, "Bob");
  EXPECT_EQ(take.points[0].label, "LFHD");
  EXPECT_EQ(take.points[1].subject + take.points[1].label, "");
}

TEST_F(C3DQuirks, ReadsOutputsOfGroupsThatTheFileNames) {
  file.set("POINT", texts("LABELS", 4, {"Sway", "Mark"}));
  file.set("POINT", texts("SWAYS", 4, {"Sway"}));
  file.set("POINT", text("SWAY_UNITS", "%"));
  file.set("POINT", C3DParameter{"TYPE_GROUPS", C3DParameter::Type::Text, {5, 2, 1}, "SWAYSSWAY ", {}});
  file.set("POINT", text("UNITS", "m"));
  Take const take = read();
  ASSERT_EQ(take.outputs.size(), 1u);
  EXPECT_EQ(take.outputs[0].kind, "SWAYS");
  EXPECT_EQ(take.outputs[0].unit, "%");
  EXPECT_EQ(take.outputs[0].values.at(1).values[1], 4.5);
  ASSERT_EQ(take.points.size(), 1u);
  EXPECT_EQ(take.points[0].label, "Mark");
  EXPECT_EQ(take.points[0].positions.at(1).values[1], 6500);
}

TEST_F(C3DQuirks, ReadsAnalogIntegersWithAndWithoutSign) {
  file.channels = 2;
  file.samplesPerFrame = 3;
  file.set("ANALOG", integers("USED", {2}));
  file.set("ANALOG", reals("RATE", {300}));
  file.set("ANALOG", reals("GEN_SCALE", {0.5}));
  file.set("ANALOG", reals("SCALE", {2, 4}));
  file.set("ANALOG", integers("OFFSET", {0, -32768}));
  for (int i = 0; i < 4 * 14; ++i) appendC3DWord(file.data, i % 14 < 8 ? 0u : 65'000u);
  Take take = read();
  EXPECT_EQ(take.analogRate, 300);
  ASSERT_EQ(take.analog[1].samples.count(), 12);
  EXPECT_EQ(take.analog[0].samples.at(5).values[0], -536);
  EXPECT_EQ(take.analog[1].samples.at(5).values[0], 2 * (-536 + 32'768));
  file.set("ANALOG", text("FORMAT", "UNSIGNED"));
  take = read();
  EXPECT_EQ(take.analog[0].samples.at(5).values[0], 65'000);
  EXPECT_EQ(take.analog[1].samples.at(5).values[0], 2 * (65'000 - 32'768));
  // A wrong rate: the header's number of samples fits the data.
  file.frames = 400;
  file.headerLast = 400;
  file.data.clear();
  file.set("POINT", integers("FRAMES", {400}));
  file.set("ANALOG", reals("RATE", {700}));
  take = read();
  EXPECT_EQ(take.analogRate, 300);
  EXPECT_TRUE(hasNote(take.notes, kWarning, "3 samples per frame"));
}

TEST_F(C3DQuirks, BelievesTheFrameCountThatFitsTheData) {
  file.frames = 200;
  file.headerLast = 200;
  file.set("POINT", integers("FRAMES", {100}));
  Take take = read();
  EXPECT_EQ(take.frameCount, 200);
  EXPECT_TRUE(hasNote(take.notes, kWarning, "FRAMES says 100, header 200"));
  file.set("TRIAL", integers("ACTUAL_START_FIELD", {31, 0}));
  file.set("TRIAL", integers("ACTUAL_END_FIELD", {230, 0}));
  take = read();
  EXPECT_EQ(take.frameCount, 200);
  EXPECT_EQ(take.firstFrame, 31);
  EXPECT_EQ(take.points[0].positions.timeAt(0), 31 * ticksPerFrameAt(100));
  file.set("TRIAL", integers("ACTUAL_END_FIELD", {30 + 64, 0}));
  take = read();
  EXPECT_EQ(take.frameCount, 200);
  EXPECT_EQ(take.firstFrame, 1);
}

TEST_F(C3DQuirks, FindsTheCountOfLongTakes) {
  file.frames = 70'000;
  file.headerLast = 65'535;
  file.set("POINT", integers("FRAMES", {-1}));  // 65535 without sign
  Take take = read();
  EXPECT_EQ(take.frameCount, 70'000);
  EXPECT_TRUE(
      hasNote(take.notes, kWarning, "the frame count ends at 65535; the size of the data gives 70000"));
  file.set("POINT", reals("LONG_FRAMES", {70'000}));
  take = read();
  EXPECT_EQ(take.frameCount, 70'000);
  EXPECT_FALSE(hasNote(take.notes, kWarning, ""));
  file.frames = 66'000;  // too short: the cut counts do not come to its help
  EXPECT_NE(error().find("the data section ends at frame 66"), std::string::npos);
  file.frames = 70'000;
  file.set("POINT", integers("LONG_FRAMES", {}));
  file.set("POINT", integers("FRAMES", {70'000 - 65'536}));  // wrapped
  file.set("TRIAL", integers("ACTUAL_START_FIELD", {1, 0}));
  file.set("TRIAL", integers("ACTUAL_END_FIELD", {70'000 - 65'536, 1}));
  take = read();
  EXPECT_EQ(take.frameCount, 70'000);
  EXPECT_FALSE(hasNote(take.notes, kWarning, ""));
}

TEST_F(C3DQuirks, FindsTheDataWhereOnePlaceIsWrong) {
  file.headerDataBlock = 900;
  EXPECT_NE(error().find("said to start at block 900"), std::string::npos);
  file.set("POINT", integers("DATA_START", {3}));
  EXPECT_EQ(read().points[1].positions.at(0).values[0], 2);
  file.headerDataBlock = 0;
  file.set("POINT", integers("DATA_START", {2}));
  EXPECT_EQ(read().points[1].positions.at(0).values[0], 2);
  file.frames = 100;
  file.headerLast = 100;
  file.set("POINT", integers("FRAMES", {100}));
  file.set("POINT", integers("DATA_START", {4}));
  Take const take = read();
  EXPECT_EQ(take.points[1].positions.at(0).values[0], 2);
  EXPECT_TRUE(hasNote(take.notes, kWarning, "data start differ"));
}

TEST_F(C3DQuirks, TakesTheFirstFrameOfACountThatAgreesElseTheHeaders) {
  file.frames = 200;
  file.headerLast = 100;
  file.set("POINT", integers("FRAMES", {200}));
  file.set("TRIAL", integers("ACTUAL_START_FIELD", {31, 0}));
  file.set("TRIAL", integers("ACTUAL_END_FIELD", {94, 0}));
  EXPECT_EQ(read().firstFrame, 1);
  file.set("TRIAL", integers("ACTUAL_END_FIELD", {230, 0}));
  EXPECT_EQ(read().firstFrame, 31);
}

TEST_F(C3DQuirks, LooksForNoDataInsideTheParameters) {
  file.frames = file.headerLast = 32;  // a whole block
  file.set("POINT", integers("DATA_START", {2}));
  size_t const fromParametersOn = file.bytes().size() - kC3DBlock;
  file.set("POINT", integers("FRAMES", {static_cast<double>(fromParametersOn / 16)}));
  Take const take = read();
  EXPECT_EQ(take.frameCount, 32);
  EXPECT_EQ(take.points[1].positions.at(0).values[0], 2);
}

TEST_F(C3DQuirks, AnyScaleBelowZeroMeansFloats) {
  file.scale = -0.0005;
  file.set("POINT", reals("SCALE", {file.scale}));
  for (int frame = 0; frame < 4; ++frame)
    for (double const value : {1.5, -2.5, 1000.0, 3.0, 4.25, 5.0, 6.0, -1.0}) appendC3DReal(file.data, value);
  Take const take = read();
  EXPECT_EQ(take.variant, "Intel, float");
  ASSERT_EQ(take.points[0].positions.count(), 4);
  EXPECT_EQ(take.points[0].positions.at(3).values, (KeyTrack::Values{1.5, -2.5, 1000, 0}));
  EXPECT_NEAR(take.points[0].residuals.at(0).values[0], 3 * 0.0005, 1e-9);
  EXPECT_TRUE(take.points[1].positions.empty());
}

// Zeros that fill up the last block are no frames; those before it are points at the origin.
TEST_F(C3DQuirks, CountsZerosBeforeTheLastBlockOfLongTakes) {
  file.headerLast = 65'535;
  file.set("POINT", integers("FRAMES", {-1}));
  file.frames = 65'600;  // 2050 blocks
  for (int i = 0; i < file.frames * 8; ++i) appendC3DWord(file.data, i < (file.frames - 100) * 8 ? 7 : 0);
  EXPECT_EQ(read().frameCount, file.frames - 32);
}

TEST_F(C3DQuirks, MergesEventsOfHeaderAndGroup) {
  file.set("EVENT", integers("USED", {3}));
  file.set("EVENT", texts("LABELS", 11, {"Foot Strike", "Foot Off", "Late"}));
  file.set("EVENT", C3DParameter{"TIMES", C3DParameter::Type::Real, {2, 2}, {}, {0, 1.5, 2, 0.25}});
  file.set("EVENT", C3DParameter{"TIMES2", C3DParameter::Type::Real, {2, 1}, {}, {3, 0}});
  std::string bytes = file.bytes(), events;
  for (unsigned const word : {12345u, 2u, 0u}) appendC3DWord(events, word);
  appendC3DReal(events, 1.5);
  appendC3DReal(events, 7);
  bytes.replace(298, events.size(), events);
  bytes.replace(396, 8, "FootJUMP");
  folder.file("small.c3d", bytes);
  Take const take = readC3D(path);
  ASSERT_EQ(take.events.size(), 4u);
  EXPECT_EQ(take.events[1].seconds, 120.25);
  EXPECT_EQ(take.events[2].label, "Late");
  EXPECT_EQ(take.events[2].seconds, 180);
  EXPECT_EQ(take.events[3].label, "JUMP");
  EXPECT_EQ(take.events[3].seconds, 7);
}

TEST_F(C3DQuirks, AssumesARateWhereTheFileHasNone) {
  file.set("POINT", reals("RATE", {-5}));
  EXPECT_EQ(read().rate, 100);  // the header's
  std::string bytes = file.bytes();
  bytes.replace(20, 4, std::string(4, '\0'));
  folder.file("small.c3d", bytes);
  Take const take = readC3D(path);
  EXPECT_EQ(take.rate, Take().rate);
  EXPECT_TRUE(hasNote(take.notes, kWarning, "no usable frame rate"));
}

}  // namespace
}  // namespace talix
