// Constraints tie a source node to a target bone; clusters hold the markers of one labelling group.
#pragma once

#include "host/scene/Bones.h"

class ConstraintBase : public Node {
  H_DECLARE_CLASS(ConstraintBase, Node)

 public:
  Node* getSource() const;
  BaseBone* getTarget() const;
  bool setSource(Node* source);
  void setTarget(BaseBone* target);

 protected:
  void setUp() override;

 private:
  ModAttribute* m_source = nullptr;
  ModAttribute* m_target = nullptr;
};

class PositionConstraintBase : public ConstraintBase {
  H_DECLARE_CLASS(PositionConstraintBase, ConstraintBase)

 public:
  // Where the source should lie in the target's space, in millimetres.
  Vec3 getConstraintOffset() const { return m_offset->getValue(); }
  // The same in world space at a time; without a target that space is the world.
  Vec3 getConstraintOffsetWS(int64 time) const;
  // False for an offset that is not finite.
  bool setConstraintOffset(Vec3 const& offset);

 protected:
  void setUp() override;

 private:
  VectorAttribute* m_offset = nullptr;
};

class LabelingConstraint : public PositionConstraintBase {
  H_DECLARE_CLASS(LabelingConstraint, PositionConstraintBase)
};

class SolvingConstraint : public PositionConstraintBase {
  H_DECLARE_CLASS(SolvingConstraint, PositionConstraintBase)

 public:
  // One that is not in the scene yet.
  static SolvingConstraint* createInstance();
};

class LabelingCluster : public Node {
  H_DECLARE_CLASS(LabelingCluster, Node)

 public:
  // The default positions of the cluster's markers in its space, in the order of "Markers"; the zero vector
  // for an entry that is no node.
  TSimpleArray<Vec3> getMarkerOffsets() const;

 protected:
  void setUp() override;

 private:
  MultiModAttribute* m_markers = nullptr;
};
