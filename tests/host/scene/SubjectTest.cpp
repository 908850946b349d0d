// A removed character leaves its markers, which move in the world as before.
#include "host/scene/Bones.h"
#include "host/scene/Setups.h"
#include "host/scene/SubjectManager.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

class SubjectTest : public SceneTest {
 protected:
  static constexpr int kFrames = 40;

  static bool removeSubject(Character* subject, bool removeLabels = true) {
    return g_db->getSubjectManager()->removeSubject(subject, removeLabels, true, true);
  }

  void place(Node* node) {
    node->setPreTranslation(randomVec(50));
    node->setPreRotation(randomRotation(), false);
    node->setConstLocalPos(randomVec(50));
    node->setConstLocalRot(randomRotation(), true);
    node->setConstLocalScale({uniform(0.5, 2), uniform(0.5, 2), uniform(0.5, 2)});
  }

  // Keys every `step` frames, but for a gap.
  void animate(Node* node, NLEClip* clip, int layer, int step, int gapFrom = 0, int gapTo = 0) {
    KeyTrack moving(KeyTrack::Shape::Vector), turning(KeyTrack::Shape::Rotation);
    for (int frame = 0; frame <= kFrames; frame += step) {
      if (frame >= gapFrom && frame < gapTo) continue;
      const Vec3 position = randomVec(30);
      KeyTrack::Values turn{};
      TalixRotation(randomVec(0.3)).getQuaternion(turn.data());
      moving.set(frame * kFrame, {position.x, position.y, position.z});
      turning.set(frame * kFrame, turn);
    }
    moving.select(5 * kFrame, 9 * kFrame, 2);
    node->getTranslationChannel()->setTrack(clip, layer, std::move(moving));
    node->getRotationChannel()->setTrack(clip, layer, std::move(turning));
  }

  struct Sample {
    NLEClip* clip;
    Marker* marker;
    int64 time;
    Transform world;
  };
  // Where the markers are at times (in frames), in every clip and by default.
  static std::vector<Sample> sampled(std::vector<Marker*> const& markers, std::vector<double> const& frames) {
    std::vector<Sample> samples;
    NLEClip* active = g_db->getActiveClip();
    for (NLEClip* clip = g_db->getHeadClip();; clip = clip->getNext()) {
      g_db->setActiveClip(clip);
      for (Marker* marker : markers)
        for (const double frame : frames) {
          const auto time = static_cast<int64>(frame * kFrame);
          samples.push_back({clip, marker, time, marker->getWorldTransform(time)});
        }
      if (!clip) break;
    }
    g_db->setActiveClip(active);
    return samples;
  }
  static void expectAsBefore(std::vector<Sample> const& samples) {
    for (Sample const& sample : samples) {
      g_db->setActiveClip(sample.clip);
      const Transform now = sample.marker->getWorldTransform(sample.time);
      const auto where = sample.marker->getName().GetString() + " at " +
                         std::to_string(static_cast<double>(sample.time) / kFrame) + " in " +
                         (sample.clip ? sample.clip->getName().GetString() : "none");
      ASSERT_NEAR((now.position - sample.world.position).length(), 0, 1e-6) << where;
      ASSERT_NEAR((now.scale - sample.world.scale).length(), 0, 1e-9) << where;
      Vec3 off;
      (now.rotation.inverse() * sample.world.rotation).getAsVector(off);
      ASSERT_NEAR(off.length(), 0, 1e-7) << where;
    }
  }
};

TEST_F(SubjectTest, BelowACharacterThatStandsStill) {
  for (int round = 0; round < 10; ++round) {
    g_db->newScene();
    auto *clip = create<Clip>("one"), *other = create<Clip>("two");
    clip->addLayer();
    auto* subject = create<Character>("S");
    auto* bone = create<SolvingBone>("bone", create<LabelingSetup>("setup", subject));
    auto *direct = create<Marker>("direct", subject), *deep = create<Marker>("deep", bone);
    auto *nested = create<Marker>("nested", deep), *partial = create<Marker>("partial", subject);
    for (Node* node : std::initializer_list<Node*>{subject, bone, direct, deep, nested}) place(node);
    animate(direct, clip, 0, 1);
    animate(direct, clip, 1, 3);
    animate(direct, other, 0, 10);
    direct->getScaleChannel()->setTrack(clip, 1, *direct->getTranslationChannel()->findTrack(clip, 1));
    direct->getTranslationChannel()->setInterpType(static_cast<int>(Interpolation::Cubic));
    direct->getRotationChannel()->setInterpType(static_cast<int>(Interpolation::Cubic));
    const std::vector<Marker*> markers{direct, deep, nested};
    const auto before = sampled(markers, {-3, 0, 0.5, 7.3, 21, 40, 50});
    // Components keyed one by one are right at the keys.
    for (int frame = 0; frame < 6; ++frame)
      partial->getTranslationChannel()->setKey(frame * kFrame, {1, 2, 3}, 1u << frame % 3);
    const auto atKeys = sampled({partial}, {0, 1, 2, 3, 4, 5});
    const int64 keys = direct->getTranslationChannel()->findTrack(clip, 1)->count();
    ASSERT_TRUE(removeSubject(subject));
    expectAsBefore(before);
    expectAsBefore(atKeys);
    EXPECT_EQ(direct->getTranslationChannel()->findTrack(clip, 1)->count(), keys) << "the layers stay";
    EXPECT_EQ(direct->getTranslationChannel()->findTrack(clip, 0)->countSelected(2), 5);
    EXPECT_EQ(g_db->getNumModules(), 6) << "markers and clips are left";
  }
}

// The positions of a marker have data between its keys of this time.
void bridge(Marker* marker, NLEClip* clip, int64 first, int64 last) {
  KeyTrack track = *marker->getTranslationChannel()->findTrack(clip, 0);
  track.bridge(first, last);
  marker->getTranslationChannel()->setTrack(clip, 0, std::move(track));
}

TEST_F(SubjectTest, BelowMovingParents) {
  for (int round = 0; round < 10; ++round) {
    g_db->newScene();
    auto *clip = create<Clip>("one"), *other = create<Clip>("two");
    clip->addLayer();
    auto* subject = create<Character>("S");
    auto* bone = create<SolvingBone>("bone", subject);
    for (Node* node : std::initializer_list<Node*>{subject, bone}) place(node);
    animate(subject, clip, 0, 20);
    animate(bone, clip, 1, 7);
    auto *attached = create<Marker>("attached", bone), *sparse = create<Marker>("sparse", bone);
    auto *measured = create<Marker>("measured", subject), *below = create<Marker>("below", measured);
    auto *never = create<Marker>("never", subject), *reduced = create<Marker>("reduced", subject);
    for (Node* node : std::initializer_list<Node*>{attached, sparse, measured, below, reduced}) place(node);
    animate(sparse, clip, 0, 13);
    animate(sparse, clip, 1, 20);
    animate(measured, clip, 0, 1, 10, 30);
    animate(measured, other, 0, 1, 10, 30);
    animate(reduced, clip, 0, 10);
    bridge(sparse, clip, 0, kFrames * kFrame);
    bridge(reduced, clip, 0, 0);
    never->getTranslationChannel()->setTrack(clip, 0, KeyTrack(KeyTrack::Shape::Vector));

    std::vector<double> all;
    for (int frame = 0; frame <= kFrames; ++frame) all.push_back(frame);
    const auto everywhere = sampled({attached, sparse}, all);
    const auto seen = sampled({measured}, {0, 5, 9, 30, 31, 40});
    const auto between = sampled({reduced}, {0, 1, 5, 9, 10, 20, 30, 40});
    auto const* channel = measured->getTranslationChannel();
    const int64 keys = channel->findTrack(clip, 0)->count();
    ASSERT_TRUE(removeSubject(subject));
    expectAsBefore(everywhere);
    expectAsBefore(seen);
    expectAsBefore(between);
    EXPECT_EQ(channel->findTrack(clip, 0)->count(), keys) << "where it was not seen it still is not";
    EXPECT_EQ(channel->findTrack(clip, 0)->countSelected(2), 5);
    EXPECT_EQ(reduced->getTranslationChannel()->findTrack(clip, 0)->count(), 5 + 9);
    EXPECT_FALSE(never->hasKeysInClip(clip, true));
    EXPECT_TRUE(g_db->getActiveClip() == nullptr || g_db->getActiveClip()->isInScene());
  }
}

TEST_F(SubjectTest, WhatStaysAndWhatGoes) {
  auto* clip = create<Clip>("take");
  auto *one = create<Character>("one"), *two = create<Character>("two");
  create<SolvingSetup>("setup", one);
  auto* bone = create<SolvingBone>("bone", one);
  auto *a = create<Marker>("a", one), *b = create<Marker>("two:b", two), *c = create<Marker>("c", a);
  auto* other = create<Marker>("one:a");
  animate(a, clip, 0, 1);
  const KeyTrack track = *a->getTranslationChannel()->findTrack(clip, 0);
  clip->addLayer();
  g_db->setActiveLayer(1);
  a->addConnectingLine(MarkerConnection(bone));
  b->addConnectingLine(MarkerConnection(a));
  a->setSelected(true);
  bone->setSelected(true);

  EXPECT_FALSE(removeSubject(nullptr));
  ASSERT_TRUE(removeSubject(one, false));
  EXPECT_FALSE(removeSubject(one, false));
  EXPECT_EQ(a->getName(), "one:a") << "even where that name is taken";
  EXPECT_EQ(other->getName(), "one:a");
  EXPECT_EQ(c->getFullPathString(), "\\one:c");
  EXPECT_TRUE(a->isUnlabeled() && c->isUnlabeled());
  EXPECT_TRUE(a->getTranslationChannel()->findTrack(clip, 0)->sharesAll(track)) << "nothing was touched";
  EXPECT_EQ(g_db->getNumSelectedModules(), 1);
  EXPECT_TRUE(a->isSelected() && b->isConnectedTo(a));
  EXPECT_EQ(a->getNumConnectingLines(), 0);
  EXPECT_EQ(g_db->getActiveLayer(), 1);
  removeSubject(two, false);
  EXPECT_EQ(b->getName(), "two:b") << "it has the namespace already";
}

}  // namespace
