#include "io/c3d/C3DData.h"

#include <algorithm>
#include <cmath>

#include "host/time/Ticks.h"

namespace talix {

namespace {

// A block of frames is read point by point, so it should stay in the processor's cache meanwhile.
constexpr size_t kBlockBytes = size_t{1} << 19;
constexpr int64 kMostFramesInBlock = 256;

template <C3DProcessor processor>
struct RealValues {
  static constexpr size_t kBytes = 4;
  static double value(char const* at) { return C3DNumbers<processor>::real(at); }
  static double unsignedValue(char const* at) { return value(at); }
};

template <C3DProcessor processor>
struct IntegerValues {
  static constexpr size_t kBytes = 2;
  static double value(char const* at) { return C3DNumbers<processor>::integer(at); }
  static double unsignedValue(char const* at) { return C3DNumbers<processor>::word(at); }
};

// A run of frames in which a point is seen, gathered for one append.
struct Run {
  int64 start = 0;  // frame from the take's first
  int64 length = 0;
  bool residual = false;  // one at least is not 0
  std::vector<double> positions, residuals;

  explicit Run(int64 most) : positions(static_cast<size_t>(3 * most)), residuals(static_cast<size_t>(most)) {}
};

template <class Values>
class DataReader {
 public:
  DataReader(FileBytes const& file, C3DLayout const& layout, double analogRate)
      : m_file(file),
        m_layout(layout),
        m_framesInBlock(
            std::clamp<int64>(static_cast<int64>(kBlockBytes / layout.frameBytes()), 1, kMostFramesInBlock)),
        m_period(ticksPerFrameAt(layout.rate)),
        m_start(layout.firstFrame * m_period),
        m_samplePeriod(analogRate > 0 ? ticksPerFrameAt(analogRate) : 0),
        m_run(m_framesInBlock),
        m_samples(static_cast<size_t>(m_framesInBlock * layout.samplesPerFrame)) {}

  C3DDataCounts read(std::vector<C3DPointTarget> const& points, std::vector<C3DAnalogTarget> const& analog) {
    size_t const frameBytes = m_layout.frameBytes();
    for (int64 first = 0; first < m_layout.frameCount; first += m_framesInBlock) {
      int64 const frames = std::min(m_framesInBlock, m_layout.frameCount - first);
      size_t const offset = m_layout.dataStart + static_cast<size_t>(first) * frameBytes;
      char const* at = m_file.view().data() + offset;
      for (size_t i = 0; i < points.size(); ++i)
        readPoint(at + i * 4 * Values::kBytes, first, frames, points[i]);
      char const* samples = at + points.size() * 4 * Values::kBytes;
      for (size_t i = 0; i < analog.size(); ++i)
        readChannel(samples + i * Values::kBytes, first, frames, analog[i]);
      m_file.passed(offset);
    }
    return m_counts;
  }

 private:
  void readPoint(char const* at, int64 first, int64 frames, C3DPointTarget const& target) {
    double const factor = target.factor;
    m_run.length = 0;
    for (int64 i = 0; i < frames; ++i, at += m_layout.frameBytes()) {
      double const fourth = Values::value(at + 3 * Values::kBytes);
      double const xyz[] = {Values::value(at), Values::value(at + Values::kBytes),
                            Values::value(at + 2 * Values::kBytes)};
      bool const finite = std::isfinite(xyz[0] + xyz[1] + xyz[2]);
      if (!(fourth >= 0) || !finite) {
        if (fourth >= 0 && target.point) ++m_counts.notFinite;
        endRun(target);
        continue;
      }
      if (m_run.length == 0) m_run.start = first + i;
      double* position = &m_run.positions[static_cast<size_t>(3 * m_run.length)];
      for (int axis = 0; axis < 3; ++axis) position[axis] = xyz[axis] * factor;
      if (target.point) readFourth(fourth, first + i, target);
      if (target.point && xyz[0] == 0 && xyz[1] == 0 && xyz[2] == 0) ++m_counts.atOrigin;
      ++m_run.length;
    }
    endRun(target);
  }

  // The fourth value holds the residual in its low and the cameras in its high byte, reals after cutting
  // them.
  void readFourth(double fourth, int64 frame, C3DPointTarget const& target) {
    int const word = static_cast<int>(std::min(fourth, 32767.0));
    m_run.residuals[static_cast<size_t>(m_run.length)] = (word & 0xff) * target.residualStep;
    if (word & 0xff) m_run.residual = true;
    auto const cameras = static_cast<unsigned char>(word >> 8);
    if (cameras == 0) return;
    auto& masks = target.point->cameras;
    if (masks.empty()) masks.resize(static_cast<size_t>(m_layout.frameCount));
    masks[static_cast<size_t>(frame)] = cameras;
  }

  void endRun(C3DPointTarget const& target) {
    if (m_run.length == 0) return;
    int64 const time = m_start + m_run.start * m_period;
    KeyTrack& positions = target.point ? target.point->positions : target.output->values;
    if (target.point) {
      KeyTrack& residuals = target.point->residuals;
      if (m_run.residual && residuals.empty()) fillWithZeros(positions, residuals);
      if (m_run.residual || !residuals.empty())
        residuals.append(time, m_period, m_run.residuals.data(), m_run.length);
      m_counts.seen += m_run.length;
    }
    positions.append(time, m_period, m_run.positions.data(), m_run.length);
    m_run.length = 0;
    m_run.residual = false;
  }

  // Most files without residuals have none at all, so a track is made at the first that is not 0.
  static void fillWithZeros(KeyTrack const& positions, KeyTrack& residuals) {
    positions.forEach(0, positions.count(), [&](KeyTrack::Key const& key) { residuals.set(key.time, {}); });
  }

  void readChannel(char const* at, int64 first, int64 frames, C3DAnalogTarget const& target) {
    size_t const step = static_cast<size_t>(m_layout.channelCount) * Values::kBytes;
    double const scale = target.channel->scale, offset = target.channel->offset;
    double* sample = m_samples.data();
    for (int64 i = 0; i < frames; ++i, at += m_layout.frameBytes()) {
      char const* value = at;
      for (int64 j = 0; j < m_layout.samplesPerFrame; ++j, value += step)
        *sample++ =
            ((target.isUnsigned ? Values::unsignedValue(value) : Values::value(value)) - offset) * scale;
    }
    int64 const time = m_start + first * m_layout.samplesPerFrame * m_samplePeriod;
    appendSamples(time, frames * m_layout.samplesPerFrame, target.channel->samples);
  }

  void appendSamples(int64 time, int64 count, KeyTrack& track) {
    double const *begin = m_samples.data(), *end = begin + count;
    for (double const* from = begin; from != end;) {
      double const* to = std::find_if(from, end, [](double value) { return !std::isfinite(value); });
      if (to != from) track.append(time + (from - begin) * m_samplePeriod, m_samplePeriod, from, to - from);
      from = std::find_if(to, end, [](double value) { return std::isfinite(value); });
      m_counts.badSamples += from - to;
    }
  }

  FileBytes const& m_file;
  C3DLayout const& m_layout;
  int64 const m_framesInBlock;
  int64 const m_period, m_start;  // ticks
  int64 const m_samplePeriod;     // ticks
  Run m_run;
  std::vector<double> m_samples;
  C3DDataCounts m_counts;
};

}  // namespace

C3DDataCounts readC3DData(FileBytes const& file, C3DProcessor processor, C3DLayout const& layout,
                          std::vector<C3DPointTarget> const& points,
                          std::vector<C3DAnalogTarget> const& analog, double analogRate) {
  if (layout.frameBytes() == 0) return {};
  auto const read = [&](auto real, auto integer) {
    if (layout.real) return DataReader<decltype(real)>(file, layout, analogRate).read(points, analog);
    return DataReader<decltype(integer)>(file, layout, analogRate).read(points, analog);
  };
  using enum C3DProcessor;
  if (processor == DEC) return read(RealValues<DEC>(), IntegerValues<DEC>());
  if (processor == MIPS) return read(RealValues<MIPS>(), IntegerValues<MIPS>());
  return read(RealValues<Intel>(), IntegerValues<Intel>());
}

}  // namespace talix
