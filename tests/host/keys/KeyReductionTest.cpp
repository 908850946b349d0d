// Thinning curves: the new curve against the original one, and what must stay.
#include <cmath>
#include <set>

#include "host/keys/KeyReduction.h"
#include "host/services/HInterface.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

using Shape = KeyTrack::Shape;

constexpr int64 kPeriod = 100;

class KeyReductionTest : public SceneTest {
 protected:
  // A random curve of runs of lines, waves, steps, noise and rest, some of them off the frames, with gaps;
  // `partial`: with keys of single components.
  KeyTrack randomCurve(Shape shape, bool partial) {
    KeyTrack track(shape, {.leafKeys = 8, .fanout = 4});
    int64 time = -3000;
    Vec3 at = randomVec(1), slope;
    for (int run = 0; run < 8; ++run) {
      size_t const kind = below(5);
      slope = randomVec(0.05);
      int64 const step = below(4) ? kPeriod : kPeriod * 2 / 3;
      for (size_t i = 0, count = 3 + below(40); i < count; ++i) {
        time += step;
        if (kind == 0) at = at + slope;
        if (kind == 1) at = at + slope * std::sin(0.2 * static_cast<double>(i));
        if (kind == 2 && below(6) == 0) at = randomVec(1);
        if (kind == 3) at = at + randomVec(0.002);
        unsigned const mask = partial && below(3) == 0 ? 1u << below(3) : unsigned{KeyTrack::kAll};
        track.set(time, valuesOf(shape, at), mask);
      }
      if (below(2)) time += static_cast<int64>(below(12)) * kPeriod;
    }
    return track;
  }

  static KeyTrack::Values valuesOf(Shape shape, Vec3 const& at) {
    if (shape != Shape::Rotation) return {at.x, at.y, at.z};
    KeyTrack::Values values;
    TalixRotation(at).getQuaternion(values.data());
    return values;
  }

  static double distance(Shape shape, KeyTrack::Values const& a, KeyTrack::Values const& b) {
    if (shape == Shape::Scalar) return std::abs(a[0] - b[0]);
    if (shape == Shape::Vector) return (Vec3(a.data()) - Vec3(b.data())).length();
    TalixRotation from, to, turn;
    from.setQuaternion(a.data());
    to.setQuaternion(b.data());
    double q[4];
    (from.inverse() * to).getQuaternion(q);
    return 2 * std::atan2(std::hypot(q[0], q[1], q[2]), std::abs(q[3]));
  }

  // The farthest that the curves part at any frame or key of the original.
  static double farthest(KeyTrack const& original, KeyTrack const& reduced, Interpolation kind) {
    std::set<int64> times;
    for (int64 t = original.timeAt(0) / kPeriod * kPeriod; t <= original.timeAt(original.count() - 1);
         t += kPeriod)
      times.insert(t);
    for (int64 i = 0; i < original.count(); ++i) times.insert(original.timeAt(i));
    double most = 0;
    for (int64 const t : times) {
      KeyTrack::Values a{}, b{};
      original.evaluate(t, kind, {}, a);
      reduced.evaluate(t, kind, {}, b);
      most = std::max(most, distance(original.shape(), a, b));
    }
    return most;
  }

  static KeyTrack reducedBy(KeyTrack const& track, ReductionRule const& rule) {
    KeyTrack reduced = track;
    reduced.thin(redundantKeys(track, rule));
    return reduced;
  }
};

TEST_F(KeyReductionTest, NoCurveDeviatesBeyondTheToleranceAndEndsStay) {
  for (Shape const shape : {Shape::Scalar, Shape::Vector, Shape::Rotation})
    for (Interpolation const kind : {Interpolation::Constant, Interpolation::Linear, Interpolation::Cubic})
      for (bool const partial : {false, true}) {
        if (partial && shape != Shape::Vector) continue;
        int64 removed = 0;
        for (int round = 0; round < 60; ++round) {
          KeyTrack const track = randomCurve(shape, partial);
          double const tolerance = std::pow(10, uniform(-4, -0.5));
          KeyTrack const reduced =
              reducedBy(track, {.interpolation = kind, .tolerance = tolerance, .framePeriod = kPeriod});
          removed += track.count() - reduced.count();
          ASSERT_LE(farthest(track, reduced, kind), tolerance * (1 + 1e-9)) << static_cast<int>(kind);
          ASSERT_STREQ(reduced.checkInvariants(), "");
          ASSERT_EQ(reduced.at(0).components, track.at(0).components);
          ASSERT_EQ(reduced.timeAt(reduced.count() - 1), track.timeAt(track.count() - 1));
          for (int64 i = 0; i + 1 < track.count(); ++i) {
            int64 const next = track.timeAt(i + 1);
            if (track.timeAt(i) >= (next - 1) / kPeriod * kPeriod || next <= 0) continue;
            ASSERT_GE(reduced.find(track.timeAt(i)), 0) << "before a gap";
            ASSERT_GE(reduced.find(next), 0) << "after a gap";
          }
        }
        EXPECT_GT(removed, 200) << static_cast<int>(shape) << static_cast<int>(kind) << partial;
      }
}

TEST_F(KeyReductionTest, WhatIsSimpleIsFoundOut) {
  KeyTrack line(Shape::Scalar), steps(Shape::Scalar), arc(Shape::Rotation), parabola(Shape::Scalar);
  for (int64 i = 0; i <= 1000; ++i) {
    auto const x = static_cast<double>(i);
    line.set(i * kPeriod, {3 * x - 7});
    steps.set(i * kPeriod, {std::floor(x / 100)});
    arc.set(i * kPeriod, valuesOf(Shape::Rotation, {0, 0.003 * x, 0}));
    parabola.set(i * kPeriod, {1e-3 * x * x});
  }
  auto const left = [](KeyTrack const& track, Interpolation kind, double tolerance) {
    return reducedBy(track, {.interpolation = kind, .tolerance = tolerance, .framePeriod = kPeriod}).count();
  };
  EXPECT_EQ(left(line, Interpolation::Linear, 1e-9), 2);
  EXPECT_EQ(left(line, Interpolation::Cubic, 1e-9), 2);
  EXPECT_EQ(left(line, Interpolation::Constant, 1e-9), 1001);
  EXPECT_EQ(left(steps, Interpolation::Constant, 0), 11);  // each step's first
  EXPECT_EQ(left(steps, Interpolation::Linear, 0), 21);    // its ends, of which the last has one
  EXPECT_EQ(left(arc, Interpolation::Linear, 1e-6), 2);
  EXPECT_LE(left(parabola, Interpolation::Cubic, 0.1), 12);
  // A line deviates by s * s / 8 * 2e-3 from a span of s frames.
  EXPECT_NEAR(static_cast<double>(left(parabola, Interpolation::Linear, 0.1)), 1001 / 20.0 + 1, 2);
}

TEST_F(KeyReductionTest, OnlyKeysThatMayGoDo) {
  KeyTrack line(Shape::Scalar);
  for (int64 i = 0; i <= 20; ++i) line.set(i * kPeriod, {2.0 * static_cast<double>(i)});
  line.select(4 * kPeriod, 9 * kPeriod);
  ReductionRule const rule{.tolerance = 1e-9, .framePeriod = kPeriod, .mayGo = [](KeyTrack::Key const& key) {
                             return key.time % 300 != 0;
                           }};
  KeyTrack const reduced = reducedBy(line, rule);
  EXPECT_EQ(reduced.count(), 8);
  EXPECT_EQ(reduced.countSelected(), 2) << "what stays keeps its selection";
}

// --- channels ---

class ReduceChannelTest : public SceneTest {
 protected:
  // One key a frame where `seen` is no blank, on a line.
  void fill(Vec3Controller* channel, std::string const& seen, double bend = 0) {
    for (size_t i = 0; i < seen.size(); ++i)
      if (seen[i] != ' ') {
        auto const x = static_cast<double>(i);
        channel->setKey(static_cast<int64>(i) * kFrame, {x, bend * x * x, 0}, KeyTrack::kAll);
      }
  }
  static int reduceAll(Controller* channel, ReductionTolerances const& by) {
    HTimeRange const all[] = {HTimeRange::forever()};
    return channel->reduceKeys(all, by);
  }
  // x: a key, -: a bridge, blank: no data.
  static std::string data(Controller const* channel, int frames) {
    KeyTrack const& track = *channel->findActiveTrack();
    std::string text;
    for (int i = 0; i < frames; ++i)
      text += track.find(i * kFrame) >= 0 ? 'x' : track.bridgedAt(i * kFrame) ? '-' : ' ';
    return text;
  }
  static std::string keys(Controller const* channel, int frames) {
    std::string text;
    for (int i = 0; i < frames; ++i) text += channel->hasKeyAt(i * kFrame) ? 'x' : ' ';
    return text;
  }

  Clip* m_clip = create<Clip>("clip");
  Marker* m_marker = create<Marker>("marker");
  Vec3Controller* m_channel = m_marker->getTranslationChannel();
  ReductionTolerances m_tolerances{.length = 0.1, .angle = 0.1, .ofRange = 0.001};
};

TEST_F(ReduceChannelTest, ThinningOpensNoGapAndClosesNone) {
  fill(m_channel, "xxxxxx   xx xxxx");
  m_marker->setFillType(3 * kFrame, Marker::Filled, false);
  EXPECT_EQ(reduceAll(m_channel, m_tolerances), 6);
  EXPECT_EQ(data(m_channel, 16), "x----x   xx x--x");
  EXPECT_EQ(m_marker->getFillType(3 * kFrame), Marker::Filled);
  EXPECT_EQ(reduceAll(m_channel, m_tolerances), 0);
  BoolController const* occluded = m_marker->getOccludedChannel();
  EXPECT_FALSE(occluded->getValue(3 * kFrame));
  EXPECT_TRUE(occluded->getValue(7 * kFrame));
}

TEST_F(ReduceChannelTest, ReducedCurvesCanBeReducedFurther) {
  fill(m_channel, std::string(200, 'x'), 0.01);
  EXPECT_GT(reduceAll(m_channel, m_tolerances), 100);
  int const left = m_channel->getNumKeys();
  EXPECT_GT(reduceAll(m_channel, {.length = 1, .angle = 0, .ofRange = 0}), left / 3);
  EXPECT_EQ(data(m_channel, 201).find(' '), 200u);
}

TEST_F(ReduceChannelTest, LayersAboveTellNothingOfGaps) {
  fill(m_channel, "xx   xx");
  m_clip->addLayer();
  g_db->setActiveLayer(1);
  fill(m_channel, "xx  xxx");
  EXPECT_EQ(reduceAll(m_channel, m_tolerances), 3);
  EXPECT_FALSE(m_marker->isSeenAt(3 * kFrame));
}

TEST_F(ReduceChannelTest, RangesThatHoldEveryKeyAndSelectionOfAllAreAll) {
  std::string wanted;
  for (int way = 0; way < 3; ++way) {
    m_channel->deleteKeys(HTimeRange::forever(), KeyTrack::kAll, true);
    fill(m_channel, "xxxxxxxxxxxxx  xxxxxxxxx", 0.05);
    m_channel->selectKeys(HTimeRange::forever(), KeyTrack::kAll);
    HTimeRange const ranges[] = {{0, 6 * kFrame}, {6 * kFrame + 1, 40 * kFrame}};
    int const removed = way == 0   ? reduceAll(m_channel, m_tolerances)
                        : way == 1 ? m_channel->reduceKeys(ranges, m_tolerances)
                                   : m_channel->reduceSelectedKeys(m_tolerances);
    std::string const left = keys(m_channel, 24);
    EXPECT_EQ(left.substr(12, 4), "x  x");
    EXPECT_EQ(removed, 22 - m_channel->getNumKeys());
    if (way == 0) wanted = left;
    EXPECT_EQ(left, wanted) << way;
  }
}

TEST_F(ReduceChannelTest, ToleranceGoesByTheKindOfChannel) {
  // Wobbles of 0.05 are nothing for a position, but much for a channel of range 0.1, nothing for one of 100.
  auto* scale = m_marker->getScaleChannel();
  auto* whole = static_cast<IntController*>(m_marker->addChannel("Count", DataSource::IntProperty));
  whole->setInterpType(static_cast<int>(Interpolation::Linear));
  auto const wobble = [&](double end) {
    for (int i = 0; i < 10; ++i) {
      Vec3 const value(i == 9 ? end : 0.05 * (i % 2), 0, 0);
      m_channel->setKey(i * kFrame, value, KeyTrack::kAll);
      scale->setKey(i * kFrame, value, KeyTrack::kAll);
      whole->setKey(i * kFrame, i == 9 ? static_cast<int>(end) : i % 2, KeyTrack::kAll);
    }
  };
  wobble(0.1);
  EXPECT_EQ(reduceAll(m_channel, m_tolerances), 8);
  EXPECT_EQ(reduceAll(scale, m_tolerances), 0);
  EXPECT_EQ(reduceAll(whole, m_tolerances), 0);
  wobble(100);
  EXPECT_EQ(reduceAll(scale, m_tolerances), 7);
}

}  // namespace
