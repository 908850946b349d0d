#include "commands/ChannelValues.h"

#include <algorithm>
#include <climits>
#include <cmath>

#include "host/command/Angles.h"
#include "host/scene/Module.h"

bool readVector(Args const& args, int component, Vec3& value) {
  int const count = args.getCount();
  if (component >= 0) {
    if (!isOneNumber(args)) return false;
    value[component] = args[1].getFloatValue(-1);
    return true;
  }
  if (count == 2 && args[1].getType() == Variable::Vector) {
    value = args[1].getVecValue(-1);
    return true;
  }
  if (count != 4) return false;
  for (int i = 0; i < 3; ++i) {
    if (!args[i + 1].isNumber()) return false;
    value[i] = args[i + 1].getFloatValue(-1);
  }
  return true;
}

bool readAngles(Args const& args, int component, Vec3& value) {
  if (!readVector(args, component, value)) return false;
  value *= kRadiansPerDegree;
  return true;
}

bool readValue(Args const& args, DataSource::PropertyType kind, int component, ChannelValue& value) {
  if (kind == DataSource::Vec3Property) return readVector(args, component, value.vector);
  if (kind == DataSource::RotProperty) return readAngles(args, component, value.vector);
  if (!isOneNumber(args)) return false;
  value.number = args[1].getFloatValue(-1);
  value.integer = integerFrom(args[1]);
  value.state = args[1].getBoolValue(-1);
  return kind != DataSource::BoolProperty ||
         (value.integer >= Variable::False && value.integer <= Variable::Toggle);
}

int64 integerFrom(Variable const& number) {
  constexpr double kFar = 1e18;  // sums with integers stay within 64 bits
  return static_cast<int64>(std::clamp(number.getFloatValue(-1), -kFar, kFar));
}

bool canBeHeld(double value) { return std::isfinite(value); }

bool canBeHeld(int64 value) { return value >= INT_MIN && value <= INT_MAX; }

bool isHeld(bool held, char const* what, Module const& module) {
  if (!held) Command::logError("The value is too large for %s on %s.", what, module.getName().GetStr());
  return held;
}

int nearestInt(double value) {
  return static_cast<int>(std::clamp<double>(std::round(value), INT_MIN, INT_MAX));
}

double changed(double current, double given, bool relative) { return relative ? current + given : given; }

int64 changed(int current, int64 given, bool relative) { return relative ? current + given : given; }

Vec3 changed(Vec3 const& current, Vec3 const& given, Change const& change) {
  if (change.component < 0) return change.relative ? current + given : given;
  Vec3 value = current;
  value[change.component] = changed(current[change.component], given[change.component], change.relative);
  return value;
}

TalixRotation changed(TalixRotation const& current, Vec3 const& angles, Change const& change,
                      TalixRotation::RotOrder order) {
  TalixRotation rotation;
  if (change.component < 0) {
    rotation.setAsEuler(order, angles);
    return change.relative ? current * rotation : rotation;
  }
  Vec3 present;
  current.getAsEuler(order, present);
  rotation.setAsEuler(order, changed(present, angles, change));
  return rotation;
}
