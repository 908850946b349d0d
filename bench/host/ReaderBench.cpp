// World positions of a thousand nodes over three hundred frames, read by blocks.
#include <benchmark/benchmark.h>
#include <thread>

#include "bench/host/BenchScene.h"
#include "host/scene/SceneReader.h"

namespace {

constexpr int kReadFrames = 300;

// A hundred chains of ten bones, keyed at every frame.
std::vector<Node const*> chainsOfTen() {
  g_db->newScene();
  create<Clip>("take");
  std::vector<Node const*> bones;
  for (int c = 0; c < 100; ++c) {
    Node* parent = nullptr;
    for (int b = 0; b < 10; ++b) {
      animate(parent = create<SolvingBone>("bone" + std::to_string(b), parent), kReadFrames);
      bones.push_back(parent);
    }
  }
  return bones;
}

void readWorldPositions(benchmark::State& state) {
  std::vector<Node const*> const bones = chainsOfTen();
  SceneReader const reader(bones, g_db->getActiveClip());
  std::vector<double> positions(3 * bones.size() * kReadFrames);
  auto const threads = static_cast<int64>(state.range(0));
  for (auto _ : state) {
    std::vector<std::thread> others;
    auto const read = [&](int64 part) {
      int64 const first = kReadFrames * part / threads, last = kReadFrames * (part + 1) / threads;
      SceneReader::Arrays arrays;
      arrays.positions = positions.data() + 3 * bones.size() * static_cast<size_t>(first);
      reader.readWorld(SampleTimes(first * kFrame, kFrame, last - first), arrays);
    };
    for (int64 part = 1; part < threads; ++part) others.emplace_back(read, part);
    read(0);
    for (std::thread& other : others) other.join();
    benchmark::DoNotOptimize(positions.data());
  }
  state.SetItemsProcessed(state.iterations() * kReadFrames * static_cast<int64>(bones.size()));
}
BENCHMARK(readWorldPositions)
    ->ArgName("threads")
    ->Arg(1)
    ->Arg(2)
    ->UseRealTime()
    ->Unit(benchmark::kMillisecond);

void makeReader(benchmark::State& state) {
  std::vector<Node const*> const bones = chainsOfTen();
  for (auto _ : state) benchmark::DoNotOptimize(SceneReader(bones, g_db->getActiveClip()).getNumNodes());
}
BENCHMARK(makeReader)->Unit(benchmark::kMicrosecond);

}  // namespace
