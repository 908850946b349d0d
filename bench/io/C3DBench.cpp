// Reading and writing C3D files: a long take of many points, and a short trial in all number forms.
#include <benchmark/benchmark.h>
#include <cmath>
#include <filesystem>
#include <unistd.h>
#include <vector>

#include "host/time/Ticks.h"
#include "io/TakeFormats.h"

namespace talix {
namespace {

// 300 points by 20,000 frames with gaps, 3.3 minutes at 100 frames a second.
Take longTake() {
  constexpr int64 kPoints = 300, kFrames = 20'000;
  Take take;
  take.rate = 100;
  take.firstFrame = 1;
  take.frameCount = kFrames;
  int64 const period = ticksPerFrameAt(take.rate);
  std::vector<double> values(3 * kFrames);
  for (int64 p = 0; p < kPoints; ++p) {
    for (size_t i = 0; i < values.size(); ++i)
      values[i] = 1000 * std::sin(0.001 * static_cast<double>(i) + static_cast<double>(p));
    TakePoint point;
    point.label = "M" + std::to_string(p);
    int64 const seen = kFrames / 2 - 20;
    point.positions.append(period, period, values.data(), seen);
    point.positions.append((kFrames / 2 + 1) * period, period, values.data(), kFrames / 2);
    take.points.push_back(std::move(point));
  }
  return take;
}

// The long take as a file, as long as the program runs.
struct LongFile {
  std::filesystem::path path;
  LongFile() {
    std::string pattern = (std::filesystem::temp_directory_path() / "c3dbenchXXXXXX").string();
    path = std::filesystem::path(::mkdtemp(pattern.data())) / "long.c3d";
    std::vector<TakeNote> notes;
    writeC3D(sourceOf(longTake()), path.string(), notes);
  }
  ~LongFile() { std::filesystem::remove_all(path.parent_path()); }
};

void readFile(benchmark::State& state, std::string const& path) {
  for (auto _ : state) benchmark::DoNotOptimize(readC3D(path));
  state.SetBytesProcessed(state.iterations() * static_cast<int64>(std::filesystem::file_size(path)));
}

void readLongC3D(benchmark::State& state) {
  static LongFile const file;
  readFile(state, file.path.string());
}
BENCHMARK(readLongC3D)->Unit(benchmark::kMillisecond);

void writeLongC3D(benchmark::State& state) {
  LongFile const file;
  Take const take = longTake();
  for (auto _ : state) {
    std::vector<TakeNote> notes;
    writeC3D(sourceOf(take), file.path.string(), notes);
  }
  state.SetBytesProcessed(state.iterations() * static_cast<int64>(std::filesystem::file_size(file.path)));
}
BENCHMARK(writeLongC3D)->Unit(benchmark::kMillisecond);

void readTrial(benchmark::State& state, char const* name) {
  readFile(state, std::string(TALIX_TEST_DATA) + "/" + name);
}
BENCHMARK_CAPTURE(readTrial, IntelInteger, "walkset_a_le_int.c3d")->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(readTrial, IntelReal, "walkset_a_le_real.c3d")->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(readTrial, MIPSInteger, "walkset_a_be_int.c3d")->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(readTrial, MIPSReal, "walkset_a_be_real.c3d")->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(readTrial, DECInteger, "walkset_a_vax_int.c3d")->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(readTrial, DECReal, "walkset_a_vax_real.c3d")->Unit(benchmark::kMicrosecond);

}  // namespace
}  // namespace talix
