// Channels of the scene at the frames of a take: which of them belong to it, where they have data, and their
// values.
#pragma once

#include <memory>

#include "host/keys/SampleTimes.h"
#include "host/scene/Database.h"

namespace talix {

// Whole frames: frame i lies at start() + i * period.
struct FrameGrid {
  int64 firstFrame = 0;
  int64 count = 0;
  int64 period = 1;  // ticks

  int64 start() const { return firstFrame * period; }
  int64 end() const { return start() + (count - 1) * period; }
};

class FrameSampler {
 public:
  // The scene's active clip; without one (or with a blend, which holds no keys) every frame has a value.
  FrameSampler(Database const& scene, FrameGrid const& grid);

  FrameGrid const& grid() const { return m_grid; }
  NLEClip const* clip() const { return m_clip; }
  // What the scene shows: the clip, or a blend of several; null: the default values.
  NLEClip const* shown() const;

  // Whether a channel has to do with the clip: it has a track there, or in no clip at all.
  bool belongsToClip(Controller const&) const;
  // In any layer of the clip.
  bool hasKeys(Controller const& channel) const { return m_clip ? channel.hasKeysInClip(m_clip) : false; }
  // Whether the channel may change over time: keys in the clip, or an active blend.
  bool mayChange(Controller const&) const;

  // The keys that tell where the channel has data in the clip; null: none.
  KeyTrack const* dataTrack(Controller const& channel) const { return channel.findDataTrack(m_clip); }
  // Sets known[i] to false where the channel has no data at times[i].
  void markGaps(Controller const&, SampleTimes const& times, bool* known) const;
  // The values that the scene shows at these times, as KeyTrack holds them.
  void sample(Controller const&, SampleTimes const& times, double* values) const;

  // How many keys lie at none of these times: those that sampling loses.
  int64 keysOff(Controller const&, SampleTimes const& times) const;
  int64 keysOffGrid(Controller const& channel) const {
    return keysOff(channel, SampleTimes(m_grid.start(), m_grid.period, m_grid.count));
  }

 private:
  Database const& m_scene;
  FrameGrid m_grid;
  NLEClip const* m_clip = nullptr;  // null: every frame counts
  bool m_blends = false;
};
// Shared by all sources that read through it.
using FrameSamplerPtr = std::shared_ptr<FrameSampler const>;

}  // namespace talix
