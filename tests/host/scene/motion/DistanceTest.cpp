// Distances over time against measuring frame by frame.
#include <cmath>

#include "host/scene/motion/DistanceUtils.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

using Ranges = TSimpleArray<HTimeRange>;

class DistanceTest : public SceneTest {
 protected:
  DistanceTest() {
    m_clip = create<Clip>("take");
    m_clip->addLayer();
    auto* parent = create<Node>("parent");
    m_a = create<Marker>("a", parent), m_b = create<Marker>("b");
    for (Node* node : {parent, m_a, m_b})
      for (int frame = -20; frame < 40; ++frame) {
        if (below(3) == 0) continue;
        g_db->setActiveLayer(static_cast<int>(below(2)));
        // What turns has keys as well as what moves.
        if (below(4))
          node->setLocalPos(frame * kFrame, randomVec(500));
        else
          node->setLocalRot(frame * kFrame, randomRotation());
      }
  }

  bool hasKey(Node const* node, int64 time) const {
    bool found = false;
    for (int channel = 0; channel < node->getNumChannels(); ++channel)
      for (int layer = 0; layer < 2; ++layer) {
        KeyTrack const* track = node->getChannel(channel)->findTrack(m_clip, layer);
        found = found || (track && track->find(time) >= 0);
      }
    return found;
  }

  Clip* m_clip = nullptr;
  Node *m_a = nullptr, *m_b = nullptr;
};

TEST_F(DistanceTest, StatisticsAreThoseOfTheFramesInTheRanges) {
  for (int round = 0; round < 200; ++round) {
    int64 const step = kFrame * static_cast<int64>(1 + below(3));
    bool const keysOnly = below(2);
    Ranges ranges;
    std::vector<double> all;
    for (size_t i = below(4); i > 0; --i) {
      // Ends on and off the frames; now and then an empty range.
      int64 const start = static_cast<int64>(below(60)) * kFrame / 2 - 22 * kFrame;
      ranges.add(HTimeRange(start, start + static_cast<int64>(below(40)) * kFrame / 2 - kFrame));
      for (int64 time = -60 * kFrame; time < 60 * kFrame; time += step)
        if (ranges[ranges.getCount() - 1].contains(time) &&
            (!keysOnly || (hasKey(m_a, time) && hasKey(m_b, time))))
          all.push_back((m_a->getWSPos(time) - m_b->getWSPos(time)).length());
    }
    double sum = 0, squares = 0, least = 0, greatest = 0;
    for (double d : all) sum += d;
    double const mean = all.empty() ? 0 : sum / static_cast<double>(all.size());
    for (double d : all) squares += (d - mean) * (d - mean);
    if (!all.empty()) {
      least = *std::min_element(all.begin(), all.end());
      greatest = *std::max_element(all.begin(), all.end());
    }
    EXPECT_NEAR(DistanceUtils::getAvgDistance(m_a, m_b, ranges, keysOnly, step), mean, 1e-9);
    EXPECT_NEAR(DistanceUtils::getMinDistance(m_a, m_b, ranges, keysOnly, step), least, 1e-9);
    EXPECT_NEAR(DistanceUtils::getMaxDistance(m_a, m_b, ranges, keysOnly, step), greatest, 1e-9);
    EXPECT_NEAR(DistanceUtils::getDistanceRange(m_a, m_b, ranges, keysOnly, step), greatest - least, 1e-9);
    if (step == kFrame) {
      double const deviation = all.empty() ? 0 : std::sqrt(squares / static_cast<double>(all.size()));
      EXPECT_NEAR(DistanceUtils::getDistanceSD(m_a, m_b, ranges, keysOnly), deviation, 1e-9);
    }
  }
}

TEST_F(DistanceTest, WholeTimeLineCostsOnlyTheKeysWhereTheyAreAMust) {
  HTimeRange const all = HTimeRange::forever(), some(-50 * kFrame, 50 * kFrame);
  EXPECT_EQ(DistanceUtils::getMaxDistance(m_a, m_b, all, true, kFrame),
            DistanceUtils::getMaxDistance(m_a, m_b, some, true, kFrame));
  EXPECT_GT(DistanceUtils::getDistanceSD(m_a, m_b, all, true), 0);
  // A step beyond every time leaves time 0; none stands for the scene's.
  EXPECT_EQ(DistanceUtils::getAvgDistance(m_a, m_b, some, false, INT64_MAX),
            DistanceUtils::getDistance(m_a, m_b, 0));
  EXPECT_EQ(DistanceUtils::getAvgDistance(m_a, m_b, some, false, 0),
            DistanceUtils::getAvgDistance(m_a, m_b, some, false, kFrame));
  g_db->setActiveClip(nullptr);
  EXPECT_EQ(DistanceUtils::getMaxDistance(m_a, m_b, all, true, kFrame), 0);
}

// Distances far larger than their differences lose no digits.
TEST_F(DistanceTest, DeviationOfAlmostEqualDistances) {
  Node *far = create<Node>("far"), *origin = create<Node>("origin");
  g_db->setActiveLayer(0);
  for (int frame = 0; frame < 1000; ++frame) far->setLocalPos(frame * kFrame, {1e9 + frame % 2, 0, 0});
  EXPECT_NEAR(DistanceUtils::getDistanceSD(far, origin, HTimeRange(0, 999 * kFrame), false), 0.5, 1e-9);
}

}  // namespace
