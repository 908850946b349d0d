// How fast the text formats are read and written, on generated takes of 32 MB.
#include <benchmark/benchmark.h>
#include <cmath>
#include <filesystem>
#include <fstream>
#include <random>
#include <string>
#include <unistd.h>

#include "io/TakeFormats.h"

namespace {

using talix::Take;

constexpr size_t kFileSize = 32 << 20;

// A file that goes with the process. Where it cannot be made, the benchmark that reads it fails with the
// text.
class TempFile {
 public:
  TempFile(std::string const& suffix, std::string const& content)
      : m_path(std::filesystem::temp_directory_path() / ("bench" + std::to_string(::getpid()) + suffix)) {
    std::ofstream(m_path, std::ios::binary) << content;
  }
  ~TempFile() { std::filesystem::remove(m_path); }
  std::string path() const { return m_path.string(); }

 private:
  std::filesystem::path m_path;
};

std::string row(std::mt19937& random, int values, double range, char const* format) {
  std::uniform_real_distribution<double> value(-range, range);
  std::string text;
  char number[32];
  for (int i = 0; i < values; ++i)
    text.append(number, static_cast<size_t>(std::snprintf(number, sizeof number, format, value(random))));
  return text;
}

// Thirty joints in a chain.
std::string bvhText() {
  constexpr int kJoints = 30;
  std::string text = "HIERARCHY\n";
  for (int i = 0; i < kJoints; ++i)
    text += (i == 0 ? "ROOT j0\n{\nOFFSET 0 0 0\nCHANNELS 6 Xposition Yposition Zposition Zrotation "
                      "Xrotation Yrotation\n"
                    : "JOINT j" + std::to_string(i) +
                          "\n{\nOFFSET 0 10 0\nCHANNELS 3 Zrotation Xrotation Yrotation\n");
  text += std::string(kJoints, '}') + "\nMOTION\n";
  std::mt19937 random(1);
  std::string rows;
  size_t frames = 0;
  for (; rows.size() < kFileSize; ++frames) rows += row(random, 3 + 3 * kJoints, 180, "%.4f ") + "\n";
  return text + "Frames: " + std::to_string(frames) + "\nFrame Time: 0.008333\n" + rows;
}

std::string trcText() {
  constexpr int kMarkers = 60;
  std::string text = "PathFileType\t4\t(X/Y/Z)\tbench.trc\nDataRate\tUnits\n120\tmm\nFrame#\tTime";
  for (int i = 0; i < kMarkers; ++i) text += "\tm" + std::to_string(i) + "\t\t";
  text += "\n\n";
  std::mt19937 random(1);
  for (int frame = 1; text.size() < kFileSize; ++frame)
    text += std::to_string(frame) + "\t" + std::to_string((frame - 1) / 120.0) +
            row(random, 3 * kMarkers, 2000, "\t%.5f") + "\n";
  return text;
}

void countBytes(benchmark::State& state, std::string const& path) {
  state.SetBytesProcessed(state.iterations() * static_cast<int64>(std::filesystem::file_size(path)));
}

void readBvh(benchmark::State& state) {
  static TempFile const file(".bvh", bvhText());
  for (auto _ : state) benchmark::DoNotOptimize(talix::readBVH(file.path()).joints.data());
  countBytes(state, file.path());
}
BENCHMARK(readBvh)->Unit(benchmark::kMillisecond);

void writeBvh(benchmark::State& state) {
  static TempFile const file(".in.bvh", bvhText());
  static TempFile const out(".out.bvh", "");
  Take const take = talix::readBVH(file.path());
  for (auto _ : state) {
    std::vector<talix::TakeNote> notes;
    talix::writeBVH(talix::sourceOf(take), out.path(), notes);
  }
  countBytes(state, out.path());
}
BENCHMARK(writeBvh)->Unit(benchmark::kMillisecond);

void readTrc(benchmark::State& state) {
  static TempFile const file(".trc", trcText());
  for (auto _ : state) benchmark::DoNotOptimize(talix::readTRC(file.path()).points.data());
  countBytes(state, file.path());
}
BENCHMARK(readTrc)->Unit(benchmark::kMillisecond);

}  // namespace
