// Reading a track of 10,000 keys forward: by blocks, one time after the other, and, to compare with, the
// least program that does the same on a plain array of keys.
#include <benchmark/benchmark.h>
#include <cmath>
#include <random>
#include <vector>

#include "host/keys/KeyTrack.h"
#include "host/keys/SampleTimes.h"

namespace {

using Shape = KeyTrack::Shape;

constexpr int64 kCurveKeys = 10'000;
constexpr int64 kKeyPeriod = 5'880'000;  // ticks in a frame at 120 frames a second
constexpr int64 kReadBlock = 256;        // samples

// How the keys lie in time: with Thinned half of them were taken out, with Reduced every twelfth one.
enum class Spacing { Even, Thinned, Reduced };

std::vector<int64> curveTimes(Spacing kind) {
  std::mt19937_64 random(7);
  std::vector<int64> times;
  for (int64 time = 0; static_cast<int64>(times.size()) < kCurveKeys; time += kKeyPeriod)
    if (kind == Spacing::Even || random() % (kind == Spacing::Thinned ? 2 : 12)) times.push_back(time);
  return times;
}

// One value for each key: floats, as files hold them.
std::vector<double> curveValues() {
  std::mt19937_64 random(7);
  std::uniform_real_distribution<float> value(-1000, 1000);
  std::vector<double> values;
  for (int64 i = 0; i < kCurveKeys; ++i) values.push_back(static_cast<double>(value(random)));
  return values;
}

KeyTrack makeCurve(Shape shape, Spacing kind) {
  std::vector<int64> const times = curveTimes(kind);
  std::vector<double> const values = curveValues();
  KeyTrack track(shape);
  std::vector<unsigned char> lost;
  for (size_t i = 0; i < times.size(); ++i) {
    double const v = values[i], half = v / 4000;
    for (int64 time = static_cast<int64>(lost.size()) * kKeyPeriod; time <= times[i]; time += kKeyPeriod) {
      if (shape == Shape::Rotation) {
        track.set(time, {0, 0, std::sin(half), std::cos(half)});
      } else {
        track.set(time, {v, v + 1, v + 2});
      }
      lost.push_back(time < times[i] ? KeyTrack::kAll : 0);
    }
  }
  track.thin(lost);
  return track;
}

// The plain program: keys of 40 bytes with their slopes in them, a cursor, one cubic.
struct PlainKey {
  int64 time;
  float value, slopeIn, slopeOut;
  int flags[5];
};
static_assert(sizeof(PlainKey) == 40);

class PlainCurve {
 public:
  explicit PlainCurve(Spacing kind) {
    std::vector<int64> const times = curveTimes(kind);
    std::vector<double> const values = curveValues();
    for (size_t i = 0; i < times.size(); ++i)
      m_keys.push_back({times[i], static_cast<float>(values[i]), 0, 0, {}});
    for (size_t i = 1; i + 1 < m_keys.size(); ++i) {
      PlainKey& key = m_keys[i];
      PlainKey const &before = m_keys[i - 1], &after = m_keys[i + 1];
      key.slopeIn = key.slopeOut =
          (after.value - before.value) / static_cast<float>(after.time - before.time);
    }
  }
  int64 end() const { return m_keys.back().time; }

  float evaluate(int64 time, size_t& cursor) const {
    if (time < m_keys[cursor].time) cursor = 0;
    while (cursor + 1 < m_keys.size() && m_keys[cursor + 1].time <= time) ++cursor;
    if (cursor + 1 == m_keys.size()) return m_keys[cursor].value;
    PlainKey const &a = m_keys[cursor], &b = m_keys[cursor + 1];
    auto const length = static_cast<float>(b.time - a.time);
    float const u = static_cast<float>(time - a.time) / length, d = b.value - a.value;
    float const m0 = a.slopeOut * length, m1 = b.slopeIn * length;
    return a.value + u * (m0 + u * ((3 * d - 2 * m0 - m1) + u * (m0 + m1 - 2 * d)));
  }

 private:
  std::vector<PlainKey> m_keys;
};

void readPlainArray(benchmark::State& state, Spacing kind, int64 step) {
  PlainCurve const curve(kind);
  std::vector<double> out(kReadBlock);
  size_t cursor = 0;
  int64 time = 0;
  for (auto _ : state) {
    for (double& value : out) {
      value = static_cast<double>(curve.evaluate(time, cursor));
      time += step;
    }
    benchmark::DoNotOptimize(out.data());
    if (time >= curve.end()) time = 0;
  }
  state.SetItemsProcessed(state.iterations() * kReadBlock);
}

void readSingly(benchmark::State& state, Shape shape, Interpolation interpolation, Spacing kind, int64 step) {
  KeyTrack const track = makeCurve(shape, kind);
  int64 const end = track.timeAt(kCurveKeys - 1);
  std::vector<KeyTrack::Values> out(kReadBlock);
  KeyTrack::Cursor cursor;
  int64 time = 0;
  for (auto _ : state) {
    for (KeyTrack::Values& values : out) {
      track.evaluate(time, interpolation, {}, values, &cursor);
      time += step;
    }
    benchmark::DoNotOptimize(out.data());
    if (time >= end) time = 0;
  }
  state.SetItemsProcessed(state.iterations() * kReadBlock);
}

void readBlocks(benchmark::State& state, Shape shape, Interpolation interpolation, Spacing kind, int64 step) {
  KeyTrack const track = makeCurve(shape, kind);
  int64 const end = track.timeAt(kCurveKeys - 1);
  std::vector<double> out(static_cast<size_t>(kReadBlock * track.width()));
  int64 time = 0;
  for (auto _ : state) {
    track.sample(SampleTimes(time, step, kReadBlock), interpolation, {}, KeyTrack::kAll, out.data(),
                 track.width());
    benchmark::DoNotOptimize(out.data());
    time += step * kReadBlock;
    if (time >= end) time = 0;
  }
  state.SetItemsProcessed(state.iterations() * kReadBlock);
}

#define READ_BENCHMARKS(name, ...)                  \
  BENCHMARK_CAPTURE(readSingly, name, __VA_ARGS__); \
  BENCHMARK_CAPTURE(readBlocks, name, __VA_ARGS__)

BENCHMARK_CAPTURE(readPlainArray, cubicBetween, Spacing::Even, kKeyPeriod / 3);
READ_BENCHMARKS(cubicBetween, Shape::Scalar, Interpolation::Cubic, Spacing::Even, kKeyPeriod / 3);
BENCHMARK_CAPTURE(readPlainArray, cubicOffKeys, Spacing::Even, kKeyPeriod - 1);
READ_BENCHMARKS(cubicOffKeys, Shape::Scalar, Interpolation::Cubic, Spacing::Even, kKeyPeriod - 1);
BENCHMARK_CAPTURE(readPlainArray, cubicAtKeys, Spacing::Even, kKeyPeriod);
READ_BENCHMARKS(cubicAtKeys, Shape::Scalar, Interpolation::Cubic, Spacing::Even, kKeyPeriod);
BENCHMARK_CAPTURE(readPlainArray, cubicThinned, Spacing::Thinned, kKeyPeriod);
READ_BENCHMARKS(cubicThinned, Shape::Scalar, Interpolation::Cubic, Spacing::Thinned, kKeyPeriod);
READ_BENCHMARKS(cubicReduced, Shape::Scalar, Interpolation::Cubic, Spacing::Reduced, kKeyPeriod);
READ_BENCHMARKS(linearVector, Shape::Vector, Interpolation::Linear, Spacing::Thinned, kKeyPeriod);
READ_BENCHMARKS(cubicVector, Shape::Vector, Interpolation::Cubic, Spacing::Thinned, kKeyPeriod);
READ_BENCHMARKS(vectorAtKeys, Shape::Vector, Interpolation::Linear, Spacing::Even, kKeyPeriod);
READ_BENCHMARKS(slerp, Shape::Rotation, Interpolation::Linear, Spacing::Thinned, kKeyPeriod / 3);
READ_BENCHMARKS(squad, Shape::Rotation, Interpolation::Cubic, Spacing::Thinned, kKeyPeriod / 3);
READ_BENCHMARKS(sparse, Shape::Vector, Interpolation::Linear, Spacing::Thinned, kKeyPeriod * 11);

}  // namespace
