// What commands cost on large scenes, run as script lines.
#include <benchmark/benchmark.h>
#include <stdexcept>
#include <string>

#include "host/scene/Database.h"
#include "session/Session.h"

namespace {

class Script {
 public:
  Script() : m_session(TALIX_PLUGIN) { run("newScene"); }

  void run(std::string const& line) {
    if (m_session.run(line).failed()) throw std::runtime_error(line);
  }

 private:
  talix::Session m_session;
};

template <class Prepare>
void measure(benchmark::State& state, std::string const& line, Prepare prepare) {
  Script script;
  for (auto _ : state) {
    state.PauseTiming();
    script.run("newScene");
    prepare(script, state.range(0));
    state.ResumeTiming();
    script.run(line);
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}

void makeMarkers(Script& script, int64 count) {
  script.run("create Marker LFHD -multiple " + std::to_string(count));
}

void createMarkers(benchmark::State& state) {
  measure(state, "create Marker LFHD -multiple " + std::to_string(state.range(0)), [](auto&&...) {});
}
void createCameras(benchmark::State& state) {
  measure(state, "create OpticalCamera cam -multiple " + std::to_string(state.range(0)), [](auto&&...) {});
}
void deleteSelected(benchmark::State& state) { measure(state, "delete", makeMarkers); }
void deleteAll(benchmark::State& state) { measure(state, "delete -all", makeMarkers); }
BENCHMARK(createMarkers)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);
BENCHMARK(createCameras)->Arg(1'000)->Arg(10'000)->Unit(benchmark::kMillisecond);
BENCHMARK(deleteSelected)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);
BENCHMARK(deleteAll)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);

// All markers of a cluster at once: each is let go of by a long list.
void deleteAllOfACluster(benchmark::State& state) {
  measure(state, "delete", [](Script& script, int64 count) {
    script.run("create LabelingCluster cluster");
    makeMarkers(script, count);
    TSimpleArray<Module*> markers;
    for (int i = 0; i < g_db->getNumSelectedModules(); ++i) markers.add(g_db->getSelectedModule(i));
    static_cast<MultiModAttribute*>(g_db->getModule(0)->getAttribute("Markers"))
        ->setValue(markers, true, true, true, true);
  });
}
BENCHMARK(deleteAllOfACluster)->Arg(1'000)->Arg(10'000)->Unit(benchmark::kMillisecond);

void clash(Script& script, int64 count, char const* name) {
  makeMarkers(script, count);
  script.run(std::string("setProperty Name ") + name);
}
void makeUnique(benchmark::State& state) {
  measure(state, "makeUnique", [](Script& script, int64 count) { clash(script, count, "m"); });
}
void makeUniqueNumbered(benchmark::State& state) {
  measure(state, "makeUnique", [](Script& script, int64 count) { clash(script, count, "m_x9"); });
}
// Twins that each have a child of one name.
void makeUniqueTrees(benchmark::State& state) {
  measure(state, "makeUnique", [](Script& script, int64 count) {
    makeMarkers(script, count);
    for (int i = 0; i < static_cast<int>(count); ++i)
      g_db->createModule(&Marker::staticClass(), "child", g_db->getModule(i));
    script.run("setProperty Name m");
  });
}
BENCHMARK(makeUnique)->Arg(1'000)->Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond);
BENCHMARK(makeUniqueNumbered)->Arg(1'000)->Arg(10'000)->Unit(benchmark::kMillisecond);
BENCHMARK(makeUniqueTrees)->Arg(1'000)->Arg(10'000)->Unit(benchmark::kMillisecond);

}  // namespace
