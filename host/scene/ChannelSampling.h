// Channels at many times at once: what single evaluation gives, without its cost for each time.
//
// Nothing is cached or changed, so several threads may sample one unchanging scene.
#pragma once

#include <span>
#include <vector>

#include "host/keys/KeyTrack.h"
#include "host/keys/SampleTimes.h"
#include "host/scene/DataSource.h"

// How the keys of a channel in one clip make its values.
struct LayeredKeys {
  DataSource::PropertyType type;
  Interpolation interpolation;
  KeyTrack::Values byDefault;
  // By layer, from the lowest; null or empty: no keys there.
  std::span<KeyTrack const* const> layers;

  int width() const;        // doubles in a value: 1, 3, or 4 for a rotation's quaternion
  bool isConstant() const;  // no layer has keys
  // The values at ascending times, each width() doubles, one after the other.
  void sample(SampleTimes const& times, double* out) const;
  std::vector<KeyTrack::Values> sample(SampleTimes const& times) const;
};

// Several clips at once, as a blend shows them: the mean of `parts` (count values each) by weights, which are
// given time by time and need not sum to 1; one that is not positive counts as 0, and where all are the value
// is the default. `out` may be one of the parts.
void blendSamples(DataSource::PropertyType type, KeyTrack::Values const& byDefault,
                  std::span<double const* const> parts, std::span<double const* const> weights, size_t count,
                  double* out);
