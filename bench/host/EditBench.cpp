// Edits through the C++ interface, on a take of 100 markers by 20,000 frames.
//
#include <benchmark/benchmark.h>
#include <cmath>
#include <malloc.h>
#include <memory>
#include <random>

#include "bench/Shuffled.h"
#include "bench/Timed.h"
#include "host/keys/KeyReduction.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"

namespace {

constexpr int kMarkers = 100;
constexpr int64 kTakeFrames = 20'000;
constexpr int64 kKeys = 100'000;
constexpr HTimeRange kNoRange;

int64 period() { return HTimeManager::getInstance()->getTicksPerFrame(); }

enum class Curve { Walk, Line, Noise, Rest };

// Positions of a curve, mm.
KeyTrack curveOf(Curve curve, int64 frames) {
  std::mt19937_64 random(7);
  std::normal_distribution<double> noise(0, curve == Curve::Noise ? 5 : 0.05);
  std::vector<double> values;
  for (int64 i = 0; i < frames; ++i) {
    double const x = static_cast<double>(i);
    switch (curve) {
      case Curve::Walk:
      case Curve::Noise:
        values.insert(values.end(), {1.2 * x + noise(random), 80 * std::sin(x / 20) + noise(random),
                                     900 + 30 * std::sin(x / 10) + noise(random)});
        break;
      case Curve::Line:
        values.insert(values.end(), {1.2 * x, 2 * x, 900});
        break;
      case Curve::Rest:
        values.insert(values.end(), {1, 2, 900});
        break;
    }
  }
  KeyTrack track(KeyTrack::Shape::Vector);
  track.append(0, period(), values.data(), frames);
  return track;
}

// A new scene with an active clip and markers.
class Scene {
 public:
  explicit Scene(int markers) {
    g_db->newScene();
    m_clip = static_cast<NLEClip*>(g_db->createModule(&Clip::staticClass(), "take", nullptr));
    for (int i = 0; i < markers; ++i)
      m_markers.push_back(static_cast<Marker*>(
          g_db->createModule(&Marker::staticClass(), HString("m" + std::to_string(i)), nullptr)));
  }
  ~Scene() { g_db->newScene(); }
  Scene(Scene const&) = delete;

  Vec3Controller* channel(int i) { return m_markers[static_cast<size_t>(i)]->getTranslationChannel(); }
  void fill(KeyTrack const& track) {
    for (Marker* marker : m_markers) marker->getTranslationChannel()->setTrack(m_clip, 0, track);
  }

 private:
  NLEClip* m_clip;
  std::vector<Marker*> m_markers;
};

// Makes what edit() changes one step of the journal.
template <class Edit>
void editTimed(benchmark::State& state, Timed timed, Edit edit) {
  UndoJournal& journal = g_db->getUndoJournal();
  HString name;
  journal.setEnabled(timed != Timed::Edit);
  runTimed(
      state, timed,
      [&] {
        journal.beginStep();
        edit();
        journal.endStep("edit");
      },
      [&] { journal.undo(name); }, [&] { journal.redo(name); });
  journal.setEnabled(false);
}

void setKey(benchmark::State& state, std::vector<int64> const& order, Timed timed) {
  for (auto _ : state) {
    state.PauseTiming();
    auto scene = std::make_unique<Scene>(1);
    Vec3Controller* channel = scene->channel(0);
    editTimed(state, timed, [&] {
      for (int64 const i : order) {
        HTimeRange const range(i * period(), i * period());
        channel->beginDataEdit(range);
        channel->setKey(i * period(), Vec3(static_cast<double>(i), 1, 2), KeyTrack::kAll);
        channel->endDataEdit();
      }
    });
    scene.reset();
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations() * kKeys);
}
void setKeyInOrder(benchmark::State& state, Timed timed) { setKey(state, inOrder(kKeys), timed); }
TIMED_BENCHMARKS(setKeyInOrder);
void setKeyAtRandom(benchmark::State& state, Timed timed) { setKey(state, shuffled(kKeys), timed); }
TIMED_BENCHMARKS(setKeyAtRandom);

// What a step of one new key, or of one that is overwritten, holds beyond the track itself.
void bytesOfStep(benchmark::State& state, bool overwrite) {
  auto const held = [] { return static_cast<double>(mallinfo2().uordblks); };
  constexpr int64 kSteps = 100'000;
  for (auto _ : state) {
    double bytes[2];
    for (bool const kept : {false, true}) {
      Scene scene(1);
      Vec3Controller* channel = scene.channel(0);
      auto const setAll = [&](double value) {
        for (int64 i = 0; i < kSteps; ++i) {
          g_db->getUndoJournal().beginStep();
          channel->setKey(i * period(), Vec3(static_cast<double>(i), value, std::sin(i)), KeyTrack::kAll);
          g_db->getUndoJournal().endStep("setKey");
        }
      };
      if (overwrite) setAll(1);
      g_db->getUndoJournal().setEnabled(kept);
      double const before = held();
      setAll(2);
      bytes[kept] = held() - before;
      g_db->getUndoJournal().setEnabled(false);
    }
    state.counters["bytes"] = (bytes[1] - bytes[0]) / kSteps;
  }
  state.SetItemsProcessed(state.iterations() * 2 * kSteps);
}
BENCHMARK_CAPTURE(bytesOfStep, added, false)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(bytesOfStep, overwritten, true)->Unit(benchmark::kMillisecond);

// A tenth of the keys of every marker, in 20 ranges.
void cutKeyRanges(benchmark::State& state, Timed timed) {
  Scene scene(kMarkers);
  KeyTrack const walk = curveOf(Curve::Walk, kTakeFrames);
  for (auto _ : state) {
    state.PauseTiming();
    scene.fill(walk);
    editTimed(state, timed, [&] {
      for (int m = 0; m < kMarkers; ++m)
        for (int64 first = 0; first < kTakeFrames; first += 1000) {
          HTimeRange const range(first * period(), (first + 99) * period());
          scene.channel(m)->beginDataEdit(range);
          scene.channel(m)->deleteKeys(range, KeyTrack::kAll, false);
          scene.channel(m)->endDataEdit();
        }
    });
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations() * kMarkers * kTakeFrames / 10);
}
TIMED_BENCHMARKS(cutKeyRanges);

void reduceTake(benchmark::State& state, Curve curve, Interpolation interpolation) {
  Scene scene(kMarkers);
  KeyTrack const original = curveOf(curve, kTakeFrames);
  for (int m = 0; m < kMarkers; ++m) scene.channel(m)->setInterpType(static_cast<int>(interpolation));
  HTimeRange const all[] = {HTimeRange::forever()};
  int64 removed = 0;
  for (auto _ : state) {
    state.PauseTiming();
    scene.fill(original);
    removed = 0;
    state.ResumeTiming();
    for (int m = 0; m < kMarkers; ++m)
      removed += scene.channel(m)->reduceKeys(all, {.length = 0.5, .angle = 0, .ofRange = 0});
  }
  state.SetItemsProcessed(state.iterations() * kMarkers * kTakeFrames);
  state.counters["removed"] = static_cast<double>(removed) / (kMarkers * kTakeFrames);
}
BENCHMARK_CAPTURE(reduceTake, walk, Curve::Walk, Interpolation::Linear)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(reduceTake, walkCubic, Curve::Walk, Interpolation::Cubic)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(reduceTake, noise, Curve::Noise, Interpolation::Linear)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(reduceTake, rest, Curve::Rest, Interpolation::Linear)->Unit(benchmark::kMillisecond);

// The decision alone, on long curves: near-linear whatever the curve.
void redundantKeys(benchmark::State& state, Curve curve, Interpolation interpolation) {
  int64 const n = state.range(0);
  KeyTrack const track = curveOf(curve, n);
  for (auto _ : state)
    benchmark::DoNotOptimize(
        redundantKeys(track, {.interpolation = interpolation, .tolerance = 0.5, .framePeriod = period()}));
  state.SetItemsProcessed(state.iterations() * n);
}
#define REDUNDANT(name, ...)                          \
  BENCHMARK_CAPTURE(redundantKeys, name, __VA_ARGS__) \
      ->Arg(20'000)                                   \
      ->Arg(1'000'000)                                \
      ->Unit(benchmark::kMillisecond)
REDUNDANT(walk, Curve::Walk, Interpolation::Linear);
REDUNDANT(walkCubic, Curve::Walk, Interpolation::Cubic);
REDUNDANT(line, Curve::Line, Interpolation::Linear);
REDUNDANT(lineCubic, Curve::Line, Interpolation::Cubic);
REDUNDANT(noise, Curve::Noise, Interpolation::Linear);
REDUNDANT(noiseCubic, Curve::Noise, Interpolation::Cubic);

}  // namespace
