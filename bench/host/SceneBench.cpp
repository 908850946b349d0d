// What scenes of many modules cost: transforms, look-ups, creation and removal, selection.
#include <algorithm>
#include <benchmark/benchmark.h>
#include <random>
#include <string>
#include <vector>

#include "bench/host/BenchScene.h"
#include "host/scene/Character.h"
#include "host/scene/Devices.h"
#include "host/scene/HTimeManager.h"

namespace {

// 20 skeletons of 50 bones: a spine of five with limbs of nine.
std::vector<Node*> skeletons(int frames) {
  g_db->newScene();
  create<Clip>("take");
  std::vector<Node*> bones;
  for (int s = 0; s < 20; ++s) {
    Node* subject = create<Character>("Subject");
    std::vector<Node*> own;
    for (int b = 0; b < 50; ++b) {
      Node* parent = b == 0                 ? subject
                     : b < 5 || (b - 5) % 9 ? own.back()
                                            : own[static_cast<size_t>((b - 5) / 9)];
      own.push_back(create<SolvingBone>("bone", parent));
      if (frames) animate(own.back(), frames);
    }
    bones.insert(bones.end(), own.begin(), own.end());
  }
  return bones;
}

void worldPositions(benchmark::State& state, bool forward) {
  constexpr int kFrames = 300;
  std::vector<Node*> const bones = skeletons(kFrames);
  std::vector<int64> times;
  for (int i = 0; i < kFrames; ++i) times.push_back(i * kFrame);
  if (!forward) std::shuffle(times.begin(), times.end(), std::mt19937(1));
  for (auto _ : state)
    for (int64 const time : times)
      for (Node const* bone : bones) benchmark::DoNotOptimize(bone->getWSPos(time));
  state.SetItemsProcessed(state.iterations() * kFrames * static_cast<int64>(bones.size()));
}
void worldPositionsForward(benchmark::State& state) { worldPositions(state, true); }
void worldPositionsJumping(benchmark::State& state) { worldPositions(state, false); }
BENCHMARK(worldPositionsForward)->Unit(benchmark::kMillisecond);
BENCHMARK(worldPositionsJumping)->Unit(benchmark::kMillisecond);

// Reading again at one time, and after one bone high up has moved.
void worldPositionsCached(benchmark::State& state) {
  std::vector<Node*> const bones = skeletons(300);
  for (auto _ : state)
    for (Node const* bone : bones) benchmark::DoNotOptimize(bone->getWSPos(0));
  state.SetItemsProcessed(state.iterations() * static_cast<int64>(bones.size()));
}
BENCHMARK(worldPositionsCached);

void worldPositionsAfterAnEdit(benchmark::State& state) {
  std::vector<Node*> const bones = skeletons(300);
  double x = 0;
  for (auto _ : state) {
    bones[0]->setLocalPos(0, {x += 1, 0, 0});
    for (Node const* bone : bones) benchmark::DoNotOptimize(bone->getWSPos(0));
  }
  state.SetItemsProcessed(state.iterations() * static_cast<int64>(bones.size()));
}
BENCHMARK(worldPositionsAfterAnEdit);

void deepChain(benchmark::State& state) {
  Node const* last = chain(60, 300);
  int64 frame = 0;
  for (auto _ : state) benchmark::DoNotOptimize(last->getWSPos(++frame % 300 * kFrame));
  state.SetItemsProcessed(state.iterations() * 60);
}
BENCHMARK(deepChain);

// Characters of 100 modules each, in all of which the same names come again.
std::vector<Module*> manyModules(int count) {
  g_db->newScene();
  std::vector<Module*> modules;
  for (Module* subject = nullptr; static_cast<int>(modules.size()) < count;) {
    size_t const i = modules.size() % 100;
    Module* module = i == 0   ? subject = create<Character>("Subject")
                     : i < 10 ? create<AnalogDevice>("group" + std::to_string(i), subject)
                              : create<AnalogDevice>("part" + std::to_string(i / 10),
                                                     modules[modules.size() - i + i % 9 + 1]);
    modules.push_back(module);
  }
  return modules;
}

template <class Lookup>
void lookUp(benchmark::State& state, Lookup lookup) {
  std::vector<Module*> modules = manyModules(static_cast<int>(state.range(0)));
  std::shuffle(modules.begin(), modules.end(), std::mt19937(1));
  std::vector<HString> full, suffixes;
  for (Module const* module : modules) {
    full.push_back(module->getFullPathString());
    suffixes.push_back(module->getMinimumPathString(false));
  }
  size_t i = 0;
  for (auto _ : state) {
    lookup(modules[i], full[i], suffixes[i]);
    i = (i + 1) % modules.size();
  }
  state.SetItemsProcessed(state.iterations());
}

void findFullPath(benchmark::State& state) {
  lookUp(state, [](Module*, HString const& full, HString const&) {
    benchmark::DoNotOptimize(g_db->getModuleWithPath(full, nullptr, false));
  });
}
void findSuffix(benchmark::State& state) {
  lookUp(state, [](Module*, HString const&, HString const& suffix) {
    benchmark::DoNotOptimize(g_db->getModuleWithPath(suffix, nullptr, false));
  });
}
void minimumPath(benchmark::State& state) {
  lookUp(state, [](Module* module, HString const&, HString const&) {
    benchmark::DoNotOptimize(module->getMinimumPathString(false));
  });
}
BENCHMARK(findFullPath)->Arg(1'000)->Arg(100'000);
BENCHMARK(findSuffix)->Arg(1'000)->Arg(100'000);
BENCHMARK(minimumPath)->Arg(1'000)->Arg(100'000);

// Markers of one name below one parent, so that each is given a number.
void createAndRemove(benchmark::State& state) {
  for (auto _ : state) {
    g_db->newScene();
    auto* parent = create<Character>("Subject");
    for (int64 i = 0; i < state.range(0); ++i) create<Marker>("marker", parent);
    while (parent->getNumChildren()) g_db->removeFromScene(parent->getChild(0), true, true, true, true);
    g_db->releaseRemoved();
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(createAndRemove)->Arg(1'000)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);

// All of one name below different parents, removed in any order.
void removeTwins(benchmark::State& state) {
  for (auto _ : state) {
    state.PauseTiming();
    g_db->newScene();
    std::vector<Module*> twins;
    for (int64 i = 0; i < state.range(0); ++i)
      twins.push_back(create<AnalogDevice>("Hips", create<AnalogDevice>("Subject")));
    std::shuffle(twins.begin(), twins.end(), std::mt19937(1));
    state.ResumeTiming();
    for (Module* twin : twins) g_db->removeFromScene(twin, true, true, true, true);
    g_db->releaseRemoved();
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(removeTwins)->Arg(1'000)->Arg(100'000)->Unit(benchmark::kMillisecond);

void selectAndDeselect(benchmark::State& state) {
  std::vector<Module*> modules = manyModules(static_cast<int>(state.range(0)));
  std::shuffle(modules.begin(), modules.end(), std::mt19937(1));
  for (auto _ : state) {
    for (Module* module : modules) module->setSelected(true);
    std::rotate(modules.begin(), modules.begin() + 1, modules.end());
    for (Module* module : modules) module->setSelected(false);
  }
  state.SetItemsProcessed(state.iterations() * state.range(0) * 2);
}
BENCHMARK(selectAndDeselect)->Arg(1'000)->Arg(100'000)->Unit(benchmark::kMillisecond);

}  // namespace
