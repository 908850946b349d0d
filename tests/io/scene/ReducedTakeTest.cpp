// Real takes, thinned and saved: what is saved has the frames of the original and its values within the
// tolerance.
#include "host/keys/KeyReduction.h"
#include "tests/io/scene/SceneTesting.h"

namespace talix {

namespace {

constexpr ReductionTolerances kTolerances{.length = 0.5, .angle = 0.01, .ofRange = 0.001};

class ReducedTakeTest : public SceneTest {
 protected:
  // Reduces every channel of a name; answers the part of their keys that stays.
  static double reduceAll(char const* name) {
    double before = 0, after = 0;
    const HTimeRange all[] = {HTimeRange::forever()};
    for (int i = 0; i < g_db->getNumModules(); ++i) {
      Controller* channel = g_db->getModule(i)->getChannel(name);
      if (!channel) continue;
      before += channel->getNumKeys();
      channel->reduceKeys(all, kTolerances);
      after += channel->getNumKeys();
    }
    return after / before;
  }
};

TEST_F(ReducedTakeTest, MarkersKeepTheirFramesAndGaps) {
  for (char const* file : {"walkset_a_le_int.c3d", "push_nan_01.c3d", "nan_m_01.trc"}) {
    g_db->newScene();
    openFile(file);
    const Take before = save();
    EXPECT_LT(reduceAll("Translation"), 0.95) << file;
    const Take after = save();
    ASSERT_EQ(after.points.size(), before.points.size());
    for (size_t i = 0; i < before.points.size(); ++i) {
      const KeyTrack &old = before.points[i].positions, &now = after.points[i].positions;
      ASSERT_EQ(now.count(), old.count()) << file << " " << before.points[i].label;
      for (int64 k = 0; k < old.count(); ++k) {
        ASSERT_EQ(now.timeAt(k), old.timeAt(k));
        ASSERT_LE((Vec3(now.at(k).values.data()) - Vec3(old.at(k).values.data())).length(), 0.5 + 1e-9);
      }
    }
  }
}

TEST_F(ReducedTakeTest, BonesKeepTheirMotion) {
  openFile("gesture_01.bvh");
  const Take before = save();
  EXPECT_LT(reduceAll("Rotation"), 0.9);
  const Take after = save();
  for (size_t i = 0; i < before.joints.size(); ++i) {
    const KeyTrack &old = before.joints[i].rotations, &now = after.joints[i].rotations;
    ASSERT_EQ(now.count(), old.count());
    for (int64 k = 0; k < old.count(); ++k) {
      double dot = 0;
      for (size_t c = 0; c < 4; ++c) dot += now.at(k).values[c] * old.at(k).values[c];
      ASSERT_GE(std::abs(dot), std::cos(0.01 / 2) - 1e-12) << before.joints[i].name << " key " << k;
    }
  }
}

}  // namespace

}  // namespace talix
