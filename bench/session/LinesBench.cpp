// What script lines cost, from the text to the result.
#include <benchmark/benchmark.h>

#include "bench/host/BenchScene.h"
#include "host/scene/HTimeManager.h"
#include "session/Session.h"

namespace {

// As turnAndAsk, by lines: a step of the time, a turn, a question.
void turnAndAskByLine(benchmark::State& state) {
  auto const frames = static_cast<int>(state.range(0));
  talix::Session session(TALIX_PLUGIN);
  chain(60, frames);
  int frame = 0;
  for (auto _ : state) {
    frame = (frame + 1) % frames;
    HTimeManager::getInstance()->setTime(frame * kFrame, true);
    for (char const* line : {"setRotation bone0 <0 0.5 10> -ws", "getPosition bone59 -ws"})
      if (session.run(line).failed()) state.SkipWithError(line);
  }
  state.SetItemsProcessed(2 * state.iterations());
}
BENCHMARK(turnAndAskByLine)->Arg(300)->Arg(3000);

}  // namespace
