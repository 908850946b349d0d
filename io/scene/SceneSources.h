// The scene's values for writers, pulled a block of times at a time. Sources read the scene as it is when
// they are read, and must not outlive it.
#pragma once

#include <functional>
#include <span>
#include <vector>

#include "io/TakeSource.h"
#include "io/scene/FrameSampler.h"

class Node;

namespace talix {

// The values of a channel, where all of `measured` have data (without any: at all times). `then` (may be
// null) is applied to each value.
SampleSourcePtr channelSource(FrameSamplerPtr, Controller const&, std::vector<Controller const*> measured,
                              std::function<void(double*)> then = nullptr);

// World positions and rotations of nodes, which are worked out together. Each source must be read at the same
// times as the others before any is read at the next: that is what writers do, and other orders only cost.
class WorldSources {
 public:
  explicit WorldSources(FrameSamplerPtr sampler);

  // Where the channel has data; null: at all times.
  SampleSourcePtr positions(Node const& node, Controller const* measured);
  SampleSourcePtr rotations(Node const& node);

 private:
  class Block;
  class Source;
  std::shared_ptr<Block> m_block;
};

}  // namespace talix
