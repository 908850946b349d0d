// What a marker's fill type says of runs of keys that are taken out of its positions.
#pragma once

#include "host/scene/Marker.h"

// Keys the fill type "reduced" at the key before each run that is gone from `before` to `after`, instead of
// what is there up to its last key, so that its frames count as data. At the next key the fill type is as it
// was.
void markReduced(Marker& marker, NLEClip* clip, int layer, KeyTrack const& before, KeyTrack const& after);

// Lives while keys from one time to another are deleted from a channel: runs that are cut, not reduced, from
// a marker's positions count as data no longer, thinned or not. Costs what the keys in that range do.
class CutRuns {
 public:
  CutRuns(Controller const& channel, int64 first, int64 last);
  ~CutRuns();
  CutRuns(CutRuns const&) = delete;
  CutRuns& operator=(CutRuns const&) = delete;

 private:
  Marker* m_marker = nullptr;  // null: nothing to mind
  NLEClip* m_clip = nullptr;
  int m_layer = 0;
  int64 m_first, m_last;
  KeyTrack m_before;
};
