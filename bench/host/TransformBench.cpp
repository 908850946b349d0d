// What turning, asking and measuring costs through the engine's interface.
#include <benchmark/benchmark.h>

#include "bench/host/BenchScene.h"
#include "host/scene/motion/DistanceUtils.h"

namespace {

// The first of 60 bones is turned at a frame, and the last one's place in the world is asked for.
void turnAndAsk(benchmark::State& state) {
  auto const frames = static_cast<int>(state.range(0));
  Node const* last = chain(60, frames);
  auto* first = static_cast<Node*>(g_db->getModuleWithPath("bone0", nullptr, false));
  int64 frame = 0;
  for (auto _ : state) {
    frame = (frame + 1) % frames;
    int64 const time = frame * kFrame;
    first->beginDataEdit(HTimeRange(time - 1, time + 1));
    first->setWSRot(time, TalixRotation(Vec3(0, 0.001 * static_cast<double>(frame), 0.1)));
    first->endDataEdit();
    benchmark::DoNotOptimize(last->getWSPos(time));
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(turnAndAsk)->Arg(300)->Arg(3000);

// The deviation over all frames, of the two ends of a chain of 60 bones and of two markers.
void distances(benchmark::State& state, bool deep, bool mustHaveKeys) {
  auto const frames = static_cast<int>(state.range(0));
  Node const* a = chain(deep ? 60 : 1, frames);
  Node* b = deep ? static_cast<Node*>(g_db->getModuleWithPath("bone0", nullptr, false)) : create<Node>("b");
  if (!deep) animate(b, frames);
  for (auto _ : state)
    benchmark::DoNotOptimize(
        DistanceUtils::getDistanceSD(a, b, HTimeRange(0, (frames - 1) * kFrame), mustHaveKeys));
  state.SetItemsProcessed(state.iterations() * frames);
}
BENCHMARK_CAPTURE(distances, points, false, false)->Arg(2000)->Arg(20000)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(distances, pointsWithKeys, false, true)->Arg(20000)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(distances, chain, true, false)->Arg(2000)->Arg(20000)->Unit(benchmark::kMillisecond);

}  // namespace
