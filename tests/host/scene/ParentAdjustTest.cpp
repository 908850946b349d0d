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
double apart(Placement const& a, Placement const& b, double length, double angle) {
  const double size = 1 + a.position.length();
  return std::max({(a.position - b.position).length() / (length * size),
                   angleBetween(a.rotation, b.rotation) / angle, (a.scale - b.scale).length() / angle});
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
    std::map<int64, std::vector<Placement>> before;
    for (auto const* times : {&exact, &frames})
      for (const int64 time : *times)
        for (Node const* one : m_nodes) before[time].push_back(one->getWorldPlacement(time));

    ASSERT_TRUE(node->parentAdjust(target, HTimeRange::forever()));
    hang(node, target);

    for (const int64 time : exact)
      for (size_t i = 0; i < m_nodes.size(); ++i)
        ASSERT_LT(apart(before[time][i], m_nodes[i]->getWorldPlacement(time), 1e-9, 1e-9), 1)
            << "round " << round << ", key at " << time;
    for (const int64 time : frames) {
      const size_t i = static_cast<size_t>(std::find(m_nodes.begin(), m_nodes.end(), node) - m_nodes.begin());
      Placement const &was = before[time][i], is = node->getWorldPlacement(time);
      const double strayed = std::max((was.position - is.position).length() / 0.0100001,
                                      angleBetween(was.rotation, is.rotation) / (0.0100001 * kDegree));
      ASSERT_LT(strayed, 1) << "round " << round << ", frame " << time / kFrame;
      most = std::max(most, strayed);
    }
  }
  RecordProperty("mostStrayed", std::to_string(most * 0.01));
}

}  // namespace
