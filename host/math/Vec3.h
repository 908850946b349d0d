// Three doubles: a position in millimetres, a direction, three Euler angles by axis, a colour.
#pragma once

#include <cmath>

class Vec3 {
 public:
  double x = 0, y = 0, z = 0;

  constexpr Vec3() = default;
  constexpr Vec3(double x_, double y_, double z_) : x(x_), y(y_), z(z_) {}
  constexpr Vec3(Vec3 const&) = default;
  explicit Vec3(double const* values) { setValue(values); }
  Vec3& operator=(Vec3 const&) = default;

  constexpr double operator[](int i) const { return i == 0 ? x : i == 1 ? y : z; }
  constexpr double& operator[](int i) { return i == 0 ? x : i == 1 ? y : z; }

  void getValue(double& x_, double& y_, double& z_) const { x_ = x, y_ = y, z_ = z; }
  void getValue(double* const values) const { values[0] = x, values[1] = y, values[2] = z; }
  void setValue(double const* const values) { x = values[0], y = values[1], z = values[2]; }

  constexpr Vec3 operator-() const { return {-x, -y, -z}; }
  constexpr Vec3 operator+(Vec3 const& o) const { return {x + o.x, y + o.y, z + o.z}; }
  constexpr Vec3 operator-(Vec3 const& o) const { return {x - o.x, y - o.y, z - o.z}; }
  void operator+=(Vec3 const& o) { *this = *this + o; }
  void operator-=(Vec3 const& o) { *this = *this - o; }
  void operator*=(double s) { x *= s, y *= s, z *= s; }
  constexpr bool operator==(Vec3 const& o) const { return x == o.x && y == o.y && z == o.z; }

  constexpr double dot(Vec3 const& o) const { return x * o.x + y * o.y + z * o.z; }
  constexpr Vec3 cross(Vec3 const& o) const {
    return {y * o.z - z * o.y, z * o.x - x * o.z, x * o.y - y * o.x};
  }
  double length() const { return std::hypot(x, y, z); }

  // Gives the vector length 1 and returns its former length. A zero vector becomes not-a-number.
  double normalize() {
    double const former = length();
    x /= former, y /= former, z /= former;
    return former;
  }

  // Keeps the direction; a zero vector, which has none, stays zero.
  void setLength(double wanted) {
    double const former = length();
    if (former > 0) *this *= wanted / former;
    *this += Vec3();  // no component is -0
  }
};

inline bool isFinite(Vec3 const& v) { return std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z); }

constexpr Vec3 operator*(Vec3 const& v, double s) { return {v.x * s, v.y * s, v.z * s}; }

// By component, as scales compose.
constexpr Vec3 scaled(Vec3 const& v, Vec3 const& by) { return {v.x * by.x, v.y * by.y, v.z * by.z}; }
