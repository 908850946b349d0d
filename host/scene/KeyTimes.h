// The times at which channels have keys.
#pragma once

#include <algorithm>
#include <vector>

#include "host/scene/Clips.h"
#include "host/scene/SceneReader.h"

using KeyTimes = std::vector<int64>;  // ascending, in ticks

inline KeyTimes keyTimesOf(KeyTrack const& track) {
  KeyTimes times;
  times.reserve(static_cast<size_t>(track.count()));
  track.forEach(0, track.count(), [&](KeyTrack::Key const& key) { times.push_back(key.time); });
  return times;
}

// Adds times to others.
inline void mergeTimes(KeyTimes& times, KeyTimes const& more) {
  if (std::includes(times.begin(), times.end(), more.begin(), more.end())) return;
  KeyTimes all;
  all.reserve(times.size() + more.size());
  std::set_union(times.begin(), times.end(), more.begin(), more.end(), std::back_inserter(all));
  times = std::move(all);
}

// Adds the key times of a channel in all layers of a clip.
inline void mergeKeyTimes(KeyTimes& times, Controller const& channel, NLEClip const& clip) {
  for (int layer = 0; layer < clip.getNumLayers(); ++layer)
    if (KeyTrack const* track = channel.findTrack(&clip, layer)) mergeTimes(times, keyTimesOf(*track));
}
inline void mergeKeyTimes(KeyTimes& times, ChannelState const& channel, NLEClip const* clip) {
  for (ChannelState::Layer const& layer : channel.layers)
    if (layer.clip == clip) mergeTimes(times, keyTimesOf(layer.keys));
}
