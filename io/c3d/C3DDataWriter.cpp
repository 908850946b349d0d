#include "io/c3d/C3DDataWriter.h"

#include <algorithm>
#include <cmath>
#include <deque>

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
  DataWriter(Take const& take, C3DDataPlan const& plan, std::ostream& out)
      : m_take(take), m_plan(plan), m_out(out) {
    for (TakePoint const& point : take.points) {
      m_positions.emplace_back(point.positions, plan.frames);
      m_residuals.emplace_back(point.residuals, plan.frames);
    }
    for (ModelOutput const& output : take.outputs) m_outputs.emplace_back(output.values, plan.frames);
    if (!plan.withAnalog) return;
    for (TakeAnalogChannel const& channel : take.analog) m_analog.emplace_back(channel.samples, plan.samples);
  }

  C3DDataLosses write() {
    int64 const frames = m_plan.frames.count;
    bool const anything = !m_positions.empty() || !m_outputs.empty() || !m_analog.empty();
    for (int64 frame = 0; anything && frame < frames; ++frame) {
      for (size_t i = 0; i < m_positions.size(); ++i) writePoint(i, frame);
      for (C3DGridReader& output : m_outputs) writeVector(output.next(), 1, 0);
      for (int64 i = 0; i < m_plan.samples.count / frames; ++i) writeSamples();
      if (m_bytes.size() >= kFlushBytes) flush();
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

  void writePoint(size_t index, int64 frame) {
    TakePoint const& point = m_take.points[index];
    KeyTrack::Key const* residual = m_residuals[index].next();
    double const steps = residual ? std::round(residual->values[0] / m_plan.residualStep) : 0;
    auto const at = static_cast<size_t>(frame);
    unsigned const cameras = at < point.cameras.size() ? point.cameras[at] & kCameras : 0;
    writeVector(m_positions[index].next(), m_plan.unit,
                std::clamp(steps, 0.0, kMostResidual) + 256.0 * cameras);
  }

  void writeVector(KeyTrack::Key const* key, double unit, double fourth) {
    double values[] = {0, 0, 0, -1};
    if (key) {
      for (size_t axis = 0; axis < 3; ++axis) values[axis] = key->values[axis] / unit;
      values[3] = fourth;
    }
    if (!std::all_of(std::begin(values), std::end(values), fitsReal)) {
      ++m_losses.positions;
      std::fill_n(values, 3, 0.0);
      values[3] = -1;
    }
    for (double const value : values) appendC3DReal(m_bytes, value);
  }

  void writeSamples() {
    for (C3DGridReader& channel : m_analog) {
      KeyTrack::Key const* key = channel.next();
      bool const usable = key && fitsReal(key->values[0]);
      if (!usable) ++m_losses.samples;
      appendC3DReal(m_bytes, usable ? key->values[0] : 0);
    }
  }

  Take const& m_take;
  C3DDataPlan const& m_plan;
  std::ostream& m_out;
  std::deque<C3DGridReader> m_positions, m_residuals, m_outputs, m_analog;
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

double c3dResidualStep(Take const& take, bool& exact) {
  double step = 0, largest = 0;
  exact = true;
  for (TakePoint const& point : take.points)
    point.residuals.forEach(0, point.residuals.count(), [&](KeyTrack::Key const& key) {
      double const residual = key.values[0];
      if (!(residual > kLeastResidual) || !fitsReal(residual)) return;
      largest = std::max(largest, residual);
      if (exact) step = step == 0 ? residual : commonStep(step, residual);
      exact = exact && largest <= (kMostResidual + 0.5) * step;
    });
  if (largest == 0) return 1;
  return exact ? step : largest / kMostResidual;
}

C3DDataLosses writeC3DData(Take const& take, C3DDataPlan const& plan, std::ostream& out) {
  return DataWriter(take, plan, out).write();
}

}  // namespace talix
