// What it costs to keep the motion of a node for another parent.
#include <benchmark/benchmark.h>
#include <vector>

#include "bench/host/BenchScene.h"

namespace {

constexpr int kBones = 60;

// A spine of ten bones with five limbs of ten, keyed at every `period` frames.
std::vector<Node*> skeleton(int frames, int period) {
  g_db->newScene();
  g_db->createModule(&Clip::s_classClip, "take", nullptr);
  std::vector<Node*> bones;
  for (int b = 0; b < kBones; ++b) {
    Node* parent = b == 0 ? nullptr : b < 10 || b % 10 ? bones.back() : bones[static_cast<size_t>(b / 10)];
    auto* bone = static_cast<Node*>(g_db->createModule(&SolvingBone::s_classSolvingBone, "bone", parent));
    bone->setConstLocalPos({0, 100, 0});
    for (int i = 0; i < frames; i += period) {
      bone->setLocalRot(i * kFrame, TalixRotation(Vec3(i * 0.002, b * 0.01, 0.1)));
      if (b == 0) bone->setLocalPos(i * kFrame, {i * 1.0, 0, 0});
    }
    bones.push_back(bone);
  }
  return bones;
}

// Every bone below the root is hung under the root, leaves first.
void parentAdjust(benchmark::State& state) {
  for (auto _ : state) {
    state.PauseTiming();
    std::vector<Node*> const bones =
        skeleton(static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    state.ResumeTiming();
    for (size_t i = bones.size(); i-- > 1;) {
      bones[i]->parentAdjust(bones[0], HTimeRange::forever());
      bones[0]->addChild(bones[i]);
    }
  }
  state.SetItemsProcessed(state.iterations() * kBones * state.range(0));
}
BENCHMARK(parentAdjust)
    ->ArgNames({"frames", "every"})
    ->Args({500, 1})
    ->Args({5'000, 1})
    ->Args({5'000, 100})
    ->Unit(benchmark::kMillisecond);

}  // namespace
