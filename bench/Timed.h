// What of an edit a benchmark times: the edit itself, with or without the undo journal, taking it back, doing
// it again.
#pragma once

#include <benchmark/benchmark.h>

enum class Timed { Edit, WithJournal, Undo, Redo };

// Starts and ends with the clock stopped.
template <class Edit, class Undo, class Redo>
void runTimed(benchmark::State& state, Timed timed, Edit edit, Undo undo, Redo redo) {
  auto const run = [&](bool isTimed, auto& part) {
    if (isTimed) state.ResumeTiming();
    part();
    if (isTimed) state.PauseTiming();
  };
  run(timed == Timed::Edit || timed == Timed::WithJournal, edit);
  if (timed == Timed::Undo || timed == Timed::Redo) run(timed == Timed::Undo, undo);
  if (timed == Timed::Redo) run(true, redo);
}

// ImportRollback can be so short that the library would repeat the edit before it for minutes.
#define TIMED_BENCHMARKS(name)                                                               \
  BENCHMARK_CAPTURE(name, edit, Timed::Edit)->Unit(benchmark::kMillisecond);                 \
  BENCHMARK_CAPTURE(name, withJournal, Timed::WithJournal)->Unit(benchmark::kMillisecond);   \
  BENCHMARK_CAPTURE(name, undo, Timed::Undo)->Unit(benchmark::kMillisecond)->Iterations(10); \
  BENCHMARK_CAPTURE(name, redo, Timed::Redo)->Unit(benchmark::kMillisecond)->Iterations(10)
