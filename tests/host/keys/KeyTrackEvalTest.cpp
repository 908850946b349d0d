// Values of key tracks between their keys.
#include <cmath>
#include <gtest/gtest.h>
#include <random>
#include <vector>

#include "host/keys/KeyTrack.h"

namespace {

using Shape = KeyTrack::Shape;
using Values = KeyTrack::Values;
constexpr auto kConstant = Interpolation::Constant;
constexpr auto kLinear = Interpolation::Linear;
constexpr auto kCubic = Interpolation::Cubic;
constexpr Interpolation kAllKinds[] = {kConstant, kLinear, kCubic};

double scalarAt(KeyTrack const& track, int64 time, Interpolation interpolation) {
  return track.evaluateComponent(time, interpolation, 0, -1);
}

template <class Curve>
KeyTrack sample(std::vector<int64> const& times, Curve curve) {
  KeyTrack track(Shape::Scalar);
  for (const int64 t : times) track.set(t, {curve(static_cast<double>(t))});
  return track;
}

Values aboutZ(double angle) { return {0, 0, std::sin(angle / 2), std::cos(angle / 2)}; }
double angleAboutZ(Values const& q) { return 2 * std::atan2(q[2], q[3]); }

TEST(KeyTrackEval, EmptyTrackHasTheDefaults) {
  Values out{};
  for (const Interpolation kind : kAllKinds) {
    KeyTrack(Shape::Vector).evaluate(5, kind, {1, 2, 3}, out);
    EXPECT_EQ(out, (Values{1, 2, 3}));
    EXPECT_EQ(KeyTrack(Shape::Scalar).evaluateComponent(5, kind, 0, 8), 8);
  }
}

TEST(KeyTrackEval, TheEndsHoldAndKeysAreMet) {
  KeyTrack track(Shape::Scalar);
  for (const auto& [time, value] : {std::pair{10, 1.0}, {20, 3.0}, {50, -2.0}}) track.set(time, {value});
  for (const Interpolation kind : kAllKinds) {
    EXPECT_EQ(scalarAt(track, -1000, kind), 1);
    EXPECT_EQ(scalarAt(track, 10, kind), 1);
    EXPECT_EQ(scalarAt(track, 20, kind), 3);
    EXPECT_EQ(scalarAt(track, 50, kind), -2);
    EXPECT_EQ(scalarAt(track, 1000, kind), -2);
  }
  EXPECT_EQ(scalarAt(track, 19, kConstant), 1);
  EXPECT_EQ(scalarAt(track, 49, kConstant), 3);
  EXPECT_EQ(scalarAt(track, 15, kLinear), 2);
  EXPECT_EQ(scalarAt(track, 26, kLinear), 2);
}

TEST(KeyTrackEval, TheWholeTimeLine) {
  constexpr int64 kEnd = (int64{1} << 62) - 1;
  KeyTrack track(Shape::Scalar);
  track.set(-kEnd, {-1.0});
  track.set(kEnd, {1.0});
  EXPECT_EQ(track.lowerBound(-kEnd + 1), 1);
  EXPECT_NEAR(scalarAt(track, 0, kLinear), 0, 1e-15);
  EXPECT_NEAR(scalarAt(track, kEnd / 2, kCubic), 0.5, 1e-15);
  track.set(0, {5.0});
  EXPECT_EQ(track.timeAt(2), kEnd);
  EXPECT_EQ(scalarAt(track, INT64_MAX, kLinear), 1);
  EXPECT_EQ(scalarAt(track, INT64_MIN, kLinear), -1);
}

TEST(KeyTrackEval, CubicOverUnevenTimes) {
  const std::vector<int64> times = {0, 10, 14, 40, 41, 60};
  const auto line = [](double t) { return 3 - 0.25 * t; };
  const auto parabola = [](double t) { return 0.5 * t * t - 3 * t + 1; };
  const KeyTrack lines = sample(times, line), parabolas = sample(times, parabola);
  for (int64 t = 0; t <= 60; ++t) {
    EXPECT_NEAR(scalarAt(lines, t, kCubic), line(static_cast<double>(t)), 1e-12);
    if (t >= 10 && t <= 41) {
      EXPECT_NEAR(scalarAt(parabolas, t, kCubic), parabola(static_cast<double>(t)), 1e-9);
    }
  }
  // Keys 0, 0, 8, 8 one tick apart times 10: in the middle of the first span the slopes are 0 and 4 per span,
  // which bends the curve by -(4 - 0) / 8; the middle span is symmetric.
  const KeyTrack step = sample({0, 10, 20, 30}, [](double t) { return t < 15 ? 0.0 : 8.0; });
  EXPECT_NEAR(scalarAt(step, 5, kCubic), -0.5, 1e-12);
  EXPECT_NEAR(scalarAt(step, 15, kCubic), 4, 1e-12);
}

TEST(KeyTrackEval, SlerpTakesTheShorterArc) {
  KeyTrack track(Shape::Rotation);
  Values out{};
  track.set(0, aboutZ(0.2));
  track.set(100, aboutZ(1.0));
  track.evaluate(50, kLinear, {}, out);
  EXPECT_NEAR(angleAboutZ(out), 0.6, 1e-12);
  track.evaluate(25, kLinear, {}, out);
  EXPECT_NEAR(angleAboutZ(out), 0.4, 1e-12);

  Values flipped = aboutZ(1.0);  // the same rotation
  for (double& v : flipped) v = -v;
  track.set(100, flipped);
  for (const Interpolation kind : {kLinear, kCubic}) {
    track.evaluate(50, kind, {}, out);
    EXPECT_NEAR(std::abs(out[2] * aboutZ(0.6)[2] + out[3] * aboutZ(0.6)[3]), 1, 1e-12);
  }
  track.evaluate(99, kConstant, {}, out);
  EXPECT_EQ(out, aboutZ(0.2));
}

// About one axis squad is the cubic of the angle.
TEST(KeyTrackEval, SquadAboutOneAxisIsTheCubicOfTheAngle) {
  KeyTrack turns(Shape::Rotation), angles(Shape::Scalar);
  std::mt19937 random(4);
  double angle = 0;
  int64 time = 0;
  for (int i = 0; i < 40; ++i) {
    Values q = aboutZ(angle);
    if (i % 3 == 0)
      for (double& v : q) v = -v;
    turns.set(time, q);
    angles.set(time, {angle});
    angle += std::uniform_real_distribution<double>(-0.5, 0.5)(random);
    time += 40 + static_cast<int64>(random() % 120);
  }
  Values out{};
  for (int64 t = 0; t < time; t += 7) {
    turns.evaluate(t, kCubic, {}, out);
    const double expected = scalarAt(angles, t, kCubic);
    EXPECT_NEAR(std::remainder(angleAboutZ(out) - expected, 2 * std::acos(-1.0)), 0, 1e-9) << t;
    EXPECT_NEAR(out[0] * out[0] + out[1] * out[1] + out[2] * out[2] + out[3] * out[3], 1, 1e-12);
  }
}

TEST(KeyTrackEval, SquadIsSmoothAtTheKeys) {
  KeyTrack track(Shape::Rotation);
  const Values keys[] = {
      {0.1, 0.2, 0.3, 0.9}, {0.3, 0.1, 0.2, 0.9}, {0.0, 0.4, 0.1, 0.8}, {-0.2, 0.3, 0.3, 0.9}};
  const int64 times[] = {0, 1'000'000, 4'000'000, 5'000'000};
  for (size_t i = 0; i < 4; ++i) {
    Values q = keys[i];
    const double length = std::sqrt(q[0] * q[0] + q[1] * q[1] + q[2] * q[2] + q[3] * q[3]);
    for (double& v : q) v /= length;
    track.set(times[i], q);
  }
  for (const int64 t : {times[1], times[2]}) {
    Values before{}, at{}, after{};
    track.evaluate(t - 100, kCubic, {}, before);
    track.evaluate(t, kCubic, {}, at);
    track.evaluate(t + 100, kCubic, {}, after);
    double speed = 0;
    for (size_t c = 0; c < 4; ++c) {
      const double arriving = (at[c] - before[c]) / 100, leaving = (after[c] - at[c]) / 100;
      EXPECT_NEAR(arriving, leaving, 1e-10) << "component " << c << " at " << t;
      speed += std::abs(leaving);
    }
    EXPECT_GT(speed, 1e-8);
  }
}

// Makes a track of some thousand keys of which many lack components, over leaves of a few keys.
KeyTrack partialTrack(std::mt19937& random) {
  KeyTrack track(Shape::Vector, {6, 4});
  for (int i = 0; i < 900; ++i) {
    const int64 time = static_cast<int64>(random() % 20'000);
    const auto value = [&] { return static_cast<double>(random() % 10'000) / 7; };
    // z is rare, so that its neighbours lie leaves away
    const unsigned mask = i % 100 == 0 ? 4 : 1 + random() % 3;
    track.set(time, {value(), value(), value()}, mask);
  }
  return track;
}

TEST(KeyTrackEval, EachComponentComesFromTheKeysThatHoldIt) {
  std::mt19937 random(11);
  const KeyTrack track = partialTrack(random);
  KeyTrack::Cursor cursor;
  for (int c = 0; c < 3; ++c) {
    KeyTrack alone(Shape::Scalar);
    track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
      if (key.components >> c & 1) alone.set(key.time, {key.values[static_cast<size_t>(c)]});
    });
    ASSERT_EQ(alone.count(), track.countHolding(1u << c));
    for (const Interpolation kind : kAllKinds) {
      for (int64 t = -50; t < 20'050; t += 13) {
        Values whole{};
        track.evaluate(t, kind, {}, whole, &cursor);
        ASSERT_EQ(whole[static_cast<size_t>(c)], alone.evaluateComponent(t, kind, 0, -1)) << t;
        ASSERT_EQ(track.evaluateComponent(t, kind, c, -1), whole[static_cast<size_t>(c)]) << t;
      }
    }
  }

  KeyTrack onlyX(Shape::Vector);
  onlyX.set(5, {1, 9, 9}, 1);
  Values out{};
  onlyX.evaluate(0, kLinear, {7, 8, 6}, out);
  EXPECT_EQ(out, (Values{1, 8, 6}));
}

TEST(KeyTrackEval, ACursorChangesNothing) {
  std::mt19937 random(5);
  const auto upTo = [&](int64 n) { return static_cast<int64>(random() % static_cast<uint64>(n + 1)); };
  for (const Shape shape : {Shape::Scalar, Shape::Vector, Shape::Rotation}) {
    KeyTrack track(shape, {8, 4}), other = track;
    KeyTrack::Cursor cursor;
    int64 time = 0;
    for (int step = 0; step < 20'000; ++step) {
      const int64 what = upTo(99);
      const Values values = shape == Shape::Rotation ? aboutZ(static_cast<double>(upTo(6000)) / 1000)
                                                     : Values{static_cast<double>(upTo(9)), 1.0 / 3, 2};
      if (what < 8) track.set(upTo(4000), values, 1 + static_cast<unsigned>(upTo(6)));
      if (what == 8 && !track.empty()) track.erase(upTo(track.count() - 1));
      if (what == 9) track.select(upTo(4000), upTo(4000));
      if (what == 10) std::swap(track, other);
      if (what == 11) other = track;
      if (what == 12 && upTo(20) == 0) track.eraseRange(upTo(4000), upTo(4000));
      if (what == 13 && upTo(20) == 0) track = KeyTrack(shape, {8, 4});

      time = what > 95 ? upTo(4200) - 100 : time + upTo(3);
      const Interpolation kind = kAllKinds[upTo(2)];
      Values with{}, without{};
      track.evaluate(time, kind, {1, 2, 3, 4}, with, &cursor);
      track.evaluate(time, kind, {1, 2, 3, 4}, without);
      ASSERT_EQ(with, without) << "step " << step << " at " << time;
    }
  }
}

}  // namespace
