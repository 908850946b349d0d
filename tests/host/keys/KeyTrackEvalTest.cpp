// Values of key tracks between their keys.
#include <cmath>
#include <gtest/gtest.h>
#include <random>
#include <tuple>
#include <vector>

#include "host/keys/KeyTrack.h"
#include "host/keys/SampleTimes.h"

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
  for (int64 const t : times) track.set(t, {curve(static_cast<double>(t))});
  return track;
}

Values aboutZ(double angle) { return {0, 0, std::sin(angle / 2), std::cos(angle / 2)}; }
double angleAboutZ(Values const& q) { return 2 * std::atan2(q[2], q[3]); }

TEST(KeyTrackEval, EmptyTrackHasTheDefaults) {
  Values out{};
  for (Interpolation const kind : kAllKinds) {
    KeyTrack(Shape::Vector).evaluate(5, kind, {1, 2, 3}, out);
    EXPECT_EQ(out, (Values{1, 2, 3}));
    EXPECT_EQ(KeyTrack(Shape::Scalar).evaluateComponent(5, kind, 0, 8), 8);
  }
}

TEST(KeyTrackEval, TheEndsHoldAndKeysAreMet) {
  KeyTrack track(Shape::Scalar);
  for (auto const& [time, value] : {std::pair{10, 1.0}, {20, 3.0}, {50, -2.0}}) track.set(time, {value});
  for (Interpolation const kind : kAllKinds) {
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
  double ends[3];
  track.sample(SampleTimes(INT64_MIN, int64{1} << 62, 3), kLinear, {}, KeyTrack::kAll, ends, 1);
  EXPECT_NEAR(ends[1], -1, 1e-15);
  EXPECT_EQ(ends[2], 5);
}

TEST(KeyTrackEval, CubicOverUnevenTimes) {
  std::vector<int64> const times = {0, 10, 14, 40, 41, 60};
  auto const line = [](double t) { return 3 - 0.25 * t; };
  auto const parabola = [](double t) { return 0.5 * t * t - 3 * t + 1; };
  KeyTrack const lines = sample(times, line), parabolas = sample(times, parabola);
  for (int64 t = 0; t <= 60; ++t) {
    EXPECT_NEAR(scalarAt(lines, t, kCubic), line(static_cast<double>(t)), 1e-12);
    if (t >= 10 && t <= 41) {
      EXPECT_NEAR(scalarAt(parabolas, t, kCubic), parabola(static_cast<double>(t)), 1e-9);
    }
  }
  // Keys 0, 0, 8, 8 one tick apart times 10: in the middle of the first span the slopes are 0 and 4 per span,
  // which bends the curve by -(4 - 0) / 8; the middle span is symmetric.
  KeyTrack const step = sample({0, 10, 20, 30}, [](double t) { return t < 15 ? 0.0 : 8.0; });
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
  for (Interpolation const kind : {kLinear, kCubic}) {
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
    double const expected = scalarAt(angles, t, kCubic);
    EXPECT_NEAR(std::remainder(angleAboutZ(out) - expected, 2 * std::acos(-1.0)), 0, 1e-9) << t;
    EXPECT_NEAR(out[0] * out[0] + out[1] * out[1] + out[2] * out[2] + out[3] * out[3], 1, 1e-12);
  }
}

TEST(KeyTrackEval, SquadIsSmoothAtTheKeys) {
  KeyTrack track(Shape::Rotation);
  Values const keys[] = {
      {0.1, 0.2, 0.3, 0.9}, {0.3, 0.1, 0.2, 0.9}, {0.0, 0.4, 0.1, 0.8}, {-0.2, 0.3, 0.3, 0.9}};
  int64 const times[] = {0, 1'000'000, 4'000'000, 5'000'000};
  for (size_t i = 0; i < 4; ++i) {
    Values q = keys[i];
    double const length = std::sqrt(q[0] * q[0] + q[1] * q[1] + q[2] * q[2] + q[3] * q[3]);
    for (double& v : q) v /= length;
    track.set(times[i], q);
  }
  for (int64 const t : {times[1], times[2]}) {
    Values before{}, at{}, after{};
    track.evaluate(t - 100, kCubic, {}, before);
    track.evaluate(t, kCubic, {}, at);
    track.evaluate(t + 100, kCubic, {}, after);
    double speed = 0;
    for (size_t c = 0; c < 4; ++c) {
      double const arriving = (at[c] - before[c]) / 100, leaving = (after[c] - at[c]) / 100;
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
    int64 const time = static_cast<int64>(random() % 20'000);
    auto const value = [&] { return static_cast<double>(random() % 10'000) / 7; };
    // z is rare, so that its neighbours lie leaves away
    unsigned const mask = i % 100 == 0 ? 4 : 1 + random() % 3;
    track.set(time, {value(), value(), value()}, mask);
  }
  return track;
}

TEST(KeyTrackEval, EachComponentComesFromTheKeysThatHoldIt) {
  std::mt19937 random(11);
  KeyTrack const track = partialTrack(random);
  KeyTrack::Cursor cursor;
  for (int c = 0; c < 3; ++c) {
    KeyTrack alone(Shape::Scalar);
    track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
      if (key.components >> c & 1) alone.set(key.time, {key.values[static_cast<size_t>(c)]});
    });
    ASSERT_EQ(alone.count(), track.countHolding(1u << c));
    for (Interpolation const kind : kAllKinds) {
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

class EvaluationModes : public testing::TestWithParam<std::tuple<Shape, KeyTrack::Limits>> {
 protected:
  int64 upTo(int64 n) { return static_cast<int64>(m_random() % static_cast<uint64>(n + 1)); }

  // Values that repeat, that floats hold, and that only doubles hold.
  Values randomValues() {
    auto const x = static_cast<double>(upTo(6000)) / (upTo(1) ? 1024 : 1000);
    if (m_track.shape() == Shape::Rotation) return upTo(2) ? aboutZ(x) : aboutZ(1);
    return upTo(2) ? Values{x, 1.0 / 3, 2 * x} : Values{1, 2, 3};
  }

  void appendRun() {
    int64 const last = m_track.empty() ? 0 : m_track.timeAt(m_track.count() - 1), period = 1 + upTo(5);
    Values const repeated = randomValues();
    std::vector<double> flat;
    bool const repeats = upTo(1), step = upTo(1);
    int64 n = upTo(400);
    for (int64 i = 0; i < n; ++i) {
      Values const v = repeats && (!step || i < n / 2) ? repeated : randomValues();
      flat.insert(flat.end(), v.begin(), v.begin() + m_track.width());
    }
    if (last < 4000) m_track.append(last + 1 + upTo(9), period, flat.data(), n);
  }

  void edit() {
    int64 const what = upTo(99);
    if (what < 8) m_track.set(upTo(4000), randomValues(), 1 + static_cast<unsigned>(upTo(6)));
    if (what == 8 && !m_track.empty())
      m_track.erase(upTo(m_track.count() - 1), 1 + static_cast<unsigned>(upTo(6)));
    if (what == 9) m_track.select(upTo(4000), upTo(4000));
    if (what == 10) std::swap(m_track, m_other);
    if (what == 11) m_other = m_track;
    if (what == 12 && upTo(9) == 0) m_track.eraseRange(upTo(4000), upTo(4000));
    if (what == 13 && upTo(9) == 0) m_track = KeyTrack(m_track.shape(), std::get<1>(GetParam()));
    if (what == 14) appendRun();
  }

  void compareSamples(SampleTimes const& times, Interpolation kind) {
    Values const defaults = {1, 2, 3, 4};
    unsigned const mask = upTo(2) ? 7 : static_cast<unsigned>(upTo(7));
    ptrdiff_t const stride = m_track.width() + upTo(2);
    constexpr double kUntouched = 99;
    std::vector<double> sampled(static_cast<size_t>(times.count() * stride), kUntouched);
    m_track.sample(times, kind, defaults, mask, sampled.data(), stride);
    for (int64 i = 0; i < times.count(); ++i) {
      Values single{};
      m_track.evaluate(times[i], kind, defaults, single);
      for (int c = 0; c < stride; ++c) {
        bool const wanted =
            c < m_track.width() && (m_track.shape() == Shape::Vector ? mask >> c & 1 : mask != 0);
        ASSERT_NEAR(sampled[static_cast<size_t>(i * stride + c)],
                    wanted ? single[static_cast<size_t>(c)] : kUntouched, 1e-12)
            << "component " << c << " at " << times[i] << ", " << static_cast<int>(kind);
      }
    }
  }

  void compareSamples(Interpolation kind) {
    int64 const start = upTo(4500) - 200;
    compareSamples(SampleTimes(start, 1 + (upTo(1) ? upTo(11) : upTo(900)), upTo(300)), kind);
    if (!m_track.empty()) {  // at the keys, as far as a run has this period
      compareSamples(SampleTimes(m_track.timeAt(upTo(m_track.count() - 1)), 1 + upTo(5), upTo(300)), kind);
    }
    std::vector<int64> times;
    int64 const most = upTo(1) ? 3 : 300;
    for (int64 n = upTo(100), time = start; n > 0; --n) times.push_back(time += upTo(most));
    compareSamples(SampleTimes(times), kind);
  }

  KeyTrack m_track{std::get<0>(GetParam()), std::get<1>(GetParam())}, m_other = m_track;
  std::mt19937 m_random{5};
};

TEST_P(EvaluationModes, AgreeWhateverWasEdited) {
  KeyTrack::Cursor cursor;
  int64 time = 0;
  for (int step = 0; step < 12'000; ++step) {
    edit();
    Interpolation const kind = kAllKinds[upTo(2)];
    time = upTo(99) > 95 ? upTo(4200) - 100 : time + upTo(3);
    Values with{}, without{};
    m_track.evaluate(time, kind, {1, 2, 3, 4}, with, &cursor);
    m_track.evaluate(time, kind, {1, 2, 3, 4}, without);
    ASSERT_EQ(with, without) << "step " << step << " at " << time;
    if (step % 8 == 0) compareSamples(kind);
    if (HasFatalFailure()) FAIL() << "step " << step;
  }
}

INSTANTIATE_TEST_SUITE_P(Tracks, EvaluationModes,
                         testing::Combine(testing::Values(Shape::Scalar, Shape::Vector, Shape::Rotation),
                                          testing::Values(KeyTrack::Limits{8, 4},
                                                          KeyTrack::Limits{256, 32})));

}  // namespace
