// Turning what a file holds to the scene's up axis, and into the space below a node.
#pragma once

#include "host/scene/Node.h"

namespace talix {

// The quarter turn that takes one axis to another (0 x, 1 y, 2 z): y to z makes (x, y, z) to (x, -z, y).
class UpAxisConversion {
 public:
  UpAxisConversion() = default;  // no turn
  UpAxisConversion(int from, int to) : m_from(from), m_to(to) {}

  bool isIdentity() const { return m_from == m_to; }
  // Exact: swaps and changes signs.
  Vec3 operator()(Vec3 const&) const;
  TalixRotation rotation() const;

 private:
  int m_from = 0, m_to = 0;
};

bool isNoRotation(TalixRotation const&);

// From a file's world to the space below a node (null: the scene's world), which must not move.
class FileToParent {
 public:
  FileToParent(UpAxisConversion const& turn, Node const* parent);

  bool isIdentity() const { return m_turn.isIdentity() && m_parentIsWorld; }
  bool isScaled() const { return !(m_scale == Vec3(1, 1, 1)); }
  Vec3 position(Vec3 const& inFile) const;
  TalixRotation rotation() const;

 private:
  UpAxisConversion m_turn;
  bool m_parentIsWorld = true;
  Vec3 m_origin, m_scale{1, 1, 1};
  TalixRotation m_unturn;
};

}  // namespace talix
