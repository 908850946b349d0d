#include "io/c3d/C3DDataWriter.h"

#include <algorithm>
#include <cmath>

#include "io/c3d/C3DBytes.h"
#include "io/c3d/C3DParameterWriter.h"

namespace talix {

namespace {

constexpr size_t kFlushBytes = size_t{1} << 20;
constexpr double kMostResidual = 255;
constexpr double kLeastResidual = 1e-30;  // mm; a scale made of less could become 0 in the file
constexpr unsigned kCameras = 0x7f;

bool fitsReal(double value) { return std::isfinite(static_cast<float>(value)); }

class DataWriter {
 public:
  DataWriter(TakeSource const& take, C3DDataPlan const& plan, std::ostream& out)
      : m_plan(plan), m_out(out), m_points(take.points.size()) {
    auto const vectors = [this](SampleSourcePtr const& source) { m_vectors.emplace_back(source.get(), 3); };
    for (PointSource const& point : take.points) {
      vectors(point.positions);
      m_residuals.emplace_back(point.residuals.get(), 1);
      m_cameras.emplace_back(point.cameras.get(), 1);
    }
    for (ModelOutputSource const& output : take.outputs) vectors(output.values);
    if (!plan.withAnalog) return;
    for (AnalogSource const& channel : take.analog) m_analog.emplace_back(channel.samples.get(), 1);
  }

  C3DDataLosses write(std::function<void(int64 frame)> const& tell) {
    int64 const frames = m_plan.frames.count(), perFrame = m_plan.samplesPerFrame;
    int64 const block = SampleBlock::lengthFor(3 * m_vectors.size() + 2 * m_points +
                                               m_analog.size() * static_cast<size_t>(perFrame));
    for (int64 first = 0; first < frames && !(m_vectors.empty() && m_analog.empty()); first += block) {
      tell(first);
      int64 const count = std::min(block, frames - first);
      SampleTimes const times = m_plan.frames.part(first, count);
      for (auto* blocks : {&m_vectors, &m_residuals, &m_cameras})
        for (SampleBlock& each : *blocks) each.read(times);
      for (SampleBlock& each : m_analog) each.read(m_plan.samples.part(first * perFrame, count * perFrame));
      for (int64 i = 0; i < count; ++i) writeFrame(i);
    }
    flush();
    size_t const used = m_written % kC3DBlock;
    if (used) m_out << std::string(kC3DBlock - used, '\0');
    return m_losses;
  }

 private:
  void flush() {
    m_out.write(m_bytes.data(), static_cast<std::streamsize>(m_bytes.size()));
    m_written += m_bytes.size();
    m_bytes.clear();
  }

  // By its index in the block.
  void writeFrame(int64 i) {
    for (size_t k = 0; k < m_points; ++k) writeVector(m_vectors[k].at(i), m_plan.unit, fourth(k, i));
    for (size_t k = m_points; k < m_vectors.size(); ++k) writeVector(m_vectors[k].at(i), 1, 0);
    for (int64 j = 0; j < m_plan.samplesPerFrame; ++j)
      for (SampleBlock const& channel : m_analog) writeSample(channel.at(i * m_plan.samplesPerFrame + j));
    if (m_bytes.size() >= kFlushBytes) flush();
  }

  // Residual and cameras of a point.
  double fourth(size_t point, int64 i) {
    double const *residual = m_residuals[point].at(i), *cameras = m_cameras[point].at(i);
    double const steps = residual ? std::round(*residual / m_plan.residualStep) : 0;
    auto const mask = cameras ? static_cast<unsigned>(std::lround(*cameras)) & 0xff : 0;
    if (mask & ~kCameras) m_losses.camerasOf.insert(point);
    return std::clamp(steps, 0.0, kMostResidual) + 256.0 * (mask & kCameras);
  }

  void writeVector(double const* vector, double unit, double fourth) {
    double values[] = {0, 0, 0, -1};
    if (vector) {
      for (size_t axis = 0; axis < 3; ++axis) values[axis] = vector[axis] / unit;
      values[3] = fourth;
    }
    if (!std::all_of(std::begin(values), std::end(values), fitsReal)) {
      ++m_losses.positions;
      std::fill_n(values, 3, 0.0);
      values[3] = -1;
    }
    for (double const value : values) appendC3DReal(m_bytes, value);
  }

  void writeSample(double const* sample) {
    bool const usable = sample && fitsReal(*sample);
    if (!usable) ++m_losses.samples;
    appendC3DReal(m_bytes, usable ? *sample : 0);
  }

  C3DDataPlan const& m_plan;
  std::ostream& m_out;
  size_t m_points;
  std::vector<SampleBlock> m_vectors;  // points, then outputs
  std::vector<SampleBlock> m_residuals, m_cameras, m_analog;
  std::string m_bytes;
  size_t m_written = 0;
  C3DDataLosses m_losses;
};

// Euclid's algorithm on numbers that went through a few roundings.
double commonStep(double a, double b) {
  double const tolerance = 1e-6 * std::min(a, b);
  while (b > tolerance) {
    double const rest = std::abs(std::remainder(a, b));
    a = b;
    b = rest;
  }
  return a;
}

}  // namespace

double c3dResidualStep(TakeSource const& take, SampleTimes const& frames, bool& exact) {
  double step = 0, largest = 0;
  exact = true;
  auto const add = [&](double residual) {
    if (!(residual > kLeastResidual) || !fitsReal(residual)) return;
    largest = std::max(largest, residual);
    if (exact && residual != step) step = step == 0 ? residual : commonStep(step, residual);
    exact = exact && largest <= (kMostResidual + 0.5) * step;
  };
  int64 const length = SampleBlock::lengthFor(1);
  for (PointSource const& point : take.points) {
    SampleBlock block(point.residuals.get(), 1);
    for (int64 first = 0; point.residuals && first < frames.count(); first += length) {
      SampleTimes const times = frames.part(first, std::min(length, frames.count() - first));
      block.read(times);
      for (int64 i = 0; i < times.count(); ++i)
        if (double const* residual = block.at(i)) add(*residual);
    }
  }
  if (largest == 0) return 1;
  return exact ? step : largest / kMostResidual;
}

C3DDataLosses writeC3DData(TakeSource const& take, C3DDataPlan const& plan, std::ostream& out,
                           std::function<void(int64 frame)> const& tell) {
  return DataWriter(take, plan, out).write(tell);
}

}  // namespace talix
