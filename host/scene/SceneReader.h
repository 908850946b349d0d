// Reads the motion of many nodes over many times, faster than node by node and without writing to the scene.
//
// A reader holds a copy of what its nodes and all above them are like when it is made: parents,
// pre-transforms, default values and the keys of one clip (a blend: of its sources). Copies of tracks cost a
// reference each; later edits do not show. Reading changes nothing, neither in the scene nor in the reader,
// so several threads may read with one reader, or make readers of one unchanging scene, at once.
//
// Cost: each channel is sampled in blocks, constant ones once; a node that serves several others is worked
// out once a block. Values agree with Node's own within 1e-12 of their size.
#pragma once

#include <array>
#include <functional>
#include <span>
#include <vector>

#include "host/scene/ChannelSampling.h"
#include "host/scene/Node.h"

// What a channel holds in every clip and layer at one moment.
struct ChannelState {
  struct Layer {
    NLEClip const* clip;
    int layer;
    KeyTrack keys;
  };
  DataSource::PropertyType type = DataSource::NoProperty;
  Interpolation interpolation = Interpolation::Linear;
  KeyTrack::Values byDefault{};
  std::vector<Layer> layers;

  explicit ChannelState(Controller const& channel);
  KeyTrack const* find(NLEClip const* clip, int layer) const;  // null: no track
  bool hasKeysIn(NLEClip const* clip) const;
};

// What a node is like at one moment.
struct NodeState {
  Node const* parent;  // the nearest node above
  Vec3 preTranslation;
  TalixRotation preRotation;
  ChannelState translation, rotation, scale;

  explicit NodeState(Node const& node);
  std::array<ChannelState const*, 3> channels() const { return {&translation, &rotation, &scale}; }
};

class SceneReader {
 public:
  // Where the results go; null: not wanted. That of time i and node n stands at (i * nodes + n) times the
  // width.
  struct Arrays {
    double* positions = nullptr;  // x y z, millimetres
    double* rotations = nullptr;  // unit quaternions x y z w
    double* scales = nullptr;     // x y z
    double* matrices =
        nullptr;  // 4 by 4, row by row: scale, then rotation, then the position in the last column
  };
  // Another state of a node than its present one; null: as it is.
  using Former = std::function<NodeState const*(Node const*)>;

  // `clip`: what is shown; null: the default values.
  SceneReader(std::span<Node const* const> nodes, NLEClip const* clip, Former const& former = {});
  ~SceneReader();
  SceneReader(SceneReader&&) noexcept;

  int getNumNodes() const { return m_numNodes; }
  // From the first to the last key of all that is read, outside of which nothing moves; empty without keys.
  HTimeRange getMotionRange() const;
  // World transforms at ascending times (ticks).
  void readWorld(SampleTimes const& times, Arrays const& arrays) const;
  std::vector<Transform> readWorld(SampleTimes const& times) const;

 private:
  class Channel;
  struct Joint;
  struct Source;
  struct Run;
  class Pass;

  void workOutStill();

  int m_numNodes;
  std::vector<Source> m_sources;  // the clips, and how much each counts in a blend
  std::vector<Joint>
      m_joints;  // nodes and what is above them; each comes right after all below its earlier siblings
  int m_depth = 0;
  bool m_blends = false;
};
