#include "host/scene/Constraints.h"

H_DEFINE_ABSTRACT_CLASS(ConstraintBase);
H_DEFINE_ABSTRACT_CLASS(PositionConstraintBase);
H_DEFINE_CLASS(LabelingConstraint);
H_DEFINE_CLASS(SolvingConstraint);
H_DEFINE_CLASS(LabelingCluster);

void ConstraintBase::setUp() {
  Node::setUp();
  m_source = addBuiltIn<ModAttribute>("Source");
  m_target = addBuiltIn<ModAttribute>("Target");
}

Node* ConstraintBase::getSource() const {
  return objectAs<Node>(static_cast<HObject*>(m_source->getValue()));
}

BaseBone* ConstraintBase::getTarget() const {
  return objectAs<BaseBone>(static_cast<HObject*>(m_target->getValue()));
}

bool ConstraintBase::setSource(Node* source) {
  if (source && !source->isInScene()) return false;
  m_source->setValue(source, true, true, true, true);
  return true;
}

void ConstraintBase::setTarget(BaseBone* target) { m_target->setValue(target, true, true, true, true); }

void PositionConstraintBase::setUp() {
  ConstraintBase::setUp();
  m_offset = addBuiltIn<VectorAttribute>("Offset");
}

Vec3 PositionConstraintBase::getConstraintOffsetWS(int64 time) const {
  BaseBone const* target = getTarget();
  if (!target) return getConstraintOffset();
  Transform const space = target->getWorldTransform(time);
  return space.position + space.rotation.rotate(scaled(getConstraintOffset(), space.scale));
}

bool PositionConstraintBase::setConstraintOffset(Vec3 const& offset) {
  if (!isFinite(offset)) return false;
  m_offset->setValue(offset, true, true, true, true);
  return true;
}

SolvingConstraint* SolvingConstraint::createInstance() {
  auto* constraint = new SolvingConstraint;
  constraint->setUp();
  return constraint;
}

void LabelingCluster::setUp() {
  Node::setUp();
  m_markers = addBuiltIn<MultiModAttribute>("Markers");
}

TSimpleArray<Vec3> LabelingCluster::getMarkerOffsets() const {
  TSimpleArray<Vec3> offsets;
  for (int i = 0; i < m_markers->getNumModules(); ++i) {
    auto const* marker = objectAs<Node>(static_cast<HObject*>(m_markers->getModuleValue(i)));
    offsets.add(marker ? marker->getConstPosInSpaceOfNode(this) : Vec3());
  }
  return offsets;
}
