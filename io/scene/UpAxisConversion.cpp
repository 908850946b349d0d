#include "io/scene/UpAxisConversion.h"

#include <numbers>

namespace talix {

Vec3 UpAxisConversion::operator()(Vec3 const& v) const {
  if (isIdentity()) return v;
  Vec3 turned = v;
  turned[m_to] = v[m_from];
  turned[m_from] = 0 - v[m_to];  // no negative zeros
  return turned;
}

TalixRotation UpAxisConversion::rotation() const {
  if (isIdentity()) return {};
  Vec3 axis;
  axis[3 - m_from - m_to] = (m_from + 1) % 3 == m_to ? 1 : -1;
  return TalixRotation(axis * (std::numbers::pi / 2));
}

bool isNoRotation(TalixRotation const& rotation) {
  double q[4];
  rotation.getQuaternion(q);
  return q[0] == 0 && q[1] == 0 && q[2] == 0;
}

FileToParent::FileToParent(UpAxisConversion const& turn, Node const* parent) : m_turn(turn) {
  if (!parent) return;
  Transform const world = parent->getWorldTransform(0);
  m_origin = world.position;
  m_unturn = world.rotation.inverse();
  for (int axis = 0; axis < 3; ++axis) m_scale[axis] = world.scale[axis] != 0 ? 1 / world.scale[axis] : 1;
  m_parentIsWorld = m_origin == Vec3() && m_scale == Vec3(1, 1, 1) && isNoRotation(m_unturn);
}

Vec3 FileToParent::position(Vec3 const& inFile) const {
  Vec3 const turned = m_turn(inFile);
  return m_parentIsWorld ? turned : scaled(m_unturn.rotate(turned - m_origin), m_scale);
}

TalixRotation FileToParent::rotation() const {
  return m_parentIsWorld ? m_turn.rotation() : m_unturn * m_turn.rotation();
}

}  // namespace talix
