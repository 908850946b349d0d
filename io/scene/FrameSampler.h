// Channels of the scene as tracks with one key at each frame of a range: what take formats hold.
#pragma once

#include <functional>
#include <string>

#include "host/scene/Database.h"
#include "io/Take.h"

namespace talix {

// Whole frames: frame i lies at start() + i * period.
struct FrameGrid {
  int64 firstFrame = 0;
  int64 count = 0;
  int64 period = 1;  // ticks

  int64 start() const { return firstFrame * period; }
  int64 end() const { return start() + (count - 1) * period; }
  bool contains(int64 time) const { return time >= start() && time <= end() && time % period == 0; }
};

// Appends values frame by frame; runs go to the track whole.
class FrameRun {
 public:
  FrameRun(KeyTrack::Shape shape, FrameGrid const& grid) : m_track(shape), m_grid(grid) {}

  void add(int64 frame, double const* values);
  KeyTrack take();

 private:
  void flush();

  KeyTrack m_track;
  FrameGrid const& m_grid;
  int64 m_first = 0, m_count = 0;
  std::vector<double> m_values;
};

class FrameSampler {
 public:
  // The scene's active clip; without one (or with a blend, which holds no keys) every frame has a value.
  FrameSampler(Database const& scene, FrameGrid const& grid);

  FrameGrid const& grid() const { return m_grid; }
  NLEClip const* clip() const { return m_clip; }

  // Whether a channel has to do with the clip: it has a track there, or in no clip at all.
  bool belongsToClip(Controller const&) const;
  // In any layer of the clip.
  bool hasKeys(Controller const& channel) const { return m_clip ? channel.hasKeysInClip(m_clip) : false; }
  // Whether the channel may change over time: keys in the clip, or an active blend.
  bool mayChange(Controller const&) const;

  // The keys that tell where a channel has data in the clip; null: none.
  KeyTrack const* dataTrack(Controller const& channel) const { return channel.findDataTrack(m_clip); }
  // That track, when it alone makes the channel's values and its keys, all whole and at frames, are all data;
  // else null.
  KeyTrack const* asItIs(Controller const&) const;

  // A value at the frames that have data.
  KeyTrack sampleWhere(std::vector<bool> const& frames, Controller const&) const;
  // A value at every frame: the channel's own track where that is what it holds.
  KeyTrack everyFrame(Controller const&) const;

  // The frames at which any component of a channel has data.
  std::vector<bool> framesWithData(Controller const&) const;

  // How many keys lie at no frame of the grid; sampled channels lose them.
  int64 keysOffGrid(Controller const&) const;

 private:
  Database const& m_scene;
  FrameGrid m_grid;
  NLEClip const* m_clip = nullptr;  // null: every frame counts
  bool m_blends = false;
};

}  // namespace talix
