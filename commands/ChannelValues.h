// Values that scripts give after a property's name: their shapes, and how they meet the value that is there.
#pragma once

#include "host/command/ScriptCommand.h"
#include "host/math/TalixRotation.h"

inline constexpr double kRadiansPerDegree = 0.017453292519943295;

// How a given value meets the present one.
struct Change {
  int component = -1;     // 0 x, 1 y, 2 z; -1: the whole value
  bool relative = false;  // it is added; a whole rotation is composed on the right
};

// Three numbers or one vector; for a component one number, which is put there. False for another shape.
[[nodiscard]] bool readVector(Args const& args, int component, Vec3& value);
// The same in degrees; the value is in radians.
[[nodiscard]] bool readAngles(Args const& args, int component, Vec3& value);
// Nothing but a number, whole or not.
inline bool isOneNumber(Args const& args) { return args.getCount() == 2 && args[1].isNumber(); }

// The nearest integer, as integer channels show values between their keys.
int nearestInt(double value);

double changed(double current, double given, bool relative);
int changed(int current, int given, bool relative);  // a sum beyond the integers is the nearest one
Vec3 changed(Vec3 const& current, Vec3 const& given, Change const& change);
// Angles by axis in radians, counted in an order.
TalixRotation changed(TalixRotation const& current, Vec3 const& angles, Change const& change,
                      TalixRotation::RotOrder order);
inline bool changed(bool current, Variable::BoolType given) {
  return given == Variable::Toggle ? !current : given == Variable::True;
}
