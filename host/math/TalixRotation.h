// A rotation: a unit quaternion with its other forms. Angles are radians.
//
// Column vectors: (a * b) turns by b first, then by a. A vector of Euler angles always holds the angle about
// x in x, whatever the order; the first axis of an order is applied first, so XYZ is Rz * Ry * Rx.
#pragma once

#include "host/math/Vec3.h"

class TalixRotation {
 public:
  enum RotOrder { XYZ = 0, XZY = 1, YXZ = 2, YZX = 3, ZXY = 4, ZYX = 5 };

  TalixRotation() = default;  // no rotation
  // From a rotation vector: its direction is the axis, its length the angle.
  explicit TalixRotation(Vec3 const& rotationVector) { setAsVector(rotationVector); }

  void makeIdentity() { *this = TalixRotation(); }
  TalixRotation& operator*=(TalixRotation const& other);
  TalixRotation operator*(TalixRotation const& other) const {
    TalixRotation product = *this;
    product *= other;
    return product;
  }
  // The same quaternion, digit by digit.
  bool operator==(TalixRotation const&) const = default;
  TalixRotation inverse() const;
  Vec3 rotate(Vec3 const& v) const;

  void setAsEuler(RotOrder order, Vec3 const& angles);
  // Angles within [-pi, pi], the middle one within [-pi/2, pi/2]. In gimbal lock the last axis' angle is 0.
  void getAsEuler(RotOrder order, Vec3& angles) const;

  void setAsVector(Vec3 rotationVector);
  // Length at most pi.
  void getAsVector(Vec3& rotationVector) const;

  // --- joints: axes are 0 x, 1 y, 2 z ---
  // A universal (Hardy-Spicer) joint turns by `major` about its major axis, which stays with the parent, and
  // then by `minor` about the minor axis, which the first turn carries along: R = R_major * R_minor. Its axes
  // are those of the space in which the rotation counts. A local rotation counts after the pre-rotation,
  // which thus has turned the axes already and changes nothing in the formula; it is part of the host's
  // interface.
  void setAsHardySpicerRotation(double major, double minor, int majorAxis, int minorAxis,
                                TalixRotation preRotation);
  // The angles of the joint's rotation that is nearest to this one, so that the least turn is left over; each
  // within [-pi, pi]. They read back what was set, for all angles. With one axis for both, `minor` is 0.
  void getAsHardySpicerRotation(double& major, double& minor, int majorAxis, int minorAxis) const;
  // A hinge turns about one axis.
  void setAsHingeRotation(double angle, int axis);
  // The angle of the nearest turn about that axis, within [-pi, pi]; 0 where all are as near, as for half a
  // turn about another axis.
  double getAsHingeRotation(int axis) const;

  // Quaternion x y z w. Setting normalises; a quaternion of length 0 or not finite is no rotation.
  void setQuaternion(double const* xyzw);
  void getQuaternion(double* xyzw) const;

  // The part of the way from a to b (0 to 1) on the shorter arc.
  static TalixRotation slerp(TalixRotation const& a, TalixRotation const& b, double part);

 private:
  double m_x = 0, m_y = 0, m_z = 0, m_w = 1;
};

// The angle about `axis` (0 x, 1 y, 2 z) that is next to `near` and equal to `angle` but for whole turns.
double unrolled(double angle, double near);
// Euler angles equal to `angles` in `order` (whole turns, and the second solution of the middle axis) that
// lie closest to `near`: for curves without jumps.
Vec3 unrolledEuler(TalixRotation::RotOrder order, Vec3 const& angles, Vec3 const& near);
