// Parent adjust on random hierarchies with random keys: the world must stay as it is.
#include <cmath>
#include <map>
#include <set>

#include "host/scene/Devices.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

constexpr int kFrames = 40;
constexpr double kDegree = 1 / 57.29577951308232;

double angleBetween(TalixRotation const& a, TalixRotation const& b) {
  Vec3 turn;
  (a.inverse() * b).getAsVector(turn);
  return turn.length();
}

// What of a placement differs, in units of what is allowed: millimetres relative to the size, radians.
double apart(Transform const& a, Transform const& b, double length, double angle) {
  const double size = 1 + a.position.length();
  return std::max({(a.position - b.position).length() / (length * size),
                   angleBetween(a.rotation, b.rotation) / angle, (a.scale - b.scale).length() / angle});
}

// How far a node strayed, in units of what it may between keys.
double strayed(Vec3 const& p, TalixRotation const& r, Vec3 const& q, TalixRotation const& s) {
  return std::max((p - q).length() / 0.0100001, angleBetween(r, s) / (0.0100001 * kDegree));
}

class ParentAdjustTest : public SceneTest {
 protected:
  static Controller* channel(Node* node, size_t i) {
    Controller* channels[] = {node->getTranslationChannel(), node->getRotationChannel(),
                              node->getScaleChannel()};
    return channels[i];
  }

  Controller::Values randomValues(size_t i) {
    Controller::Values values{};
    if (i == 1) {
      // Turns that follow each other, as those of joints do.
      (TalixRotation({0.5, 1, 0}) * TalixRotation(randomVec(0.7))).getQuaternion(values.data());
    } else {
      (i == 0 ? randomVec(300) : Vec3(1.5, 1.5, 1.5) + randomVec(0.5)).getValue(values.data());
    }
    return values;
  }

  // Keys at random times, some of them between frames, some of one component, some selected; most channels
  // are linear.
  void animate(Node* node, bool scaled, size_t kinds) {
    for (size_t i = 0; i < (scaled ? 3u : 2u); ++i) {
      channel(node, i)->setDefaultValues(randomValues(i));
      channel(node, i)->setInterpType(kinds > 1 && below(3) == 0 ? static_cast<int>(below(kinds)) : 1);
      if (below(3) == 0) continue;
      const size_t keys = 1 + below(8);
      for (size_t k = 0; k < keys; ++k) {
        const int64 time = static_cast<int64>(below(4 * kFrames)) * kFrame / 4;
        channel(node, i)->writeKeyAt(time, randomValues(i), below(4) ? 7 : 1u << below(3));
        if (below(3) == 0) channel(node, i)->selectKeys(HTimeRange(time, time), 7);
      }
    }
    node->setPreTranslation(randomVec(50));
    node->setPreRotation(randomRotation(), false);
  }

  void build(bool scaled, size_t kinds) {
    g_db->newScene();
    m_nodes.clear();
    auto* clip = create<Clip>("take");
    if (below(2)) clip->addLayer();
    for (int i = 0; i < 8; ++i) {
      Module* parent = m_nodes.empty() || below(5) == 0 ? nullptr : oneOf(m_nodes);
      if (parent && below(3) == 0) parent = create<AnalogDevice>("between", parent);
      m_nodes.push_back(create<Node>("node", parent));
    }
    for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
      g_db->setActiveLayer(layer);
      for (Node* node : m_nodes)
        if (layer == 0 || below(2)) animate(node, scaled, kinds);
    }
    g_db->setActiveLayer(static_cast<int>(below(static_cast<size_t>(clip->getNumLayers()))));
  }

  // A node and another one that may become its parent; null: the world.
  void choose(Node*& node, Node*& target) {
    do {
      node = oneOf(m_nodes);
      target = below(4) ? oneOf(m_nodes) : nullptr;
    } while (target == node || (target && target->isDescendedFrom(node)));
  }

  void collect(std::set<int64>& times, Node* node) {
    for (; node; node = node->getNodeParent())
      for (size_t i = 0; i < 3; ++i)
        for (int layer = 0; layer < 2; ++layer)
          if (KeyTrack const* track = channel(node, i)->findTrack(g_db->getActiveClip(), layer))
            for (int64 k = 0; k < track->count(); ++k) times.insert(track->timeAt(k));
  }

  static void hang(Node* node, Node* target) {
    if (target) {
      ASSERT_TRUE(target->addChild(node));
    } else if (node->getParent()) {
      node->getParent()->removeChild(node, true);
    }
  }

  std::vector<Node*> m_nodes;
};

TEST_F(ParentAdjustTest, TheWorldStaysAsItIs) {
  double most = 0;
  for (int round = 0; round < 400; ++round) {
    build(round % 2, 1 + static_cast<size_t>(round % 3));
    Node *node, *target;
    choose(node, target);
    std::set<int64> exact, frames;
    collect(exact, node);
    collect(exact, target);
    for (int i = -2; i < kFrames + 2; ++i) frames.insert(i * kFrame);
    std::map<int64, std::vector<Transform>> before;
    for (auto const* times : {&exact, &frames})
      for (const int64 time : *times)
        for (Node const* one : m_nodes) before[time].push_back(one->getWorldTransform(time));

    ASSERT_TRUE(node->parentAdjust(target, HTimeRange::forever()));
    hang(node, target);

    for (const int64 time : exact)
      for (size_t i = 0; i < m_nodes.size(); ++i)
        ASSERT_LT(apart(before[time][i], m_nodes[i]->getWorldTransform(time), 1e-9, 1e-9), 1)
            << "round " << round << ", key at " << time;
    for (const int64 time : frames) {
      const size_t i = static_cast<size_t>(std::find(m_nodes.begin(), m_nodes.end(), node) - m_nodes.begin());
      Transform const &was = before[time][i], is = node->getWorldTransform(time);
      const double far = strayed(was.position, was.rotation, is.position, is.rotation);
      ASSERT_LT(far, 1) << "round " << round << ", frame " << time / kFrame;
      most = std::max(most, far);
    }
  }
  RecordProperty("mostStrayed", std::to_string(most * 0.01));
}

// Inside selected ranges the world stays as it is, outside the node stays as it is below its parent.
TEST_F(ParentAdjustTest, RangesAreAdjustedAloneAndOnce) {
  for (int round = 0; round < 400; ++round) {
    build(round % 2, 1 + static_cast<size_t>(round % 3));
    Node *node, *target;
    choose(node, target);
    std::set<int64> times;
    collect(times, node);
    collect(times, target);
    const int first = times.empty() ? 0 : static_cast<int>((*times.begin() + kFrame - 1) / kFrame),
              last = times.empty() ? kFrames : static_cast<int>(*times.rbegin() / kFrame);
    std::vector<HTimeRange> ranges;
    for (int at = first + static_cast<int>(below(10)); at <= last;) {
      const int end = std::min(last, at + 1 + static_cast<int>(below(11)));
      ranges.emplace_back(at * kFrame, end * kFrame);
      at = end + 1 + static_cast<int>(below(10));
    }
    // What one range lets the curve around it stray, the next ones keep.
    const auto limit = static_cast<double>(ranges.size() + 1);
    std::map<int64, Transform> world, local;
    const auto localOf = [&](int64 time) {
      return Transform{node->getLocalPos(time), node->getLocalRot(time), node->getLocalScale(time)};
    };
    for (int i = first; i <= last; ++i) times.insert(i * kFrame);
    for (const int64 time : times) {
      world[time] = node->getWorldTransform(time);
      local[time] = localOf(time);
    }

    for (HTimeRange const& range : ranges) ASSERT_TRUE(node->parentAdjust(target, range));
    const bool moved = target != node->getNodeParent();
    hang(node, target);

    for (const int64 time : times) {
      const bool inside = std::any_of(ranges.begin(), ranges.end(),
                                      [&](HTimeRange const& range) { return range.contains(time); });
      const bool whole = time % kFrame == 0;
      // Adjusting one range may change a cubic curve between the frames of the next.
      if (!whole && round % 3 == 2) continue;
      if (inside && moved) {
        Transform const &was = world[time], is = node->getWorldTransform(time);
        ASSERT_LT(whole ? strayed(was.position, was.rotation, is.position, is.rotation)
                        : apart(was, is, 1e-9, 1e-9),
                  whole ? limit : 1)
            << "round " << round << ", frame " << time / kFrame;
      } else if (whole) {
        Transform const &was = local[time], is = localOf(time);
        ASSERT_LT(strayed(was.position, was.rotation, is.position, is.rotation), limit)
            << "round " << round << ", outside at frame " << time / kFrame;
      }
    }
  }
}

TEST_F(ParentAdjustTest, KeysAreOnlyAddedWhereTheyAreNeeded) {
  auto* clip = create<Clip>("take");
  auto* root = create<Node>("root");
  auto *from = create<Node>("from", root), *to = create<Node>("to", root);
  auto *sparse = create<Node>("sparse", from), *still = create<Node>("still", from);
  for (int i = 0; i <= kFrames; ++i) root->setLocalRot(i * kFrame, TalixRotation({0, 0, 0.02 * i}));
  from->setConstLocalRot(TalixRotation({1, 0, 0}), true);
  to->setConstLocalPos({0, 70, 0});
  still->setConstLocalPos({9, 0, 0});
  for (const int frame : {0, 10, 40}) sparse->setLocalPos(frame * kFrame, {10.0 * frame, 5, 0});
  sparse->getTranslationChannel()->selectKeys(HTimeRange(10 * kFrame, 10 * kFrame), 7);
  for (Node* node : {sparse, still}) {
    const Vec3 before = node->getWSPos(7 * kFrame);
    ASSERT_TRUE(node->parentAdjust(to, HTimeRange::forever()));
    hang(node, to);
    EXPECT_LT((node->getWSPos(7 * kFrame) - before).length(), 1e-9);
  }
  EXPECT_EQ(sparse->getTranslationChannel()->getNumKeys(), 3);
  EXPECT_TRUE(sparse->getTranslationChannel()->isKeySelectedAt(10 * kFrame, 7));
  EXPECT_EQ(sparse->getTranslationChannel()->getNumSelectedKeys(), 1);
  EXPECT_FALSE(sparse->getRotationChannel()->hasKeysInClip(clip)) << "the default value turns";
  EXPECT_FALSE(still->hasKeysInClip(clip, true));
  // Out of the turning root both need keys.
  ASSERT_TRUE(still->parentAdjust(nullptr, HTimeRange::forever()));
  EXPECT_EQ(still->getRotationChannel()->getNumKeys(), kFrames + 1);
  EXPECT_EQ(still->getTranslationChannel()->getNumKeys(), kFrames + 1);
  EXPECT_FALSE(still->getScaleChannel()->hasKeysInClip(clip));
  // A parent that is nowhere else than the former one changes nothing, ends of ranges included.
  auto* beside = create<Node>("beside", root);
  to->setConstLocalPos({0, 0, 0});
  ASSERT_TRUE(sparse->parentAdjust(beside, HTimeRange(3 * kFrame, 5 * kFrame)));
  EXPECT_EQ(sparse->getTranslationChannel()->getNumKeys(), 3);
}

TEST_F(ParentAdjustTest, MarkersGainNoDataInTheirGaps) {
  create<Clip>("take");
  auto* parent = create<Node>("parent");
  auto* marker = create<Marker>("marker", parent);
  parent->getRotationChannel()->setKey(0, TalixRotation({0, 0, 0}), 7);
  parent->getRotationChannel()->setKey(kFrames * kFrame, TalixRotation({0, 0, 3}), 7);
  const std::set<int> seen = {3, 4, 5, 20, 30};
  for (const int frame : seen) marker->setLocalPos(frame * kFrame, {100.0 * frame, 0, 0});
  KeyTrack bridged = *marker->getTranslationChannel()->findActiveTrack();
  bridged.bridge(20 * kFrame, 20 * kFrame);
  marker->getTranslationChannel()->setTrack(g_db->getActiveClip(), 0, bridged);
  marker->getTranslationChannel()->deleteKey(3 * kFrame, 2 | 4);
  std::map<int, Vec3> before;
  for (int i = 0; i <= kFrames; ++i) before[i] = marker->getWSPos(i * kFrame);
  for (HTimeRange const& range : {HTimeRange::forever(), HTimeRange(10 * kFrame, 25 * kFrame)}) {
    marker->beginDataEdit(range);
    ASSERT_TRUE(marker->parentAdjust(nullptr, range));
    hang(marker, nullptr);
    for (int i = 0; i <= kFrames; ++i) {
      const bool data = seen.contains(i) || (i >= 20 && i <= 30);
      for (size_t k = 0; k < 2; ++k)
        EXPECT_TRUE(data || !channel(marker, k)->hasKeyAt(i * kFrame)) << "frame " << i;
      const double far = (marker->getWSPos(i * kFrame) - before[i]).length();
      EXPECT_TRUE(far < 0.0100001 || !data || !range.contains(i * kFrame)) << "frame " << i;
    }
    EXPECT_EQ(marker->getDataRange(), HTimeRange(3 * kFrame, 30 * kFrame));
    EXPECT_TRUE(marker->isSeenAt(27 * kFrame + 1) && !marker->isSeenAt(18 * kFrame)) << "bridges stay";
    marker->discardDataEdit();
    hang(marker, parent);
  }
  // One that never was measured rides on its parent at all times.
  auto* riding = create<Marker>("riding", parent);
  riding->setConstLocalPos({100, 0, 0});
  const Vec3 there = riding->getWSPos(17 * kFrame);
  ASSERT_TRUE(riding->parentAdjust(nullptr, HTimeRange::forever()));
  hang(riding, nullptr);
  EXPECT_LT((riding->getWSPos(17 * kFrame) - there).length(), 0.0100001);
}

TEST_F(ParentAdjustTest, DefaultsLocksAndTargetsBelow) {
  auto *from = create<Node>("from"), *node = create<Node>("node", from), *child = create<Node>("child", node);
  from->setConstLocalRot(TalixRotation({1, 2, 3}), true);
  from->setConstLocalScale({2, 2, 2});
  node->setConstLocalPos({1, 2, 3});
  const Transform before = child->getWorldTransform(0);
  ASSERT_TRUE(node->parentAdjust(nullptr, HTimeRange::forever()));
  hang(node, nullptr);
  EXPECT_LT(apart(before, child->getWorldTransform(0), 1e-12, 1e-12), 1);

  auto* clip = create<Clip>("take");
  node->setLocalPos(0, {5, 5, 5});
  const KeyTrack was = *node->getTranslationChannel()->findTrack(clip, 0);
  EXPECT_FALSE(node->parentAdjust(child, HTimeRange::forever()));
  EXPECT_FALSE(node->parentAdjust(node, HTimeRange::forever()));
  node->getTranslationChannel()->setLocked(true);
  EXPECT_FALSE(node->parentAdjust(from, HTimeRange::forever()));
  EXPECT_TRUE(*node->getTranslationChannel()->findTrack(clip, 0) == was);
  EXPECT_LT(angleBetween(from->getWSRot(0) * node->getLocalRot(0), before.rotation), 1e-9);

  // Values beyond what a number holds.
  node->getTranslationChannel()->setLocked(false);
  from->setConstLocalScale({1e-300, 1, 1});
  node->setLocalPos(0, {1e300, 0, 0});
  EXPECT_FALSE(node->parentAdjust(from, HTimeRange::forever()));
  EXPECT_EQ(node->getLocalPos(0).x, 1e300);
}

}  // namespace
