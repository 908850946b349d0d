// Key tracks at the sizes of a long take (20,000 keys) and of an analog channel (1,000,000).
#include <algorithm>
#include <benchmark/benchmark.h>
#include <random>
#include <vector>

#include "bench/Shuffled.h"
#include "host/keys/DataRanges.h"
#include "host/keys/KeyTrack.h"

namespace {

constexpr int64 kPeriod = 5'880'000;  // ticks in a frame at 120 frames a second
constexpr int64 kMillion = 1'000'000;

std::vector<double> randomValues(int64 n) {
  std::mt19937_64 random(7);
  std::uniform_real_distribution<double> value(-1000, 1000);
  std::vector<double> values(static_cast<size_t>(n));
  std::generate(values.begin(), values.end(), [&] { return value(random); });
  return values;
}

KeyTrack makeTrack(int64 keys) {
  KeyTrack track(KeyTrack::Shape::Vector);
  track.append(0, kPeriod, randomValues(keys * 3).data(), keys);
  return track;
}

void appendBulk(benchmark::State& state) {
  int64 const n = state.range(0);
  std::vector<double> const values = randomValues(n * 3);
  for (auto _ : state) {
    KeyTrack track(KeyTrack::Shape::Vector);
    track.append(0, kPeriod, values.data(), n);
    benchmark::DoNotOptimize(track.count());
  }
  state.SetItemsProcessed(state.iterations() * n);
}
BENCHMARK(appendBulk)->Arg(20'000)->Arg(kMillion)->Unit(benchmark::kMillisecond);

void appendSingly(benchmark::State& state) {
  int64 const n = state.range(0);
  int64 bytes = 0;
  for (auto _ : state) {
    KeyTrack track(KeyTrack::Shape::Vector);
    for (int64 i = 0; i < n; ++i) {
      double const v = static_cast<double>(i) / 7;
      track.set(i * kPeriod, {v, v + 1, v + 2});
    }
    bytes = track.memoryUse();
  }
  state.SetItemsProcessed(state.iterations() * n);
  state.counters["bytes/key"] = static_cast<double>(bytes) / static_cast<double>(n);
}
BENCHMARK(appendSingly)->Arg(20'000)->Arg(kMillion)->Unit(benchmark::kMillisecond);

void insertInRandomOrder(benchmark::State& state) {
  std::vector<int64> const order = shuffled(state.range(0));
  int64 bytes = 0;
  for (auto _ : state) {
    KeyTrack track(KeyTrack::Shape::Vector);
    for (int64 const i : order) {
      double const v = static_cast<double>(i) / 7;
      track.set(i * kPeriod, {v, v + 1, v + 2});
    }
    bytes = track.memoryUse();
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
  state.counters["bytes/key"] = static_cast<double>(bytes) / static_cast<double>(state.range(0));
}
BENCHMARK(insertInRandomOrder)->Arg(20'000)->Arg(kMillion)->Unit(benchmark::kMillisecond);

void findAtRandom(benchmark::State& state) {
  KeyTrack const track = makeTrack(state.range(0));
  std::vector<int64> const order = shuffled(state.range(0));
  size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(track.find(order[i] * kPeriod));
    if (++i == order.size()) i = 0;
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(findAtRandom)->Arg(20'000)->Arg(kMillion);

enum class From { Front, Back, Random };

// Deletes all keys by index, one after the other.
void deleteSingly(benchmark::State& state, From from) {
  int64 const n = state.range(0);
  KeyTrack const original = makeTrack(n);
  std::vector<int64> indices;  // made beforehand
  std::mt19937_64 random(7);
  for (int64 left = n; left > 0; --left) {
    int64 const any = static_cast<int64>(random() % static_cast<uint64>(left));
    indices.push_back(from == From::Front ? 0 : from == From::Back ? left - 1 : any);
  }
  for (auto _ : state) {
    KeyTrack track = original;
    for (int64 const index : indices) track.erase(index);
    benchmark::DoNotOptimize(track.empty());
  }
  state.SetItemsProcessed(state.iterations() * n);
}
BENCHMARK_CAPTURE(deleteSingly, front, From::Front)->Arg(kMillion)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(deleteSingly, back, From::Back)->Arg(kMillion)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(deleteSingly, random, From::Random)->Arg(kMillion)->Unit(benchmark::kMillisecond);

void selectAndDeselectAll(benchmark::State& state) {
  KeyTrack track = makeTrack(state.range(0));
  for (auto _ : state) {
    track.select(0, state.range(0) * kPeriod);
    track.deselect(0, state.range(0) * kPeriod);
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(selectAndDeselectAll)->Arg(20'000)->Arg(kMillion)->Unit(benchmark::kMillisecond);

// A snapshot and the erasure of the middle half, as an undoable cut does it.
void eraseHalf(benchmark::State& state) {
  int64 const n = state.range(0);
  KeyTrack const original = makeTrack(n);
  for (auto _ : state) {
    KeyTrack track = original;
    benchmark::DoNotOptimize(track.eraseRange(n / 4 * kPeriod, n / 4 * 3 * kPeriod));
  }
}
BENCHMARK(eraseHalf)->Arg(20'000)->Arg(kMillion)->Unit(benchmark::kMicrosecond);

void evaluateForward(benchmark::State& state, KeyTrack::Shape shape, Interpolation interpolation,
                     int64 step) {
  int64 const n = state.range(0), end = n * kPeriod;
  KeyTrack track(shape);
  std::vector<double> values = randomValues(n * track.width());
  if (shape == KeyTrack::Shape::Rotation)
    for (size_t i = 0; i < values.size(); i += 4)
      values[i] = values[i + 1] = 0, values[i + 2] = 0.6, values[i + 3] = 0.8;
  track.append(0, kPeriod, values.data(), n);

  KeyTrack::Cursor cursor;
  KeyTrack::Values out{};
  int64 time = 0;
  for (auto _ : state) {
    track.evaluate(time, interpolation, {}, out, &cursor);
    benchmark::DoNotOptimize(out);
    time = time + step < end ? time + step : 0;
  }
  state.SetItemsProcessed(state.iterations());
}
constexpr auto kVector = KeyTrack::Shape::Vector;
constexpr auto kRotation = KeyTrack::Shape::Rotation;
BENCHMARK_CAPTURE(evaluateForward, atKeys, kVector, Interpolation::Linear, kPeriod)
    ->Arg(20'000)
    ->Arg(kMillion);
BENCHMARK_CAPTURE(evaluateForward, between, kVector, Interpolation::Linear, kPeriod / 3)
    ->Arg(20'000)
    ->Arg(kMillion);
BENCHMARK_CAPTURE(evaluateForward, cubic, kVector, Interpolation::Cubic, kPeriod / 3)
    ->Arg(20'000)
    ->Arg(kMillion);
BENCHMARK_CAPTURE(evaluateForward, slerp, kRotation, Interpolation::Linear, kPeriod / 3)->Arg(20'000);
BENCHMARK_CAPTURE(evaluateForward, squad, kRotation, Interpolation::Cubic, kPeriod / 3)->Arg(20'000);

void evaluateAtRandom(benchmark::State& state) {
  KeyTrack const track = makeTrack(state.range(0));
  std::vector<int64> const order = shuffled(state.range(0));
  KeyTrack::Values out{};
  size_t i = 0;
  for (auto _ : state) {
    track.evaluate(order[i] * kPeriod + kPeriod / 3, Interpolation::Linear, {}, out);
    benchmark::DoNotOptimize(out);
    if (++i == order.size()) i = 0;
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(evaluateAtRandom)->Arg(20'000)->Arg(kMillion);

enum class Seen { All, WithGaps, Thinned };

// Going through the runs of frames with data.
void findData(benchmark::State& state, Seen seen) {
  int64 const n = state.range(0);
  KeyTrack track = makeTrack(n);
  for (int64 i = 900; seen == Seen::WithGaps && i < n; i += 1000)
    track.eraseRange(i * kPeriod, (i + 9) * kPeriod);
  std::vector<unsigned char> lost(static_cast<size_t>(n));
  for (size_t i = 1; i + 1 < lost.size(); i += 2) lost[i] = KeyTrack::kAll;
  if (seen == Seen::Thinned) track.thin(lost);
  int64 runs = 0;
  for (auto _ : state) {
    runs = 0;
    DataRanges(track, kPeriod).visitRanges(0, n * kPeriod, [&](int64, int64) { ++runs; });
    benchmark::DoNotOptimize(runs);
  }
  state.counters["runs"] = static_cast<double>(runs);
}
BENCHMARK_CAPTURE(findData, all, Seen::All)->Arg(kMillion)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(findData, withGaps, Seen::WithGaps)->Arg(kMillion)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(findData, thinned, Seen::Thinned)->Arg(kMillion)->Unit(benchmark::kMicrosecond);

}  // namespace
