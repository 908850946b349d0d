// Keeping the motion of nodes that get other parents, on random scenes with random keys, and reading it in
// blocks.
#include <cmath>
#include <map>
#include <set>

#include "host/keys/DataRanges.h"
#include "host/scene/Devices.h"
#include "host/scene/Setups.h"
#include "host/scene/SubjectManager.h"
#include "host/scene/motion/MotionScope.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

constexpr int kMotionFrames = 40;
constexpr double kDegree = 1 / 57.29577951308232;

double angleBetween(TalixRotation const& a, TalixRotation const& b) {
  Vec3 turn;
  (a.inverse() * b).getAsVector(turn);
  return turn.length();
}

// The greatest difference of two transforms, in units of what is allowed: at times that must be exact, and
// between.
double apart(Transform const& a, Transform const& b, bool exact) {
  double const length = exact ? 1e-9 * (1 + a.position.length()) : 0.0100001;
  return std::max({(a.position - b.position).length() / length,
                   angleBetween(a.rotation, b.rotation) / (exact ? 1e-9 : 0.0100001 * kDegree),
                   exact ? (a.scale - b.scale).length() / 1e-9 : 0});
}

// Warnings that are written while it stands.
class Warnings : public LogSink {
 public:
  Warnings() : m_former(setLogSink(this)) {}
  ~Warnings() override { setLogSink(m_former); }
  void write(LogLevel, std::string_view text) override { texts.emplace_back(text); }
  std::vector<std::string> texts;

 private:
  LogSink* m_former;
};

class MotionTest : public SceneTest {
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

  void place(Node* node, bool scaled) {
    for (size_t i = 0; i < (scaled ? 3u : 2u); ++i) channel(node, i)->setDefaultValues(randomValues(i));
    node->setPreTranslation(randomVec(50));
    node->setPreRotation(randomRotation(), false);
  }

  // Keys at random times, some between frames, some selected, some bridged, some of one component where none
  // is measured.
  void animate(Node* node, bool scaled, size_t kinds) {
    for (size_t i = 0; i < (scaled ? 3u : 2u); ++i) {
      channel(node, i)->setInterpType(kinds > 1 && below(3) == 0 ? static_cast<int>(below(kinds)) : 1);
      if (below(3) == 0) continue;
      KeyTrack track(Controller::shapeOf(channel(node, i)->getPropertyType()));
      size_t const keys = 1 + below(8);
      for (size_t k = 0; k < keys; ++k) {
        int64 const time = static_cast<int64>(below(4 * kMotionFrames)) * kFrame / 4;
        track.set(time, randomValues(i), below(4) || i == 1 || objectAs<Marker>(node) ? 7 : 1u << below(3));
        if (below(3) == 0) track.select(time, time, 7);
        if (below(2)) track.bridge(time, time);
      }
      channel(node, i)->setTrack(g_db->getActiveClip(), g_db->getActiveLayer(), std::move(track));
    }
  }

  void build(int round) {
    bool const scaled = round % 2;
    auto const kinds = 1 + static_cast<size_t>(round % 3);
    g_db->newScene();
    m_nodes.clear();
    for (int i = 0; i < 8; ++i) {
      Module* parent = m_nodes.empty() || below(5) == 0 ? nullptr : oneOf(m_nodes);
      if (parent && below(3) == 0) parent = create<AnalogDevice>("between", parent);
      m_nodes.push_back(below(3) ? create<Node>("node", parent) : create<Marker>("marker", parent));
      place(m_nodes.back(), scaled);
    }
    m_clips = {create<Clip>("one")};
    if (below(2)) m_clips.push_back(create<Clip>("two"));
    for (Clip* clip : m_clips) {
      if (below(2)) clip->addLayer();
      g_db->setActiveClip(clip);
      for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
        g_db->setActiveLayer(layer);
        for (Node* node : m_nodes)
          if (layer == 0 || below(2)) animate(node, scaled, kinds);
      }
    }
    g_db->setActiveLayer(static_cast<int>(below(static_cast<size_t>(m_clips.back()->getNumLayers()))));
  }

  // Nodes in any order, and another one that may become their parent; null: the world.
  void choose(size_t count, std::vector<Node*>& nodes, Node*& target) {
    do {
      std::shuffle(m_nodes.begin(), m_nodes.end(), m_random);
      nodes.assign(m_nodes.begin(), m_nodes.begin() + static_cast<ptrdiff_t>(count));
      target = below(3) ? m_nodes.back() : nullptr;
    } while (target && std::any_of(nodes.begin(), nodes.end(),
                                   [&](Node* node) { return target->isDescendedFrom(node); }));
  }

  static void collectKeyTimes(std::set<int64>& times, Node* node, NLEClip const* clip) {
    for (; node; node = node->getNodeParent())
      for (size_t i = 0; i < 3; ++i)
        for (int layer = 0; layer < clip->getNumLayers(); ++layer)
          if (KeyTrack const* track = channel(node, i)->findTrack(clip, layer))
            for (int64 k = 0; k < track->count(); ++k) times.insert(track->timeAt(k));
  }

  // A marker with keys in a clip has data where its lowest layer with keys does.
  static bool hasData(Node* node, NLEClip const* clip, int64 time) {
    bool measured = false;
    node->getTranslationChannel()->forEachTrack(
        [&](NLEClip const*, int, KeyTrack const&) { measured = true; });
    if (!objectAs<Marker>(node) || !measured) return true;
    for (int layer = 0; layer < clip->getNumLayers(); ++layer)
      if (KeyTrack const* track = node->getTranslationChannel()->findTrack(clip, layer);
          track && !track->empty())
        return DataRanges(*track, kFrame).hasDataAt(time);
    return false;
  }

  static void hang(Node* node, Node* target) {
    if (target) {
      ASSERT_TRUE(target->addChild(node));
    } else if (node->getParent()) {
      node->getParent()->removeChild(node, true);
    }
  }

  struct Sample {
    NLEClip* clip;  // null: default values
    int64 time;
    Node* node;
    bool exact;
    Transform world;
  };
  // Where nodes are in every clip: at their key times and those of all above them and above `target`, at
  // whole frames where they have data, and by default.
  std::vector<Sample> sampled(std::vector<Node*> const& nodes, Node* target, HTimeRange const& range) {
    std::vector<Sample> samples;
    NLEClip* active = g_db->getActiveClip();
    int const layer = g_db->getActiveLayer();
    auto const add = [&](NLEClip* clip, Node* node, int64 time, bool exact) {
      if (!clip || (range.contains(time) && hasData(node, clip, time)))
        samples.push_back({clip, time, node, exact, node->getWorldTransform(time)});
    };
    for (Clip* clip : m_clips) {
      g_db->setActiveClip(clip);
      for (Node* node : nodes) {
        std::set<int64> exact;
        collectKeyTimes(exact, node, clip);
        collectKeyTimes(exact, target, clip);
        for (int64 const time : exact) add(clip, node, time, true);
        for (int i = -2; i < kMotionFrames + 2; ++i) add(clip, node, i * kFrame, false);
      }
    }
    g_db->setActiveClip(nullptr);
    for (Node* node : nodes) add(nullptr, node, 0, true);
    g_db->setActiveClip(active);
    g_db->setActiveLayer(layer);
    return samples;
  }
  // The greatest difference in units of what is allowed, with its place.
  double checked(std::vector<Sample> const& samples, std::string const& where, double between = 1) {
    double most = 0;
    NLEClip* active = g_db->getActiveClip();
    int const layer = g_db->getActiveLayer();
    for (Sample const& sample : samples) {
      g_db->setActiveClip(sample.clip);
      double const far = apart(sample.world, sample.node->getWorldTransform(sample.time), sample.exact) /
                         (sample.exact ? 1 : between);
      EXPECT_LT(far, 1) << where << (sample.exact ? ", exactly" : "") << " at "
                        << static_cast<double>(sample.time) / kFrame << " in "
                        << (sample.clip ? sample.clip->getName().GetStr() : "no clip");
      most = std::max(most, far);
    }
    g_db->setActiveClip(active);
    if (active) g_db->setActiveLayer(layer);
    return most;
  }

  std::vector<Node*> m_nodes;
  std::vector<Clip*> m_clips;
};

// Also of nodes together with their descendants, in whatever order.
TEST_F(MotionTest, TheWorldStaysAsItIsInAllClips) {
  for (int round = 0; round < 300 && !HasFailure(); ++round) {
    build(round);
    std::vector<Node*> nodes;
    Node* target;
    choose(1 + below(4), nodes, target);
    auto const before = sampled(nodes, target, HTimeRange::forever());
    MotionScope const scope(*g_db);
    for (Node* node : nodes) {
      ASSERT_TRUE(node->parentAdjust(target, HTimeRange::forever()));
      hang(node, target);
    }
    checked(before, "round " + std::to_string(round));
  }
}

// Inside selected ranges the world stays as it is, outside the node stays as it is below its parent.
TEST_F(MotionTest, RangesAreKeptAloneAndOnce) {
  Warnings const quiet;
  for (int round = 0; round < 300 && !HasFailure(); ++round) {
    build(round);
    Clip* clip = m_clips.back();
    std::vector<Node*> nodes;
    Node* target;
    choose(1, nodes, target);
    Node* node = nodes[0];
    std::set<int64> times;
    collectKeyTimes(times, node, clip);
    collectKeyTimes(times, target, clip);
    int const first = times.empty() ? 0 : static_cast<int>((*times.begin() + kFrame - 1) / kFrame),
              last = times.empty() ? kMotionFrames : static_cast<int>(*times.rbegin() / kFrame);
    std::vector<HTimeRange> ranges;
    for (int at = first + static_cast<int>(below(10)); at <= last;) {
      int const end = std::min(last, at + 1 + static_cast<int>(below(11)));
      ranges.emplace_back(at * kFrame, end * kFrame);
      at = end + 1 + static_cast<int>(below(10));
    }
    // What one range lets the curve around it deviate, the next ones keep.
    auto const limit = static_cast<double>(ranges.size() + 1);
    m_clips = {clip};
    std::vector<Sample> world;
    for (HTimeRange const& range : ranges)
      for (Sample const& sample : sampled(nodes, target, range))
        // Keeping one range may change a cubic curve between the frames of the next.
        if (sample.clip && (!sample.exact || round % 3 < 2)) world.push_back(sample);
    std::map<int64, Transform> local;
    auto const localOf = [&](int64 time) {
      return Transform{node->getLocalPos(time), node->getLocalRot(time), node->getLocalScale(time)};
    };
    for (int64 time = first * kFrame; time <= last * kFrame; time += kFrame)
      if (hasData(node, clip, time) &&
          std::none_of(ranges.begin(), ranges.end(),
                       [&](HTimeRange const& range) { return range.contains(time); }))
        local[time] = localOf(time);

    MotionScope const scope(*g_db);
    for (HTimeRange const& range : ranges) ASSERT_TRUE(node->parentAdjust(target, range));
    hang(node, target);
    checked(world, "round " + std::to_string(round), limit);
    for (auto const& [time, was] : local)
      ASSERT_LT(apart(was, localOf(time), false), limit)
          << "round " << round << ", outside at frame " << time / kFrame;
  }
}

// What is in the way is said, and nothing else suffers.
TEST_F(MotionTest, LocksAndBlends) {
  for (int round = 0; round < 200 && !HasFailure(); ++round) {
    build(round);
    std::vector<Node*> nodes;
    Node* target;
    choose(2, nodes, target);
    if (nodes[0]->isDescendedFrom(nodes[1]) || nodes[1]->isDescendedFrom(nodes[0])) continue;
    auto* clip = m_clips[below(m_clips.size())];
    size_t const lock = below(4), which = below(2);
    auto const before = sampled({nodes[1]}, target, HTimeRange::forever());
    KeyTrack const* track = channel(nodes[0], which)->findTrack(clip, 0);
    KeyTrack const was =
        track ? *track : KeyTrack(which == 0 ? KeyTrack::Shape::Vector : KeyTrack::Shape::Rotation);
    if (lock == 0) channel(nodes[0], which)->setLocked(true);
    if (lock == 1)
      static_cast<BoolAttribute*>(nodes[0]->getAttribute("Locked"))->setValue(true, true, true, true, true);
    if (lock == 2)
      static_cast<BoolAttribute*>(clip->getAttribute("Locked"))->setValue(true, true, true, true, true);
    if (lock == 3) g_db->setActiveClip(create<BlendClip>("blend"));
    Warnings warnings;
    bool const kept = nodes[0]->parentAdjust(target, HTimeRange::forever());
    EXPECT_EQ(warnings.texts.size(), kept ? 0u : 1u) << "round " << round;
    hang(nodes[0], target);
    if (lock < 3) {
      track = channel(nodes[0], which)->findTrack(clip, 0);
      EXPECT_TRUE(track ? *track == was : was.empty()) << "round " << round;
    }
    if (lock == 2) continue;
    nodes[1]->parentAdjust(target, HTimeRange::forever());
    hang(nodes[1], target);
    checked(before, "round " + std::to_string(round));
  }
}

TEST_F(MotionTest, KeysAreOnlyAddedWhereTheyAreNeeded) {
  auto* clip = create<Clip>("take");
  auto* root = create<Node>("root");
  auto *from = create<Node>("from", root), *to = create<Node>("to", root);
  auto *sparse = create<Node>("sparse", from), *still = create<Node>("still", from);
  for (int i = 0; i <= kMotionFrames; ++i) root->setLocalRot(i * kFrame, TalixRotation({0, 0, 0.02 * i}));
  from->setConstLocalRot(TalixRotation({1, 0, 0}), true);
  to->setConstLocalPos({0, 70, 0});
  still->setConstLocalPos({9, 0, 0});
  for (int const frame : {0, 10, 40}) sparse->setLocalPos(frame * kFrame, {10.0 * frame, 5, 0});
  sparse->getTranslationChannel()->selectKeys(HTimeRange(10 * kFrame, 10 * kFrame), 7);
  for (Node* node : {sparse, still}) {
    Vec3 const before = node->getWSPos(7 * kFrame);
    ASSERT_TRUE(node->parentAdjust(to, HTimeRange::forever()));
    hang(node, to);
    EXPECT_LT((node->getWSPos(7 * kFrame) - before).length(), 1e-9);
  }
  EXPECT_EQ(sparse->getTranslationChannel()->getNumKeys(), 3);
  EXPECT_EQ(sparse->getTranslationChannel()->getNumSelectedKeys(), 1);
  EXPECT_TRUE(sparse->getTranslationChannel()->isKeySelectedAt(10 * kFrame, 7));
  EXPECT_FALSE(sparse->getRotationChannel()->hasKeysInClip(clip)) << "the default value turns";
  EXPECT_FALSE(still->hasKeysInClip(clip, true));
  // A parent that is nowhere else than the former one changes nothing, ends of ranges included.
  auto* beside = create<Node>("beside", root);
  to->setConstLocalPos({0, 0, 0});
  ASSERT_TRUE(sparse->parentAdjust(beside, HTimeRange(3 * kFrame, 5 * kFrame)));
  EXPECT_EQ(sparse->getTranslationChannel()->getNumKeys(), 3);
  // Out of the turning root both channels need keys.
  ASSERT_TRUE(still->parentAdjust(nullptr, HTimeRange::forever()));
  EXPECT_EQ(still->getRotationChannel()->getNumKeys(), kMotionFrames + 1);
  EXPECT_EQ(still->getTranslationChannel()->getNumKeys(), kMotionFrames + 1);
  EXPECT_FALSE(still->getScaleChannel()->hasKeysInClip(clip));
}

TEST_F(MotionTest, TargetsBelowAndValuesBeyondWhatANumberHolds) {
  Warnings const quiet;
  create<Clip>("take");
  auto *from = create<Node>("from"), *node = create<Node>("node"), *child = create<Node>("child", node);
  EXPECT_FALSE(node->parentAdjust(child, HTimeRange::forever()));
  EXPECT_FALSE(node->parentAdjust(node, HTimeRange::forever()));
  from->setConstLocalScale({1e-300, 1, 1});
  node->setLocalPos(0, {1e300, 0, 0});
  EXPECT_FALSE(node->parentAdjust(from, HTimeRange::forever()));
  EXPECT_EQ(node->getLocalPos(0).x, 1e300);
}

// A removed character leaves its markers, which move in the world as before.
TEST_F(MotionTest, RemovedSubjects) {
  for (int round = 0; round < 60 && !HasFailure(); ++round) {
    build(round);
    auto* subject = create<Character>("S");
    auto* setup = create<LabelingSetup>("setup", subject);
    place(subject, round % 2);
    if (below(2)) animate(subject, round % 2, 2);
    std::vector<Node*> markers;
    for (Node* node : m_nodes) {
      if (!node->getParent()) hang(node, subject);
      if (objectAs<Marker>(node)) markers.push_back(node);
    }
    auto const before = sampled(markers, nullptr, HTimeRange::forever());
    ASSERT_TRUE(g_db->getSubjectManager()->removeSubject(subject, true, true, true));
    EXPECT_FALSE(setup->isInScene());
    checked(before, "round " + std::to_string(round));
  }
}

TEST_F(MotionTest, WhatStaysAndWhatGoesWithASubject) {
  auto* clip = create<Clip>("take");
  auto *one = create<Character>("one"), *two = create<Character>("two");
  auto* bone = create<SolvingBone>("bone", one);
  auto *a = create<Marker>("a", one), *b = create<Marker>("two:b", two), *c = create<Marker>("c", a);
  auto* other = create<Marker>("one:a");
  for (int i = 0; i < 9; ++i) a->setLocalPos(i * kFrame, randomVec(30));
  KeyTrack const track = *a->getTranslationChannel()->findTrack(clip, 0);
  a->addConnectingLine(MarkerConnection(bone));
  b->addConnectingLine(MarkerConnection(a));
  a->setSelected(true);
  bone->setSelected(true);
  SubjectManager* subjects = g_db->getSubjectManager();

  EXPECT_FALSE(subjects->removeSubject(nullptr, false, true, true));
  ASSERT_TRUE(subjects->removeSubject(one, false, true, true));
  EXPECT_FALSE(subjects->removeSubject(one, false, true, true));
  EXPECT_EQ(a->getName(), "one:a") << "even where that name is taken";
  EXPECT_EQ(other->getName(), "one:a");
  EXPECT_EQ(c->getFullPathString(), "\\one:c");
  EXPECT_TRUE(a->isUnlabeled() && c->isUnlabeled());
  EXPECT_TRUE(a->getTranslationChannel()->findTrack(clip, 0)->sharesAll(track)) << "nothing was touched";
  EXPECT_EQ(g_db->getNumSelectedModules(), 1);
  EXPECT_TRUE(a->isSelected() && b->isConnectedTo(a));
  EXPECT_EQ(a->getNumConnectingLines(), 0);
  subjects->removeSubject(two, false, true, true);
  EXPECT_EQ(b->getName(), "two:b") << "it has the namespace already";
}

// Blocks give what single questions give: layers, components, pre-transforms, scales, blends.
TEST_F(MotionTest, ReadersAgreeWithNodes) {
  for (int round = 0; round < 60 && !HasFailure(); ++round) {
    build(round);
    std::vector<NLEClip*> shown{nullptr, m_clips.front(), m_clips.back(), create<BlendClip>("blend")};
    TSimpleArray<Module*> sources;
    for (Clip* clip : m_clips) {
      sources.add(clip);
      for (int i = 0; i < 3; ++i) clip->getWeightChannel()->writeKeyAt(i * 9 * kFrame, {uniform(-0.2, 1)}, 7);
    }
    static_cast<BlendClip*>(shown[3])->getSources()->setValue(sources, true, true, true, true);
    std::vector<Node const*> nodes(m_nodes.begin(), m_nodes.end());
    nodes.push_back(nodes[1]);
    for (NLEClip* clip : shown) {
      g_db->setActiveClip(clip);
      SampleTimes const times(-kFrame, kFrame / 3 * (1 + round % 4), 200);
      std::vector<double> matrices(16 * 200 * nodes.size());
      SceneReader const reader(nodes, clip);
      SceneReader::Arrays arrays;
      arrays.matrices = matrices.data();
      reader.readWorld(times, arrays);
      std::vector<Transform> const worlds = reader.readWorld(times);
      for (size_t k = 0; k < worlds.size(); ++k) {
        int64 const time = times[static_cast<int64>(k / nodes.size())];
        Transform const ought = nodes[k % nodes.size()]->getWorldTransform(time);
        ASSERT_LT((worlds[k].position - ought.position).length(), 1e-12 * (1 + ought.position.length()));
        ASSERT_LT(angleBetween(worlds[k].rotation, ought.rotation), 1e-7);
        ASSERT_LT((worlds[k].scale - ought.scale).length(), 1e-12 * (1 + ought.scale.length()));
        double const* m = matrices.data() + 16 * k;
        Vec3 const point = randomVec(10), moved = (ought * Transform{point, {}, {1, 1, 1}}).position;
        Vec3 const byMatrix(m[0] * point.x + m[1] * point.y + m[2] * point.z + m[3],
                            m[4] * point.x + m[5] * point.y + m[6] * point.z + m[7],
                            m[8] * point.x + m[9] * point.y + m[10] * point.z + m[11]);
        ASSERT_LT((byMatrix - moved).length(), 1e-11 * (1 + moved.length()));
      }
    }
  }
}

}  // namespace
