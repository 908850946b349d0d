// Keys of a track at evenly spaced times: the only ones that a C3D file has room for.
#pragma once

#include "host/keys/KeyTrack.h"

namespace talix {

struct C3DGrid {
  int64 start = 0;   // ticks
  int64 period = 1;  // ticks
  int64 count = 0;
};

// Keys that a file with this grid cannot hold.
struct C3DLeftOver {
  int64 between = 0;  // at no time of the grid
  int64 outside = 0;  // before its first or after its last time
  int64 partial = 0;  // at a time of the grid, without a value on every axis
};

C3DLeftOver c3dLeftOver(KeyTrack const& track, C3DGrid const& grid);

// Walks along the grid. The track must outlive it and stay as it is.
class C3DGridReader {
 public:
  C3DGridReader(KeyTrack const& track, C3DGrid const& grid);

  // The whole key at the next time of the grid; null: there is none. Valid until the next call.
  KeyTrack::Key const* next();

 private:
  void advance();

  KeyTrack::Reader m_reader;
  int64 m_left;  // keys not yet read
  KeyTrack::Key m_key;
  bool m_hasKey = false;
  int64 m_time;
  int64 m_period;
};

}  // namespace talix
