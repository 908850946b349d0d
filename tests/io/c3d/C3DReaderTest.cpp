// Real takes: their known figures, and the ways in which files store the same thing.
#include <cmath>
#include <gtest/gtest.h>
#include <numeric>

#include "host/time/Ticks.h"
#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "tests/io/c3d/C3DTestFiles.h"

namespace talix {
namespace {

int64 framesNotSeen(const Take& take) {
  int64 missing = 0;
  for (const TakePoint& point : take.points) missing += take.frameCount - point.positions.count();
  return missing;
}

int64 neverSeen(const Take& take) {
  return std::count_if(take.points.begin(), take.points.end(),
                       [](const TakePoint& point) { return point.positions.empty(); });
}

int gapsAfterStart(const Take& take) {
  int gaps = 0;
  for (const TakePoint& point : take.points) {
    for (int64 i = 1; i < point.positions.count(); ++i)
      if (point.positions.timeAt(i) - point.positions.timeAt(i - 1) > ticksPerFrameAt(take.rate)) ++gaps;
    const int64 last = (take.firstFrame + take.frameCount - 1) * ticksPerFrameAt(take.rate);
    const int64 count = point.positions.count();
    if (count && point.positions.timeAt(count - 1) < last) ++gaps;
  }
  return gaps;
}

struct Figures {
  const char* file;
  const char* variant;
  size_t points, outputs, channels, events;
  int64 frames;
  double rate;
  const char* unit;
  int64 notSeen;
  const char* firstLabel;
};

class C3DFigures : public testing::TestWithParam<Figures> {};

TEST_P(C3DFigures, AreAsTheFileHasThem) {
  const Figures& expected = GetParam();
  const Take take = readC3D(dataFile(expected.file));
  EXPECT_EQ(take.format, "C3D");
  EXPECT_EQ(take.name + ".c3d", expected.file);
  EXPECT_EQ(take.variant, expected.variant);
  EXPECT_EQ(take.points.size(), expected.points);
  EXPECT_EQ(take.outputs.size(), expected.outputs);
  EXPECT_EQ(take.analog.size(), expected.channels);
  EXPECT_EQ(take.events.size(), expected.events);
  EXPECT_EQ(take.firstFrame, 1);
  EXPECT_EQ(take.frameCount, expected.frames);
  EXPECT_NEAR(take.rate, expected.rate, 1e-4);
  EXPECT_EQ(take.fileUnit, expected.unit);
  EXPECT_FALSE(take.unitAssumed);
  EXPECT_EQ(framesNotSeen(take), expected.notSeen);
  EXPECT_EQ(take.points.empty() ? std::string() : take.points[0].label, expected.firstLabel);
}

INSTANTIATE_TEST_SUITE_P(
    Takes, C3DFigures,
    testing::Values(
        Figures{"walkset_a_le_int.c3d", "Intel, integer", 26, 0, 16, 3, 450, 50, "mm", 226, "RFT1"},
        Figures{"walkset_a_le_real.c3d", "Intel, float", 26, 0, 16, 3, 450, 50, "mm", 226, "RFT1"},
        Figures{"walkset_a_be_int.c3d", "MIPS, integer", 26, 0, 16, 3, 450, 50, "mm", 226, "RFT1"},
        Figures{"walkset_a_be_real.c3d", "MIPS, float", 26, 0, 16, 3, 450, 50, "mm", 226, "RFT1"},
        Figures{"walkset_a_vax_int.c3d", "DEC, integer", 26, 0, 16, 3, 450, 50, "mm", 226, "RFT1"},
        Figures{"walkset_a_vax_real.c3d", "DEC, float", 26, 0, 16, 3, 450, 50, "mm", 226, "RFT1"},
        Figures{"walkset_a_layout_padafter.c3d", "Intel, integer", 26, 0, 16, 3, 450, 50, "mm", 226, "RFT1"},
        Figures{"gait_results_events_01.c3d", "DEC, float", 0, 24, 16, 6, 101, 100, "mm", 0, ""},
        Figures{"push_nan_01.c3d", "Intel, float", 41, 0, 0, 0, 700, 69.9926, "m", 6384, "Probe1"},
        Figures{"probe_nan_01.c3d", "Intel, float", 41, 0, 0, 0, 140, 69.5, "m", 250, "Probe1"},
        Figures{"single_frame_01.c3d", "Intel, float", 14, 0, 0, 0, 1, 50, "mm", 0, "PBLeiden01_1"},
        Figures{"malformed_paramoffset_01.c3d", "Intel, float", 41, 0, 0, 0, 111, 250, "mm", 222,
                "Point    1"}),
    [](const auto& instance) {
      const std::string file = instance.param.file;
      return file.substr(0, file.find('.'));
    });

TEST(C3DReader, LoadsAllNumberFormsOfOneTrialAlike) {
  const Take first = readC3D(dataFile("walkset_a_le_int.c3d"));
  for (const char* other : {"walkset_a_be_int", "walkset_a_vax_int", "walkset_a_layout_padafter"})
    EXPECT_EQ(differenceOf(first, readC3D(dataFile(std::string(other) + ".c3d")), 1e-12), "");
  const Take real = readC3D(dataFile("walkset_a_le_real.c3d"));
  for (const char* other : {"walkset_a_be_real", "walkset_a_vax_real"})
    EXPECT_EQ(differenceOf(real, readC3D(dataFile(std::string(other) + ".c3d")), 1e-12), "");
  // A coordinate's step is 1/12 mm in the integer files.
  EXPECT_EQ(differenceOf(first, real, 0.09), "");
}

TEST(C3DReader, ReadsGapsResidualsCamerasAndEventsOfTheWalk) {
  const Take take = readC3D(dataFile("walkset_a_le_int.c3d"));
  EXPECT_EQ(gapsAfterStart(take), 8);
  EXPECT_EQ(neverSeen(take), 0);
  EXPECT_EQ(take.up, Axis::Z);
  EXPECT_FALSE(take.upAssumed);
  const auto withResiduals = [](const TakePoint& point) { return !point.residuals.empty(); };
  ASSERT_TRUE(std::any_of(take.points.begin(), take.points.end(), withResiduals));
  for (const TakePoint& point : take.points)
    EXPECT_TRUE(!withResiduals(point) || point.residuals.count() == point.positions.count()) << point.label;
  EXPECT_EQ(take.points[0].cameras.size(), 450u);
  ASSERT_EQ(take.events.size(), 3u);
  EXPECT_NEAR(take.events[1].seconds, 5.4, 1e-6);
}

TEST(C3DReader, ScalesAnalogChannels) {
  const std::string file = dataFile("walkset_a_le_int.c3d");
  const Take take = readC3D(file);
  EXPECT_EQ(take.analogRate, 200);
  const TakeAnalogChannel& channel = take.analog[0];
  EXPECT_EQ(channel.name, "FX1");
  EXPECT_EQ(channel.unit, "nt");
  EXPECT_EQ(channel.description, "FORCE X-COMP 1");
  EXPECT_NEAR(channel.scale, -0.43, 1e-7);
  EXPECT_EQ(channel.offset, 2048);
  ASSERT_EQ(channel.samples.count(), 1800);
  EXPECT_EQ(channel.samples.timeAt(1) - channel.samples.timeAt(0), ticksPerFrameAt(200));
  EXPECT_EQ(channel.samples.timeAt(0), ticksPerFrameAt(50));
  // The second sample of channel 1 in frame 1: behind 26 points and 16 samples in block 11.
  const std::string bytes = readText(file);
  const size_t at = 10 * 512 + 26 * 8 + 16 * 2;
  const int raw = static_cast<unsigned char>(bytes[at]) | static_cast<unsigned char>(bytes[at + 1]) << 8;
  EXPECT_NEAR(channel.samples.at(1).values[0], (raw - 2048) * -0.43, 1e-4);
}

TEST(C3DReader, ConvertsLengthsToMillimetres) {
  const std::string file = dataFile("push_nan_01.c3d");
  const Take take = readC3D(file), asFeet = readC3D(file, {"ft"}), asMillimetres = readC3D(file, {"mm"});
  EXPECT_EQ(take.unitInMillimetres, 1000);
  EXPECT_TRUE(hasNote(take.notes, TakeNote::Level::Info, "6384 point-frames hold no numbers"));
  EXPECT_TRUE(hasNote(asFeet.notes, TakeNote::Level::Info, "read as ft"));
  for (size_t i = 0; i < take.points.size(); ++i) {
    if (take.points[i].positions.empty()) continue;
    const double x = asMillimetres.points[i].positions.at(0).values[0];
    EXPECT_NEAR(take.points[i].positions.at(0).values[0], 1000 * x, 1e-9);
    EXPECT_NEAR(asFeet.points[i].positions.at(0).values[0], 304.8 * x, 1e-9);
  }
  EXPECT_THROW(readC3D(file, {"furlong"}), FileError);
  EXPECT_EQ(millimetresPerUnit(" Meters"), 1000);
  EXPECT_EQ(millimetresPerUnit("inches"), 25.4);
  EXPECT_EQ(millimetresPerUnit("Feet"), 304.8);
  EXPECT_EQ(millimetresPerUnit("furlong"), 0);
}

TEST(C3DReader, ReadsOutputsAndEventsOfTheGait) {
  const Take take = readC3D(dataFile("gait_results_events_01.c3d"));
  const auto ofKind = [&](const char* kind) {
    return std::count_if(take.outputs.begin(), take.outputs.end(),
                         [&](const ModelOutput& output) { return output.kind == kind; });
  };
  EXPECT_EQ(ofKind("ANGLES"), 10);
  EXPECT_EQ(ofKind("POWERS"), 6);
  EXPECT_EQ(ofKind("FORCES"), 2);
  EXPECT_EQ(ofKind("MOMENTS"), 6);
  EXPECT_EQ(take.outputs[0].name, "LPelvisAngles");
  EXPECT_EQ(take.outputs[0].unit, "deg");
  ASSERT_EQ(take.outputs[0].values.count(), 101);
  EXPECT_NEAR(take.outputs[0].values.at(0).values[0], 12.0390272, 1e-6);
  const TakeEvent& off = take.events[2];
  EXPECT_EQ(off.label, "Foot Off");
  EXPECT_EQ(off.context, "Right");
  EXPECT_EQ(off.subject, "Subject");
  EXPECT_NEAR(off.seconds, 0.58373284, 1e-7);
  EXPECT_EQ(take.events[5].context, "Left");
  EXPECT_TRUE(take.upAssumed);
}

TEST(C3DReader, ReadsAFileWithAWrongArrayLength) {
  const Take take = readC3D(dataFile("malformed_paramoffset_01.c3d"));
  EXPECT_TRUE(hasNote(take.notes, TakeNote::Level::Warning, "UNITS says to hold 128 values"));
  EXPECT_TRUE(hasNote(take.notes, TakeNote::Level::Info, "differs from POINT:SCALE"));
  EXPECT_EQ(neverSeen(take), 2);
  EXPECT_EQ(gapsAfterStart(take), 0);
}

}  // namespace
}  // namespace talix
