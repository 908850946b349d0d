// What it costs to create, delete and duplicate many modules, and to delete characters of many markers.
#include <benchmark/benchmark.h>
#include <string>

#include "bench/host/BenchScene.h"
#include "host/scene/SubjectManager.h"

namespace {

// Markers of a character, each with a key at every frame.
Character* markers(int64 count, int frames) {
  g_db->newScene();
  create<Clip>("take");
  auto* subject = create<Character>("Subject");
  std::vector<double> positions;
  for (int i = 0; i < 3 * frames; ++i) positions.push_back(i * 0.3);
  for (int64 i = 0; i < count; ++i) {
    KeyTrack track(KeyTrack::Shape::Vector);
    track.append(0, kFrame, positions.data(), frames);
    auto* marker = create<Marker>(("LFHD" + std::to_string(i)).c_str(), subject);
    marker->getTranslationChannel()->setTrack(g_db->getActiveClip(), 0, std::move(track));
  }
  return subject;
}

void duplicateMarkers(benchmark::State& state) {
  for (auto _ : state) {
    state.PauseTiming();
    Character* subject = markers(state.range(0), 1000);
    for (int i = 0; i < subject->getNumChildren(); ++i) subject->getChild(i)->setSelected(true);
    state.ResumeTiming();
    g_db->duplicateSelectedObjects();
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(duplicateMarkers)->Arg(1'000)->Arg(10'000)->Unit(benchmark::kMillisecond);

void duplicateClip(benchmark::State& state) {
  for (auto _ : state) {
    state.PauseTiming();
    markers(state.range(0), 1000);
    g_db->getHeadClip()->setSelected(true);
    state.ResumeTiming();
    g_db->duplicateSelectedObjects();
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(duplicateClip)->Arg(1'000)->Arg(10'000)->Unit(benchmark::kMillisecond);

enum class Subject { AtOrigin, Placed, Moving };

void deleteCharacter(benchmark::State& state, Subject kind) {
  for (auto _ : state) {
    state.PauseTiming();
    Character* subject = markers(state.range(0), kind == Subject::Moving ? 100 : 1000);
    if (kind != Subject::AtOrigin) subject->setConstLocalPos({1, 2, 3});
    if (kind == Subject::Moving) subject->setLocalRot(kFrame, TalixRotation(Vec3(0, 0, 1)));
    state.ResumeTiming();
    g_db->getSubjectManager()->removeSubject(subject, true, true, true);
    g_db->releaseRemoved();
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK_CAPTURE(deleteCharacter, atOrigin, Subject::AtOrigin)
    ->Arg(1'000)
    ->Arg(10'000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(deleteCharacter, placed, Subject::Placed)
    ->Arg(1'000)
    ->Arg(10'000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(deleteCharacter, moving, Subject::Moving)
    ->Arg(1'000)
    ->Arg(10'000)
    ->Unit(benchmark::kMillisecond);

}  // namespace
