// Frame rates, timecode, ranges and the time manager.
#include <algorithm>
#include <gtest/gtest.h>
#include <limits>
#include <random>

#include "host/scene/HTimeManager.h"

namespace {

constexpr int64 k120 = kTicksPerSecond / 120;

HFrameRate rateOf(ETimecodeStandard standard) {
  HFrameRate rate;
  rate.setTimecodeStandard(standard);
  return rate;
}

HString timecode(ETimecodeStandard standard, int64 frame) {
  return rateOf(standard).timecodeFromFrame(frame);
}

TEST(FrameRate, UsualRatesHaveWholeTicks) {
  for (double const rate : {23.976, 24.0, 25.0, 29.97, 30.0, 48.0, 50.0, 59.94, 60.0, 100.0, 120.0, 240.0}) {
    bool const ntsc = rate != static_cast<int>(rate);
    double const exact = ntsc ? std::round(rate) * 1000 / 1001 : rate;
    double const ticks = static_cast<double>(kTicksPerSecond) / exact;
    EXPECT_NEAR(static_cast<double>(ticksPerFrameAt(exact)), ticks, 1e-6) << rate;
    EXPECT_NEAR(ticks, std::round(ticks), 1e-6) << rate;
  }
  EXPECT_EQ(ticksPerFrameAt(705'600'000.0 * 4), 1);
  EXPECT_EQ(ticksPerFrameAt(1e-300), kForever);
}

TEST(FrameRate, RefusesRatesThatCannotBe) {
  HFrameRate rate;
  for (double const bad : {0.0, -1.0, 2000.1, std::numeric_limits<double>::infinity(),
                           std::numeric_limits<double>::quiet_NaN()}) {
    rate.setFrameRate(bad);
    EXPECT_EQ(rate.getFrameRate(), 120);
  }
  EXPECT_FALSE(rate.setTimecodeStandard(static_cast<ETimecodeStandard>(6)));
  EXPECT_FALSE(rate.setTimecodeStandard(static_cast<ETimecodeStandard>(-1)));
  EXPECT_EQ(rate, HFrameRate());
}

TEST(FrameRate, StandardsHaveNamesAndRates) {
  constexpr char const* names[] = {"ntsc", "ntscDrop", "pal", "film", "filmNtsc", "Custom"};
  constexpr double rates[] = {30000.0 / 1001, 30000.0 / 1001, 25, 24, 24000.0 / 1001, 120};
  for (int i = 0; i < 6; ++i) {
    ETimecodeStandard standard = CUSTOM;
    ASSERT_TRUE(HFrameRate::getTimecodeStandardFromString(names[i], standard));
    EXPECT_EQ(standard, i);
    EXPECT_STREQ(HFrameRate::getTimecodeStandardName(standard), names[i]);
    EXPECT_EQ(rateOf(standard).getFrameRate(), rates[i]);
  }
  ETimecodeStandard standard = FILM;
  for (char const* other : {"NTSC", "custom", "", "ntsc ", "palx"})
    EXPECT_FALSE(HFrameRate::getTimecodeStandardFromString(other, standard)) << other;
  EXPECT_EQ(standard, FILM);
}

// Counts timecode up frame by frame, as a clock would, for a whole day.
TEST(DropFrame, RightAtEveryFrameAroundEveryMinute) {
  HFrameRate const rate = rateOf(NTSC_DROP);
  int64 frame = 0;
  for (int minute = 0; minute < 24 * 60; ++minute) {
    int const first = minute % 10 ? 2 : 0;
    for (int number = first; number < 1800; ++number, ++frame) {
      if (number > 3 && number < 1797) continue;
      HString expected;
      expected.Format("%02d:%02d:%02d;%02d", minute / 60, minute % 60, number / 30, number % 30);
      ASSERT_STREQ(rate.timecodeFromFrame(frame), expected);
      int64 back = -1;
      ASSERT_TRUE(rate.frameFromTimecode(expected, back)) << expected.GetStr();
      ASSERT_EQ(back, frame);
    }
    for (int left = 0; left < first; ++left) {
      HString never;
      never.Format("%02d:%02d:00;%02d", minute / 60, minute % 60, left);
      EXPECT_FALSE(rate.frameFromTimecode(never, frame)) << never.GetStr();
    }
  }
  EXPECT_EQ(frame, 2'589'408);  // frames of a day of drop-frame timecode
}

TEST(DropFrame, TwiceTheRateDropsTwiceTheNumbers) {
  HFrameRate rate = rateOf(NTSC_DROP);
  rate.setFrameRate(60000.0 / 1001);
  EXPECT_EQ(rate.timecodeFromFrame(3599), "00:00:59;59");
  EXPECT_EQ(rate.timecodeFromFrame(3600), "00:01:00;04");
  EXPECT_EQ(rate.timecodeFromFrame(35964), "00:10:00;00");
  EXPECT_EQ(rate.withoutDrop().timecodeFromFrame(3600), "00:01:00:00");
  EXPECT_EQ(rate.withoutDrop().getTicksPerFrame(), rate.getTicksPerFrame());
  EXPECT_EQ(rateOf(PAL).withoutDrop(), rateOf(PAL));
}

TEST(Timecode, OfOtherStandards) {
  EXPECT_EQ(timecode(PAL, 25 * 3600 * 101 + 24), "101:00:00:24");
  EXPECT_EQ(timecode(FILM_NTSC, 24 * 60), "00:01:00:00");
  EXPECT_EQ(timecode(NTSC, -31), "-00:00:01:01");
  EXPECT_EQ(HFrameRate().timecodeFromFrame(119), "00:00:00:119");
  HFrameRate half;
  half.setFrameRate(0.5);
  EXPECT_EQ(half.timecodeFromFrame(3), "00:00:03:00");
  for (int64 const frame : {std::numeric_limits<int64>::min(), std::numeric_limits<int64>::max()})
    EXPECT_GT(timecode(NTSC_DROP, frame).GetLength(), 12);
}

TEST(Timecode, RefusesTextsThatAreNone) {
  int64 frame = 77;
  for (char const* text :
       {"", "-", "1", "00:00:00", "00:00:00:25", "00:60:00:00", "00:00:60:00", "00:00:00:00:00", "a:0:0:0",
        "00;00:00:00", "00:00:00,01", " 00:00:00:01", "00:00:00:01 ", "--1:0:0:0", "1234567890:0:0:0", ":::"})
    EXPECT_FALSE(rateOf(PAL).frameFromTimecode(text, frame)) << text;
  EXPECT_EQ(frame, 77);
  EXPECT_TRUE(rateOf(PAL).frameFromTimecode("-0:0:1;3", frame));
  EXPECT_EQ(frame, -28);
  EXPECT_TRUE(rateOf(PAL).frameFromTimecode("999999999:59:59:24", frame));
  EXPECT_EQ(frame, 1'000'000'000LL * 3600 * 25 - 1);
}

TEST(TimeManager, FramesAndTicks) {
  HTimeManager time;
  EXPECT_EQ(time.getTime(-3), -3 * k120);
  EXPECT_EQ(time.getFrame(2 * k120 - 1), 1);
  EXPECT_EQ(time.getFrame(-2 * k120 + 1), -1) << "truncated toward zero";
  EXPECT_EQ(time.getFrame(kForever), INT32_MAX);
  EXPECT_EQ(time.getFrame(-kForever), INT32_MIN);
  EXPECT_EQ(time.getFrameDouble(-k120 / 2), -0.5);
  EXPECT_EQ(time.getTimeFromFrameDouble(0.5), k120 / 2);
  EXPECT_EQ(time.getTimeFromFrameDouble(-1.25), -k120 - k120 / 4);
  EXPECT_EQ(time.getTimeFromFrameDouble(1e30), kForever);
  EXPECT_EQ(time.getTimeFromFrameDouble(-std::numeric_limits<double>::infinity()), -kForever);
  EXPECT_EQ(time.getTimeFromFrameDouble(std::numeric_limits<double>::quiet_NaN()), 0);
  std::mt19937_64 random(5);
  for (int i = 0; i < 1000; ++i) {
    auto const frame = static_cast<int>(random());
    EXPECT_EQ(time.getFrame(time.getTime(frame)), frame);
    EXPECT_EQ(time.getTimeFromFrameDouble(frame), time.getTime(frame));
    EXPECT_EQ(time.getFrameDouble(time.getTime(frame)), frame);
  }
  HFrameRate slow;
  slow.setFrameRate(0.001);
  time.setFrameRate(slow);
  EXPECT_EQ(time.getTime(INT32_MAX), kForever);
  EXPECT_EQ(time.getTime(INT32_MIN), -kForever);
}

TEST(TimeManager, RoundsToFrameBoundariesFromAnOrigin) {
  HTimeManager time;
  using enum HTimeManager::ERoundDirection;
  std::mt19937_64 random(6);
  for (int i = 0; i < 2000; ++i) {
    int64 const origin = static_cast<int64>(random() % 1000) - 500;
    int64 const t = static_cast<int64>(random() % (20 * k120)) - 10 * k120;
    int64 const down = time.frameTime(t, RoundDown, origin), up = time.frameTime(t, RoundUp, origin);
    EXPECT_EQ((down - origin) % k120, 0);
    EXPECT_TRUE(down <= t && t < down + k120);
    EXPECT_EQ(up, t == down ? down : down + k120);
    EXPECT_EQ(time.frameTime(t, RoundNearest, origin), t - down < k120 - (t - down) ? down : up);
  }
  EXPECT_EQ(time.frameTime(k120 / 2, RoundNearest, 0), k120) << "half a frame goes up";
  for (int64 const end : {-kForever, kForever})
    for (int64 const origin : {-kForever, int64{0}, kForever})
      for (auto const direction : {RoundDown, RoundNearest, RoundUp})
        EXPECT_LE(std::abs(time.frameTime(end, direction, origin)), kForever);
}

TEST(TimeManager, RoundsRanges) {
  HTimeManager time;
  HTimeRange range(1, 2 * k120 - 1);
  time.frameRange(range, true, 0);
  EXPECT_EQ(range, HTimeRange(0, 2 * k120));
  range.setEnds(1, 2 * k120 - 1);
  time.frameRange(range, false, 0);
  EXPECT_EQ(range, HTimeRange(k120, k120));
  range.setEnds(1, 2);
  time.frameRange(range, false, 0);
  EXPECT_TRUE(range.isEmpty()) << "no frame lies inside";
  range = HTimeRange();
  time.frameRange(range, true, 0);
  EXPECT_TRUE(range.isEmpty());
  range = HTimeRange::forever();
  time.frameRange(range, true, 7);
  EXPECT_EQ(range, HTimeRange::forever());
}

TEST(TimeManager, FramesFromTexts) {
  HTimeManager time;
  for (auto const& [text, frames] : {std::pair{"12", 12.0},
                                     {"-2.5", -2.5},
                                     {"1e2", 100.0},
                                     {"", 0.0},
                                     {"inf", 0.0},
                                     {"12 ", 0.0},
                                     {"00:00:01:06", 126.0},
                                     {"-00:00:01:00", -120.0}})
    EXPECT_EQ(time.stringToFrameDouble(text, false), frames) << text;
  HFrameRate drop;
  drop.setTimecodeStandard(NTSC_DROP);
  time.setFrameRate(drop);
  EXPECT_EQ(time.stringToFrameDouble("00:10:00;00", false), 17982);
  EXPECT_EQ(time.stringToFrameDouble("00:10:00;00", true), 18000);
  EXPECT_EQ(time.stringToFrameDouble("00:01:00;00", false), 0) << "a number that is left out";
  EXPECT_EQ(time.stringToFrameDouble("00:01:00:00", true), 1800);
  drop.setFrameRate(60000.0 / 1001);
  time.setFrameRate(drop);
  EXPECT_EQ(time.stringToFrameDouble("00:01:00:00", true), 3600);
}

TEST(TimeManager, PlayRangeHoldsTheTime) {
  HTimeManager time;
  time.setTime(50 * k120, true);
  time.setPlayRange({0, 10 * k120}, true);
  EXPECT_EQ(time.getTime(), 50 * k120);
  time.setPlayRange({0, 10 * k120}, false);
  EXPECT_EQ(time.getTime(), 10 * k120);
  time.setPlayRange({20 * k120, 30 * k120}, false);
  EXPECT_EQ(time.getTime(), 20 * k120);
  time.setPlayRange({5, -5}, false);
  EXPECT_EQ(time.getTime(), 20 * k120);
  time.setTime(std::numeric_limits<int64>::max(), true);
  EXPECT_EQ(time.getTime(), kForever);
}

TEST(TimeManager, SelectedRangesStaySortedAndDisjoint) {
  std::mt19937_64 random(7);
  for (int round = 0; round < 100; ++round) {
    HTimeManager time;
    std::vector<bool> held(200);
    for (int i = 0; i < 12; ++i) {
      auto const start = static_cast<int64>(random() % 190),
                 end = start + static_cast<int64>(random() % 10) - 2;
      time.addSelectedTimeRange({start, end});
      for (int64 t = start; t <= end; ++t) held[static_cast<size_t>(t)] = true;
    }
    std::vector<bool> read(200);
    for (int i = 0; i < time.getNumSelectedRanges(); ++i) {
      HTimeRange const range = time.getSelectedTimeRange(i);
      ASSERT_FALSE(range.isEmpty());
      if (i > 0) {
        ASSERT_LT(time.getSelectedTimeRange(i - 1).getEnd(), range.getStart());
      }
      for (int64 t = range.getStart(); t <= range.getEnd(); ++t) read[static_cast<size_t>(t)] = true;
    }
    ASSERT_EQ(read, held);
  }
}

TEST(TimeRange, UnionAndIntersection) {
  HTimeRange range;
  range.include(HTimeRange(5, 3));
  EXPECT_TRUE(range.isEmpty());
  range.include(7);
  EXPECT_EQ(range, HTimeRange(7, 7));
  range.include(HTimeRange(-2, 1));
  EXPECT_EQ(range, HTimeRange(-2, 7));
  range.intersect(HTimeRange(0, 100));
  EXPECT_EQ(range, HTimeRange(0, 7));
  EXPECT_TRUE(range.contains(0) && range.contains(7) && !range.contains(8) && !range.contains(-1));
  range.intersect(HTimeRange(8, 9));
  EXPECT_TRUE(range.isEmpty());
  range = HTimeRange::forever();
  range.include(HTimeRange::forever());
  EXPECT_EQ(range.getEnd() - range.getStart(), std::numeric_limits<int64>::max() - 1);
}

}  // namespace
