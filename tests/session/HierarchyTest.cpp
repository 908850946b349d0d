// "parent -adjust" and "unparent -adjust" on a recorded skeleton: the motion in the world is kept.
#include <algorithm>
#include <gtest/gtest.h>

#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "session/Session.h"

namespace {

struct Deviation {
  double position = 0, relative = 0, angle = 0;  // mm, parts, degrees

  void add(Transform const& was, Transform const& is) {
    double const far = (was.position - is.position).length();
    Vec3 turn;
    (was.rotation.inverse() * is.rotation).getAsVector(turn);
    position = std::max(position, far);
    relative = std::max({relative, far / (1 + was.position.length()), turn.length()});
    angle = std::max(angle, turn.length() * 57.29577951308232);
  }
};

class SkeletonTest : public testing::TestWithParam<char const*> {
 protected:
  ~SkeletonTest() override { g_db->newScene(); }
  void run(std::string const& line) {
    auto const& result = session.run(line);
    ASSERT_FALSE(result.failed()) << line << ": " << (result.log.empty() ? "" : result.log[0].text);
  }
  Node const* bone(std::string const& name) {
    return objectAs<Node>(g_db->getModuleWithPath(HString(name), nullptr, false));
  }

  talix::Session session{TALIX_BIN "/TalixDataCommands.so"};
};

// 30 frames a second; in a scene of 50 the keys lie between the scene's frames.
TEST_P(SkeletonTest, KeepsItsMotion) {
  run("newScene");
  if (*GetParam()) run(std::string("open \"" TALIX_TEST_DATA "/") + GetParam() + "\"");
  run("open \"" TALIX_TEST_DATA "/gesture_01.bvh\"");
  HTimeManager* time = HTimeManager::getInstance();
  Controller const* hips = bone("Hips")->getRotationChannel();
  std::vector<int64> keys, frames;
  for (int i = 0; i < hips->getNumKeys(); ++i) keys.push_back(hips->getKeyTime(i));
  ASSERT_GT(keys.size(), 50u);
  for (int64 at = 0; at <= keys.back(); at += time->getTicksPerFrame()) frames.push_back(at);

  for (char const* lines :
       {"select LeftHand Head Hips -primary Hips|parent -adjust", "select LeftHand|unparent -adjust",
        "select RightArm LeftHand|parent -adjust", "select LeftUpLeg Neck|unparent -adjust"}) {
    // The nodes that move, and whose children move with them.
    std::string const text = lines;
    size_t const cut = text.find('|');
    run(text.substr(0, cut));
    std::vector<Node const*> nodes;
    for (int i = 0; i < g_db->getNumSelectedNodes(); ++i) nodes.push_back(g_db->getSelectedNode(i));
    std::vector<Transform> before;
    for (auto const* times : {&keys, &frames})
      for (int64 const at : *times)
        for (Node const* node : nodes) before.push_back(node->getWorldTransform(at));
    run(text.substr(cut + 1));
    Deviation atKeys, between;
    auto was = before.begin();
    for (auto const* times : {&keys, &frames})
      for (int64 const at : *times)
        for (Node const* node : nodes)
          (times == &keys ? atKeys : between).add(*was++, node->getWorldTransform(at));
    EXPECT_LT(atKeys.relative, 1e-9) << lines;
    EXPECT_LE(between.position, 0.0100001) << lines;
    EXPECT_LE(between.angle, 0.0100001) << lines;
    std::printf("%s: %g relative at keys; %g mm, %g degrees at frames\n", lines, atKeys.relative,
                between.position, between.angle);
  }
}
INSTANTIATE_TEST_SUITE_P(Scenes, SkeletonTest, testing::Values("", "walkset_a_le_int.c3d"),
                         [](auto const& test) { return *test.param ? "BetweenFrames" : "AtFrames"; });

}  // namespace
