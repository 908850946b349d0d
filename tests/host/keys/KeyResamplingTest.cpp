// Curves at the frames of another rate.
#include <cmath>
#include <gtest/gtest.h>
#include <numbers>
#include <random>

#include "host/keys/KeyResampling.h"
#include "host/time/Ticks.h"

namespace {

int64 frame(double rate) { return ticksPerFrameAt(rate); }

KeyTrack sine(double rate, double hertz, double seconds) {
  KeyTrack track(KeyTrack::Shape::Scalar);
  for (int64 i = 0; static_cast<double>(i) <= seconds * rate; ++i)
    track.set(i * frame(rate), {std::sin(2 * std::numbers::pi * hertz * static_cast<double>(i) / rate)});
  return track;
}

double farthestFromSine(KeyTrack const& track, double hertz) {
  double most = 0;
  track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
    double const seconds = static_cast<double>(key.time) / kTicksPerSecond;
    most = std::max(most, std::abs(key.values[0] - std::sin(2 * std::numbers::pi * hertz * seconds)));
  });
  return most;
}

// A line through samples of a sine is off by at most (w h)^2 / 8, w the angular frequency and h the time
// between samples; Catmull-Rom, whose slopes are off by (w h)^2 w / 6, by at most a quarter of that times h
// and the cubic's own (w h)^4 / 384.
TEST(KeyResampling, OfASineStaysWithinTheBound) {
  double const ntsc = 30000.0 / 1001;
  struct Case {
    double from, to, back, hertz;
  };
  for (Case const& c : {Case{120, 60, 120, 2}, Case{ntsc, 25, ntsc, 1}, Case{100, 250, 100, 3}})
    for (Interpolation const kind : {Interpolation::Linear, Interpolation::Cubic}) {
      KeyTrack const track = sine(c.from, c.hertz, 10);
      KeyTrack const there = resampled(track, {kind, frame(c.from), frame(c.to)});
      KeyTrack const back = resampled(there, {kind, frame(c.to), frame(c.back)});
      auto const bound = [&](double rate) {
        double const wh = 2 * std::numbers::pi * c.hertz / rate;
        return kind == Interpolation::Linear ? wh * wh / 8 : wh * wh * wh / 24 + std::pow(wh, 4) / 384;
      };
      // One-sided slopes at the ends of a cubic are less exact: a span of frames there does not count.
      auto const inner = [&](KeyTrack part) {
        part.eraseRange(-kForever, kTicksPerSecond / 5);
        part.eraseRange(kTicksPerSecond * 49 / 5, kForever);
        return part;
      };
      EXPECT_NEAR(static_cast<double>(there.count()), 10 * c.to, 1.5);
      EXPECT_LE(farthestFromSine(inner(there), c.hertz), bound(c.from)) << c.from << " " << c.to;
      EXPECT_LE(farthestFromSine(inner(back), c.hertz), bound(c.from) + bound(c.to)) << c.from << " " << c.to;
      // Every other key was one before.
      if (c.to == 60) {
        EXPECT_LE(farthestFromSine(there, c.hertz), 1e-13);
      }
    }
}

// Runs, bridges, components keyed apart and keys that stand alone, against the definition frame by frame.
TEST(KeyResampling, GapsStayWhereTheyWere) {
  std::mt19937 random(1);
  auto const below = [&](int n) { return static_cast<int64>(random() % static_cast<unsigned>(n)); };
  for (int round = 0; round < 200; ++round) {
    int64 const from = 60 + below(200), to = 20 + below(300);
    if (from == to) continue;
    bool const parts = round % 3 == 0, keepGaps = round % 5 != 0;
    KeyTrack track(KeyTrack::Shape::Vector, {.leafKeys = 8, .fanout = 4});
    for (int64 i = below(5); track.count() < 100; i += below(9) < 7 ? 1 : 1 + below(12)) {
      unsigned const mask = parts ? 1 + static_cast<unsigned>(below(7)) : KeyTrack::kAll;
      track.set(i * from, {static_cast<double>(i), 1, 2}, mask);
      if (below(4) == 0) track.bridge(i * from, i * from, mask);
    }
    int64 const end = track.timeAt(track.count() - 1);
    track.bridge(0, below(static_cast<int>(end)));  // and some to whatever key comes next
    KeyTrack const made = resampled(track, {Interpolation::Linear, from, to, keepGaps});
    EXPECT_STREQ(made.checkInvariants(), "");
    for (unsigned const part : {1u, 2u, 4u}) {
      std::vector<KeyTrack::Key> keys;
      track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
        if (key.components & part) keys.push_back(key);
      });
      for (int64 time = 0; time <= end + to; time += to) {
        bool inRun = false, mayBeAlone = false;
        for (size_t i = 0; i < keys.size(); ++i) {
          bool const goesOn = i + 1 < keys.size() && (!keepGaps || (keys[i].bridges & part) ||
                                                      keys[i + 1].time - keys[i].time <= from);
          inRun = inRun || (goesOn && keys[i].time <= time && time <= keys[i + 1].time);
          mayBeAlone = mayBeAlone || 2 * std::abs(keys[i].time - time) <= to;
        }
        int64 const index = made.find(time);
        bool const has = index >= 0 && (made.at(index).components & part);
        EXPECT_TRUE(inRun ? has : (!has || mayBeAlone)) << round << " " << time << " " << part;
        if (!inRun || !has) continue;
        double const value = track.evaluateComponent(time, Interpolation::Linear, part >> 1, 0);
        EXPECT_NEAR(made.at(index).values[part >> 1], value, 1e-12);
      }
      // No run vanishes: each key of the former curve has a new one within a frame of either rate.
      for (KeyTrack::Key const& key : keys) {
        int64 const next = made.nextHolding(made.lowerBound(key.time - std::max(from, to)) - 1, part);
        EXPECT_TRUE(next >= 0 && made.timeAt(next) <= key.time + std::max(from, to)) << round;
      }
    }
  }
}

TEST(KeyResampling, KeysThatStandAloneGoToTheNearestFrame) {
  KeyTrack track(KeyTrack::Shape::Scalar);
  for (int64 const time : {0, 50, 54, 100}) track.set(time, {static_cast<double>(time)});
  track.select(50, 50);
  KeyTrack const made = resampled(track, {Interpolation::Cubic, 1, 20});
  ASSERT_EQ(made.count(), 4);
  double const expected[][2] = {{0, 0}, {40, 50}, {60, 54}, {100, 100}};
  for (int64 i = 0; i < 4; ++i) {
    EXPECT_EQ(static_cast<double>(made.timeAt(i)), expected[i][0]);
    EXPECT_EQ(made.at(i).values[0], expected[i][1]);
  }
  EXPECT_EQ(made.countSelected(), 1);
  KeyTrack const fewer = resampled(track, {Interpolation::Cubic, 1, 100});
  ASSERT_EQ(fewer.count(), 2);
  EXPECT_EQ(fewer.at(0).values[0], 0);
  EXPECT_EQ(fewer.at(1).values[0], 100);
}

}  // namespace
