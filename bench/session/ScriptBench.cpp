// What a script line costs, and taking it back: the program's plug-in on a session, line by line.
#include <benchmark/benchmark.h>
#include <memory>

#include "bench/Shuffled.h"
#include "bench/Timed.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"
#include "session/Session.h"

namespace {

using talix::Session;

constexpr int64 kKeys = 100'000;
constexpr int64 kLines = 500'000;

// A session on a new scene with an active clip and the marker M.
class Fixture {
 public:
  Fixture() : m_session(TALIX_PLUGIN) {
    g_db->newScene();
    clip = static_cast<NLEClip*>(g_db->createModule(&Clip::staticClass(), "take", nullptr));
    marker = static_cast<Marker*>(g_db->createModule(&Marker::staticClass(), "M", nullptr));
    run("select M");
    run("selectChannels Translation");
  }
  ~Fixture() { g_db->newScene(); }

  void setUndo(bool on) { m_session.setUndo(on); }
  bool run(std::string const& line) { return !m_session.run(line).failed(); }

  NLEClip* clip;
  Marker* marker;

 private:
  Session m_session;
};

void runLines(benchmark::State& state, std::vector<std::string> const& lines, Timed timed) {
  std::string const count = " " + std::to_string(lines.size());
  for (auto _ : state) {
    state.PauseTiming();
    auto fixture = std::make_unique<Fixture>();
    fixture->setUndo(timed != Timed::Edit);
    runTimed(
        state, timed,
        [&] {
          for (std::string const& line : lines)
            if (!fixture->run(line)) state.SkipWithError(line.c_str());
        },
        [&] { fixture->run("undo" + count); }, [&] { fixture->run("redo" + count); });
    fixture.reset();
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations() * static_cast<int64>(lines.size()));
}

std::vector<std::string> setKeyLines(std::vector<int64> const& order) {
  std::vector<std::string> lines;
  for (int64 const i : order)
    lines.push_back("setKey Translation " + std::to_string(i) + ".5 1 2 -t " + std::to_string(i));
  return lines;
}

void setKeyLineInOrder(benchmark::State& state, Timed timed) {
  runLines(state, setKeyLines(inOrder(kKeys)), timed);
}
void setKeyLineAtRandom(benchmark::State& state, Timed timed) {
  runLines(state, setKeyLines(shuffled(kKeys)), timed);
}
TIMED_BENCHMARKS(setKeyLineInOrder);
TIMED_BENCHMARKS(setKeyLineAtRandom);

// Reading and dispatching alone: the cheapest of lines, one that is refused, one with all kinds of values.
void manyLines(benchmark::State& state, char const* line, bool fails) {
  Fixture fixture;
  for (auto _ : state)
    for (int64 i = 0; i < kLines; ++i)
      if (fixture.run(line) == fails) return state.SkipWithError(line);
  state.SetItemsProcessed(state.iterations() * kLines);
}
BENCHMARK_CAPTURE(manyLines, comment, "# nothing to do here", false)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(manyLines, getTime, "getTime", false)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(manyLines, getNumKeys, "getNumKeys Translation.x -onMod M", false)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(manyLines, refused, "getNumKeys 1 <1 2 3> [a b c] \"text\" 'more' 4.5e3 on", true)
    ->Unit(benchmark::kMillisecond);

// One line on a take of 100 markers by 20,000 frames, all selected; `before` is run first.
void oneLine(benchmark::State& state, char const* before, char const* line, int64 items, Timed timed) {
  Fixture fixture;
  fixture.setUndo(timed != Timed::Edit);
  std::vector<double> values;
  for (int64 i = 0; i < 20'000; ++i)
    values.insert(values.end(), {1.5 * static_cast<double>(i), 300.0 * ((i / 50) % 2), 7});
  KeyTrack track(KeyTrack::Shape::Vector);
  track.append(0, HTimeManager::getInstance()->getTicksPerFrame(), values.data(), 20'000);
  std::vector<Marker*> markers;
  for (int m = 0; m < 100; ++m)
    markers.push_back(static_cast<Marker*>(
        g_db->createModule(&Marker::staticClass(), HString("m" + std::to_string(m)), nullptr)));
  for (auto _ : state) {
    state.PauseTiming();
    for (Marker* marker : markers) marker->getTranslationChannel()->setTrack(fixture.clip, 0, track);
    fixture.run("select -type Marker");
    if (*before && !fixture.run(before)) return state.SkipWithError(before);
    bool done = true;
    runTimed(
        state, timed, [&] { done = fixture.run(line); }, [&] { fixture.run("undo"); },
        [&] { fixture.run("redo"); });
    if (!done) return state.SkipWithError(line);
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations() * items);
}
void cutKeys(benchmark::State& state, Timed timed) {
  oneLine(state, "selectTime 5000 9999", "cutKeys -ranges", 500'000, timed);
}
TIMED_BENCHMARKS(cutKeys);
void reduceKeys(benchmark::State& state, Timed timed) {
  oneLine(state, "", "reduceKeys -all", 2'000'000, timed);
}
TIMED_BENCHMARKS(reduceKeys);
// 1,000 selected keys on each of 100 markers.
void setProperty(benchmark::State& state, Timed timed) {
  oneLine(state, "selectKeys Translation -frames 1 1000", "setProperty Translation.y 5", 100'000, timed);
}
TIMED_BENCHMARKS(setProperty);

}  // namespace
