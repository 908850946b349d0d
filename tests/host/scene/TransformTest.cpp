// World transforms of random hierarchies, and the setters of nodes.
#include <ImathMatrix.h>
#include <limits>

#include "host/scene/Devices.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

using M44 = Imath::M44d;

M44 matrixOf(TalixRotation const& rotation) {
  M44 m;
  for (int row = 0; row < 3; ++row) {
    Vec3 unit;
    unit[row] = 1;
    Vec3 const image = rotation.rotate(unit);
    for (int column = 0; column < 3; ++column) m[row][column] = image[column];
  }
  return m;
}

Imath::V3d imath(Vec3 const& v) { return {v.x, v.y, v.z}; }

// A node's frame in the world: turning and moving in a matrix for row vectors, scale beside it.
struct Frame {
  M44 matrix;
  Vec3 scale{1, 1, 1};
};

struct Channels {
  Vec3 position;
  TalixRotation rotation;
  Vec3 scale;
};

Frame compose(Frame const& parent, Node const& node, Channels const& own) {
  M44 const pre = matrixOf(node.getPreRotation()) * M44().setTranslation(imath(node.getPreTranslation()));
  M44 local = matrixOf(own.rotation) * M44().setTranslation(imath(own.position)) * pre;
  for (int c = 0; c < 3; ++c) local[3][c] *= parent.scale[c];
  return {local * parent.matrix, scaled(parent.scale, own.scale)};
}

// Recursion over all ancestors, nothing cached.
Frame worldOf(Module const* module, int64 time, bool constant) {
  if (!module) return {};
  Frame const parent = worldOf(module->getParent(), time, constant);
  auto const* node = objectAs<Node>(module);
  if (!node) return parent;
  return compose(
      parent, *node,
      constant ? Channels{node->getConstLocalPos(), node->getConstLocalRot(true), node->getConstLocalScale()}
               : Channels{node->getLocalPos(time), node->getLocalRot(time), node->getLocalScale(time)});
}

double apart(Frame const& a, Vec3 const& position, TalixRotation const& rotation, Vec3 const& scale) {
  double most = 0;
  M44 const turning = matrixOf(rotation);
  for (int row = 0; row < 3; ++row)
    for (int c = 0; c < 3; ++c) most = std::max(most, std::abs(a.matrix[row][c] - turning[row][c]));
  for (int c = 0; c < 3; ++c) {
    most = std::max(most, std::abs(a.matrix[3][c] - position[c]));
    most = std::max(most, std::abs(a.scale[c] - scale[c]));
  }
  return most;
}

class TransformTest : public SceneTest {
 protected:
  void build(int count) {
    for (int i = 0; i < 3; ++i) m_clips.push_back(create<Clip>("clip"));
    m_clips.back()->addLayer();
    m_modules = {create<Node>("root"), create<AnalogDevice>("plain")};
    m_nodes = {static_cast<Node*>(m_modules.front())};
    for (int i = 0; i < count; ++i) {
      Module* parent = below(5) ? oneOf(m_modules) : nullptr;
      if (below(4) == 0) {
        m_modules.push_back(create<AnalogDevice>("between", parent));
      } else {
        m_nodes.push_back(create<Node>("node", parent));
        m_modules.push_back(m_nodes.back());
        m_nodes.back()->setConstLocalPos(randomVec(100));
        m_nodes.back()->setPreTranslation(randomVec(50));
      }
    }
  }

  int64 randomTime() { return static_cast<int64>(below(20)) * kFrame / 2; }

  void edit() {
    Node* node = oneOf(m_nodes);
    switch (below(13)) {
      case 0:
        return void(node->setLocalPos(randomTime(), randomVec(100)));
      case 1:
        return node->setLocalRot(randomTime(), randomRotation());
      case 2:
        return void(node->setLocalScale(randomTime(), Vec3(1, 1, 1) + randomVec(0.2)));
      case 3:
        return void(node->setConstLocalPos(randomVec(100)));
      case 4:
        return node->setConstLocalRot(randomRotation(), below(2));
      case 5:
        node->setPreRotation(randomRotation(), below(2));
        return;
      case 6:
        node->setPreTranslation(randomVec(20));
        return;
      case 7: {
        Module* child = oneOf(m_modules);
        if (below(3)) {
          oneOf(m_modules)->addChild(child);
        } else if (child->getParent()) {
          child->getParent()->removeChild(child, false);
        }
        return;
      }
      case 8:
        g_db->setActiveClip(below(4) ? oneOf(m_clips) : nullptr);
        if (below(2)) g_db->setActiveLayer(1);
        return;
      case 9:
        node->getTranslationChannel()->deleteKeys(HTimeRange(0, randomTime()), 7, below(2));
        return;
      case 10:
        return node->getRotationChannel()->setInterpType(static_cast<int>(below(3)));
      case 11:
        return void(node->setWSPos(randomTime(), randomVec(300)));
      case 12: {
        node->beginDataEdit(HTimeRange::forever());
        node->setLocalPos(randomTime(), randomVec(1000));
        node->setConstLocalRot(randomRotation(), true);
        node->getWSPos(0);
        return node->discardDataEdit();
      }
    }
  }

  std::vector<Clip*> m_clips;
  std::vector<Module*> m_modules;
  std::vector<Node*> m_nodes;
};

TEST_F(TransformTest, CachedTransformsEqualFreshOnesWhateverIsEdited) {
  build(60);
  for (int step = 0; step < 3000; ++step) {
    edit();
    // Now and then all at one time, mostly a few at the time before: that is when stale ones would show.
    int64 const time = step % 3 ? 2 * kFrame : randomTime();
    size_t const readers = step % 50 ? 6 : m_nodes.size();
    for (size_t i = 0; i < readers; ++i) {
      Node const* node = readers == m_nodes.size() ? m_nodes[i] : oneOf(m_nodes);
      ASSERT_LT(apart(worldOf(node, time, false), node->getWSPos(time), node->getWSRot(time),
                      node->getWSScale(time)),
                1e-8)
          << "step " << step;
    }
    Node const* node = oneOf(m_nodes);
    ASSERT_LT(
        apart(worldOf(node, 0, true), node->getConstWSPos(), node->getConstWSRot(), node->getConstWSScale()),
        1e-8);
  }
}

TEST_F(TransformTest, CachedTransformsFollowRemovalAndBlends) {
  build(30);
  Node* top = create<Node>("top");
  auto* between = create<AnalogDevice>("between", top);
  auto* leaf = create<Node>("leaf", between);
  g_db->setActiveClip(m_clips[0]);
  top->setLocalPos(0, {10, 0, 0});
  g_db->setActiveClip(m_clips[1]);
  top->setLocalPos(0, {30, 0, 0});
  auto* blend = create<BlendClip>("blend");
  g_db->setActiveClip(blend);
  EXPECT_EQ(leaf->getWSPos(0).x, 0);
  TSimpleArray<Module*> sources;
  sources.add(m_clips[0]);
  sources.add(m_clips[1]);
  blend->getSources()->setValue(sources, true, true, true, true);
  EXPECT_EQ(leaf->getWSPos(0).x, 20);
  m_clips[0]->getWeightChannel()->setConstValue(3, true);
  EXPECT_EQ(leaf->getWSPos(0).x, 15);
  m_clips[1]->getWeightChannel()->setConstValue(0, true);
  EXPECT_EQ(leaf->getWSPos(0).x, 10);
  remove(m_clips[0]);
  EXPECT_EQ(leaf->getWSPos(0).x, 0) << "only a source without weight is left";
  remove(blend);
  EXPECT_EQ(g_db->getActiveClip(), nullptr);
  EXPECT_EQ(leaf->getWSPos(0).x, 0);
  g_db->setActiveClip(m_clips[1]);
  EXPECT_EQ(leaf->getWSPos(0).x, 30);
  remove(m_clips[1]);
  EXPECT_EQ(leaf->getWSPos(0).x, 0);
}

TEST_F(TransformTest, SettersReadBack) {
  build(40);
  for (int step = 0; step < 600; ++step) {
    g_db->setActiveClip(step % 5 ? oneOf(m_clips) : nullptr);
    g_db->setActiveLayer(static_cast<int>(below(2)));
    Node* node = oneOf(m_nodes);
    int64 const time = randomTime();
    Vec3 const position = randomVec(500), scale = Vec3(2, 2, 2) + randomVec(1);
    TalixRotation const rotation = randomRotation();
    auto const near = [](TalixRotation const& a, TalixRotation const& b) {
      Vec3 way;
      (a.inverse() * b).getAsVector(way);
      return way.length();
    };
    switch (step % 3) {
      case 0:
        node->setLocalPos(time, position);
        node->setLocalRot(time, rotation);
        node->setLocalScale(time, scale);
        EXPECT_LT((node->getLocalPos(time) - position).length(), 1e-9);
        EXPECT_LT(near(node->getLocalRot(time), rotation), 1e-9);
        EXPECT_LT((node->getLocalScale(time) - scale).length(), 1e-9);
        break;
      case 1:
        node->setWSPos(time, position);
        node->setWSRot(time, rotation);
        node->setWSScale(time, scale);
        EXPECT_LT((node->getWSPos(time) - position).length(), 1e-7);
        EXPECT_LT(near(node->getWSRot(time), rotation), 1e-9);
        EXPECT_LT((node->getWSScale(time) - scale).length(), 1e-9);
        break;
      case 2:
        node->setConstWSPos(position);
        node->setConstWSRot(rotation);
        node->setConstWSScale(scale);
        EXPECT_LT((node->getConstWSPos() - position).length(), 1e-7);
        EXPECT_LT(near(node->getConstWSRot(), rotation), 1e-9);
        EXPECT_LT((node->getConstWSScale() - scale).length(), 1e-9);
        node->setConstLocalRot(rotation, false);
        EXPECT_LT(near(node->getConstLocalRot(false), rotation), 1e-9);
        EXPECT_LT(near(node->getConstLocalRot(true), node->getPreRotation().inverse() * rotation), 1e-9);
        break;
    }
  }
}

TEST_F(TransformTest, OneFrameSeenFromAnother) {
  build(40);
  for (int i = 0; i < 300; ++i) edit();
  for (int i = 0; i < 100; ++i) {
    Node *node = oneOf(m_nodes), *space = oneOf(m_nodes);
    int64 const time = randomTime();
    Transform const seen{node->getPosInSpaceOfNode(time, space), node->getRotInSpaceOfNode(time, space),
                         node->getScaleInSpaceOfNode(time, space)};
    Transform const back = space->getWorldTransform(time) * seen;
    EXPECT_LT((back.position - node->getWSPos(time)).length(), 1e-7);
    EXPECT_LT((back.rotation.rotate({1, 2, 3}) - node->getWSRot(time).rotate({1, 2, 3})).length(), 1e-9);
    EXPECT_LT((back.scale - node->getWSScale(time)).length(), 1e-9);
    EXPECT_LT(node->getPosInSpaceOfNode(time, node).length(), 1e-9);
    EXPECT_EQ(node->getPosInSpaceOfNode(time, nullptr), node->getWSPos(time));
  }
}

TEST_F(TransformTest, PreTransformsInTheWorld) {
  build(20);
  for (int i = 0; i < 50; ++i) {
    Node* node = oneOf(m_nodes);
    TalixRotation const wanted = randomRotation(), before = node->getConstWSRot();
    node->setPreTranslationWS({7, 8, 9});
    node->setPreRotationWS(wanted);
    EXPECT_LT((node->getPreTranslationWS() - Vec3(7, 8, 9)).length(), 1e-9);
    EXPECT_LT((node->getPreRotationWS().rotate({1, 2, 3}) - wanted.rotate({1, 2, 3})).length(), 1e-12);
    node->setConstWSRot(before);
    node->setPreRotation(randomRotation(), true);
    EXPECT_LT((node->getConstWSRot().rotate({1, 2, 3}) - before.rotate({1, 2, 3})).length(), 1e-12);
  }
}

TEST_F(TransformTest, FlatAndUnsoundValuesDoNoHarm) {
  constexpr double nan = std::numeric_limits<double>::quiet_NaN();
  auto* parent = create<Node>("parent");
  auto* node = create<Node>("node", parent);
  parent->setConstLocalScale({0, 1, 1});
  node->setWSPos(0, {5, 6, 7});
  EXPECT_EQ(node->getLocalPos(0), Vec3(0, 6, 7)) << "what is squashed lies at 0";
  node->setWSScale(0, {2, 2, 2});
  EXPECT_EQ(node->getLocalScale(0), Vec3(0, 2, 2));
  EXPECT_FALSE(node->setLocalPos(0, {nan, 0, 0}));
  EXPECT_FALSE(node->setConstLocalPos({0, nan, 0}));
  EXPECT_FALSE(node->setWSPos(0, {0, 0, nan}));
  EXPECT_EQ(node->getLocalPos(0), Vec3(0, 6, 7));
  EXPECT_FALSE(node->setPreTranslation({0, nan, 0}));
}

TEST_F(TransformTest, DeepChainsAreNoProblem) {
  Node* last = nullptr;
  for (int i = 0; i < 20'000; ++i) {
    last = create<Node>("n", last);
    last->setConstLocalPos({1, 0, 0});
  }
  EXPECT_EQ(last->getWSPos(0).x, 20'000);
  Node* root = last;
  while (root->getNodeParent()) root = root->getNodeParent();
  root->setConstLocalPos({0, 0, 0});
  EXPECT_EQ(last->getWSPos(0).x, 19'999);
  TSimpleArray<Module*> all;
  root->getModAndDecedents(all);
  EXPECT_EQ(all.getCount(), 20'000);
  EXPECT_EQ(g_db->getModuleWithPath(last->getFullPathString(), nullptr, false), last);
  remove(root);
  EXPECT_EQ(g_db->getNumModules(), 0);
}

}  // namespace
