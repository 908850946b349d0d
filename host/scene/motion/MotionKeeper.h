// Keeping the motion of a node in the world for another parent (Node::parentAdjust).
//
// Per clip and channel there are two ways. Where the former parent's space does not move against the new
// one's, all keys of all layers take their values in the new space, which is exact at every time. Otherwise
// one layer (the active one; in other clips the lowest that is not locked) is keyed anew: exactly at every
// key time of the node and of what is above it then and now, as far as the curve needs a key there, and at
// whole frames between where the curve would otherwise deviate. Spans in which it deviates are halved until
// none does, so the keys added are at most twice those needed.
#pragma once

#include <array>
#include <string>

#include "host/scene/KeyTimes.h"
#include "host/scene/motion/MotionScope.h"

class MotionKeeper {
 public:
  MotionKeeper(Node& node, Node* target, HTimeRange const& range, MotionScope& scope);

  // False when something could not be kept, which is said in a warning; values that are not finite change
  // nothing.
  bool run();

 private:
  using Values = Controller::Values;
  enum Kind : unsigned char { kTranslation, kRotation, kScale };
  struct Part;
  struct Goals;
  class ClipMotion;
  struct Change {
    Controller* channel;
    NLEClip* clip;
    int layer;
    KeyTrack track;
  };

  bool isEverywhere() const;  // without ranges: at all times, in all clips, by default
  int layerToWrite(NLEClip const* clip) const;
  Values inNewSpace(Part part, MotionScope::Relation const& relation, Values const& own) const;
  bool changes(Part part, MotionScope::Relation const& relation) const;
  bool staysIn(NLEClip const* clip) const;
  void keepDefaults();
  void keepInClip(NLEClip* clip);
  bool moveKeys(Part part, NLEClip* clip, MotionScope::Relation const& relation);
  void apply();
  void warnOfBlend(NLEClip const* blend);
  void warnOfOtherClips();
  void cannotKeep(Part part, NLEClip const* clip, char const* why);

  Node& m_node;
  Node const* m_known;
  Node* m_target;
  HTimeRange m_range;
  MotionScope& m_scope;
  Database& m_scene;
  NodeState m_before;
  TalixRotation m_pre, m_back;
  Vec3 m_origin;
  std::array<Controller*, 3> m_channels;  // by kind
  std::array<Values, 3> m_defaults;       // as they will be
  std::vector<Change> m_changes;
  std::string m_problem;  // the first one
  int m_problems = 0;
  bool m_finite = true;
};
