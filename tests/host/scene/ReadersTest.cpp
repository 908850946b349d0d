// Several threads read one scene that nobody changes, while snapshots of its tracks come and go. The thread
// sanitizer sees what the values do not show.
#include <atomic>
#include <thread>

#include "host/keys/DataRanges.h"
#include "host/scene/SceneReader.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

class ReadersTest : public SceneTest {
 protected:
  static constexpr int kNodes = 12, kFrames = 150;

  ReadersTest() {
    create<Clip>("take")->addLayer();
    for (int i = 0; i < kNodes; ++i) {
      // Chains of three.
      auto* marker = create<Marker>("m", i % 3 ? const_cast<Node*>(nodes.back()) : nullptr);
      marker->setPreRotation(randomRotation(), false);
      for (int layer = 0; layer < 2; ++layer) {
        g_db->setActiveLayer(layer);
        for (int frame = 0; frame < kFrames; ++frame) {
          // Gaps, and keys between frames.
          if (below(4) == 0) continue;
          marker->getTranslationChannel()->setKey(frame * kFrame + int64(below(5) == 0), randomVec(100),
                                                  KeyTrack::kAll);
          if (frame % 7 == i % 7) marker->getRotationChannel()->setKey(frame * kFrame, randomRotation(), 7);
        }
      }
      nodes.push_back(marker);
    }
  }

  // Everything that a thread reads, as numbers.
  std::vector<double> readAll(SceneReader const& reader) const {
    SampleTimes const times(0, kFrame, kFrames);
    std::vector<double> all(static_cast<size_t>(kFrames * kNodes) * 3);
    reader.readWorld(times, {.positions = all.data()});
    for (Node const* node : nodes) {
      for (int i = 0; i < node->getNumChannels(); ++i) {
        KeyTrack const* track = node->getChannel(i)->findTrack(clip(), 0);
        if (!track) continue;
        std::vector<double> values(static_cast<size_t>(kFrames * track->width()));
        track->sample(times, Interpolation::Linear, {}, KeyTrack::kAll, values.data(), track->width());
        all.insert(all.end(), values.begin(), values.end());
        DataRanges(*track, kFrame).visitGaps(0, kFrames * kFrame, [&](int64 start, int64 end) {
          all.push_back(static_cast<double>(start));
          all.push_back(static_cast<double>(end));
        });
      }
    }
    return all;
  }
  NLEClip const* clip() const { return nodes.front()->getDatabase()->getHeadClip(); }

  std::vector<Node const*> nodes;
};

TEST_F(ReadersTest, AtOnceReadWhatOneReads) {
  SceneReader const shared(nodes, clip());
  std::vector<double> const expected = readAll(shared);
  for (int frame = 0; frame < kFrames; frame += 10)
    for (size_t i = 0; i < kNodes; ++i) {
      Vec3 const found(&expected[(static_cast<size_t>(frame) * kNodes + i) * 3]);
      ASSERT_LT((found - nodes[i]->getWSPos(frame * kFrame)).length(), 1e-9);
    }

  constexpr int kRounds = 25;
  std::atomic<int> reading = 4;
  std::atomic<int> wrong = 0;
  std::vector<std::jthread> threads;
  for (int thread = 0; thread < 4; ++thread)
    threads.emplace_back([&, thread] {
      for (int round = 0; round < kRounds; ++round) {
        // Two use one reader, two make their own.
        if (thread < 2)
          wrong += readAll(shared) != expected;
        else
          wrong += readAll(SceneReader(nodes, clip())) != expected;
      }
      --reading;
    });
  threads.emplace_back([&] {
    std::vector<KeyTrack> held;
    std::mt19937 random(3);
    while (reading > 0) {
      Node const& node = *nodes[random() % kNodes];
      held.push_back(*node.getTranslationChannel()->findTrack(clip(), 0));
      // An edit of a snapshot is its own: the scene's track stays.
      if (random() % 4 == 0) held.back().eraseRange(0, 40 * kFrame);
      if (held.size() > 20) held.erase(held.begin() + static_cast<std::ptrdiff_t>(random() % 10), held.end());
    }
  });
  threads.clear();
  EXPECT_EQ(wrong, 0);
  EXPECT_EQ(readAll(shared), expected);
}

}  // namespace
