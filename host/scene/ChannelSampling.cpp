#include "host/scene/ChannelSampling.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <vector>

#include "host/math/Quaternion.h"
#include "host/scene/Clips.h"

int LayeredKeys::width() const { return static_cast<int>(Controller::shapeOf(type)); }

bool LayeredKeys::isConstant() const {
  return std::all_of(layers.begin(), layers.end(),
                     [](KeyTrack const* track) { return !track || track->empty(); });
}

void LayeredKeys::sample(SampleTimes const& times, double* out) const {
  auto const count = static_cast<size_t>(times.count()), each = static_cast<size_t>(width());
  KeyTrack const* lowest = layers.empty() ? nullptr : layers[0];
  if (lowest && !lowest->empty()) {
    lowest->sample(times, interpolation, byDefault, KeyTrack::kAll, out, width());
  } else {
    for (size_t i = 0; i < count; ++i) std::copy_n(byDefault.data(), each, out + i * each);
  }
  // Each further layer adds, rotations compose on the right, and switches replace what is below.
  std::vector<double> added;
  KeyTrack::Values const neutral{0, 0, 0, type == DataSource::RotProperty ? 1.0 : 0.0};
  for (size_t layer = 1; layer < layers.size(); ++layer) {
    if (!layers[layer] || layers[layer]->empty()) continue;
    added.resize(count * each);
    layers[layer]->sample(times, interpolation, neutral, KeyTrack::kAll, added.data(), width());
    if (type == DataSource::BoolProperty) {
      std::copy(added.begin(), added.end(), out);
    } else if (type == DataSource::RotProperty) {
      for (size_t i = 0; i < count * each; i += each) multiplyQuaternions(out + i, added.data() + i, out + i);
    } else {
      for (size_t i = 0; i < count * each; ++i) out[i] += added[i];
    }
  }
}

std::vector<KeyTrack::Values> LayeredKeys::sample(SampleTimes const& times) const {
  auto const each = static_cast<size_t>(width());
  std::vector<double> all(static_cast<size_t>(times.count()) * each);
  sample(times, all.data());
  std::vector<KeyTrack::Values> values(static_cast<size_t>(times.count()));
  for (size_t i = 0; i < values.size(); ++i) std::copy_n(all.data() + i * each, each, values[i].data());
  return values;
}

void blendSamples(DataSource::PropertyType type, KeyTrack::Values const& byDefault,
                  std::span<double const* const> parts, std::span<double const* const> weights, size_t count,
                  double* out) {
  auto const width = static_cast<size_t>(Controller::shapeOf(type));
  bool const rotation = type == DataSource::RotProperty;
  for (size_t i = 0; i < count; ++i) {
    double sum = 0;
    for (double const* weight : weights) sum += std::max(weight[i], 0.0);
    KeyTrack::Values mean{};
    double const* first = nullptr;  // quaternions go to its side, since both signs stand for one rotation
    for (size_t part = 0; part < parts.size(); ++part) {
      if (!(weights[part][i] > 0)) continue;
      double const* value = parts[part] + i * width;
      if (!first) first = value;
      double weight = weights[part][i] / sum;
      if (rotation && std::inner_product(first, first + 4, value, 0.0) < 0) weight = -weight;
      for (size_t k = 0; k < width; ++k) mean[k] += weight * value[k];
    }
    if (!first) mean = byDefault;
    if (rotation) {
      double const length = std::sqrt(std::inner_product(mean.begin(), mean.end(), mean.begin(), 0.0));
      for (double& k : mean) k /= length;
    }
    std::copy_n(mean.data(), width, out + i * width);
  }
}

void Controller::sample(NLEClip const* clip, SampleTimes const& times, double* out) const {
  std::vector<KeyTrack const*> layers(clip ? static_cast<size_t>(clip->getNumLayers()) : 0);
  for (size_t layer = 0; layer < layers.size(); ++layer)
    layers[layer] = findTrack(clip, static_cast<int>(layer));
  LayeredKeys{getPropertyType(), m_interpolation, m_default, layers}.sample(times, out);
}
