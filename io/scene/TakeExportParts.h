// The parts of making a take from the scene.
#pragma once

#include <string>
#include <vector>

#include "io/scene/SceneSources.h"

namespace talix {

// What the parts share and count.
struct TakeExport {
  Database& scene;
  FrameSamplerPtr sampler;
  TakeSource& take;
  std::vector<TakeNote>& notes;
  int64 keysLeftOut = 0;  // between frames, or outside the range

  void warn(std::string const& text) { notes.push_back({TakeNote::Level::Warning, text}); }
};

// Whether positions below this node (null: the world) are world positions, at all times.
bool isWorldSpace(FrameSampler const&, Node const*);

void exportPoints(TakeExport&);
void exportJoints(TakeExport&);
void exportDevices(TakeExport&);

}  // namespace talix
