// A key of a track by where it lies. Valid until the track changes.
#pragma once

#include "host/keys/KeyInner.h"
#include "host/keys/KeyTrack.h"

struct KeyTrack::Place {
  const KeyLeaf* leaf = nullptr;  // null: there is no such key
  int64 index = -1;
  int slot = 0;

  explicit operator bool() const { return leaf != nullptr; }
  int64 time() const { return leaf->time(slot); }
  double value(int component) const { return leaf->value(slot, component); }
};
