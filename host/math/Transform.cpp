#include "host/math/Transform.h"

namespace {

double quotient(double a, double b) { return b == 0 ? 0 : a / b; }

}  // namespace

Vec3 quotients(Vec3 const& a, Vec3 const& b) {
  return {quotient(a.x, b.x), quotient(a.y, b.y), quotient(a.z, b.z)};
}

Transform Transform::operator*(Transform const& inner) const {
  return {position + rotation.rotate(scaled(inner.position, scale)), rotation * inner.rotation,
          scaled(scale, inner.scale)};
}

Transform Transform::relativeTo(Transform const& space) const {
  return {positionRelativeTo(space, position), space.rotation.inverse() * rotation,
          quotients(scale, space.scale)};
}

Vec3 positionRelativeTo(Transform const& space, Vec3 const& position) {
  return quotients(space.rotation.inverse().rotate(position - space.position), space.scale);
}
