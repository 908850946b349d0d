// What key tracks hold before and after they are thinned. The time is that of the thinning.
#include <benchmark/benchmark.h>
#include <cmath>
#include <random>
#include <vector>

#include "host/keys/KeyReduction.h"

namespace {

constexpr int64 kHourFrames = 60 * 60 * 120;  // an hour at 120 frames a second
constexpr int64 kHourPeriod = 5'880'000;

// A marker on somebody who walks about: drift, sway, steps and some noise, in millimetres as floats.
KeyTrack walkingMarker(unsigned seed) {
  std::mt19937_64 random(seed);
  std::uniform_real_distribution<double> any(0.5, 1.5);
  std::normal_distribution<double> noise(0, 0.03);
  double parts[3][3][2];  // by component and part: size and speed
  double const sizes[] = {1500, 40, 120}, speeds[] = {0.03, 0.4, 6};
  for (auto& component : parts)
    for (int i = 0; i < 3; ++i)
      component[i][0] = sizes[i] * any(random), component[i][1] = speeds[i] * any(random);

  std::vector<double> values;
  values.reserve(static_cast<size_t>(kHourFrames * 3));
  for (int64 frame = 0; frame < kHourFrames; ++frame) {
    double const seconds = static_cast<double>(frame) / 120;
    for (auto const& component : parts) {
      double value = noise(random);
      for (auto const& [size, speed] : component) value += size * std::sin(speed * seconds);
      values.push_back(static_cast<double>(static_cast<float>(value)));
    }
  }
  KeyTrack track(KeyTrack::Shape::Vector);
  track.append(0, kHourPeriod, values.data(), kHourFrames);
  return track;
}

// Takes keys out of each marker of an hour by lostOf(track).
template <class LostOf>
void thinHour(benchmark::State& state, LostOf lostOf) {
  double bytesBefore = 0, bytesAfter = 0, keysBefore = 0, keysAfter = 0;
  for (auto _ : state) {
    for (unsigned marker = 0; marker < 60; ++marker) {
      state.PauseTiming();
      KeyTrack track = walkingMarker(marker);
      bytesBefore += static_cast<double>(track.memoryUse());
      keysBefore += static_cast<double>(track.count());
      std::vector<unsigned char> const lost = lostOf(track);
      state.ResumeTiming();
      track.thin(lost);
      bytesAfter += static_cast<double>(track.memoryUse());
      keysAfter += static_cast<double>(track.count());
    }
  }
  state.counters["MBbefore"] = bytesBefore / 1e6;
  state.counters["MBafter"] = bytesAfter / 1e6;
  state.counters["bytes/keyBefore"] = bytesBefore / keysBefore;
  state.counters["bytes/keyAfter"] = bytesAfter / keysAfter;
  state.counters["left"] = keysAfter / keysBefore;
}

void reduceHour(benchmark::State& state) {
  thinHour(state, [](KeyTrack const& track) {
    return redundantKeys(track, {.tolerance = 0.1, .framePeriod = kHourPeriod});
  });
}
BENCHMARK(reduceHour)->Iterations(1)->Unit(benchmark::kMillisecond);

void everyOtherKeyOfAnHour(benchmark::State& state) {
  thinHour(state, [](KeyTrack const& track) {
    std::vector<unsigned char> lost(static_cast<size_t>(track.count()));
    for (size_t i = 1; i + 1 < lost.size(); i += 2) lost[i] = KeyTrack::kAll;
    return lost;
  });
}
BENCHMARK(everyOtherKeyOfAnHour)->Iterations(1)->Unit(benchmark::kMillisecond);

}  // namespace
