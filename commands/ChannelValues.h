// Values that scripts give after a property's name: their shapes, and how they meet the value that is there.
#pragma once

#include "host/command/Arguments.h"
#include "host/math/TalixRotation.h"
#include "host/scene/ControllerKinds.h"

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

// A value for a channel, whose kind says which member counts.
struct ChannelValue {
  Vec3 vector;  // angles in radians
  double number = 0;
  int64 integer = 0;  // beyond the integers it fits no channel
  Variable::BoolType state = Variable::False;
};
// A number truncated toward zero; within 64 bits.
int64 integerFrom(Variable const& number);
// False for another shape than a channel of that kind takes.
[[nodiscard]] bool readValue(Args const& args, DataSource::PropertyType kind, int component,
                             ChannelValue& value);

// Calls work(channel) with the channel as its own kind.
template <class Work>
void withKind(Controller& channel, Work work) {
  switch (channel.getPropertyType()) {
    case DataSource::Vec3Property:
      return work(static_cast<Vec3Controller&>(channel));
    case DataSource::RotProperty:
      return work(static_cast<RotController&>(channel));
    case DataSource::FloatProperty:
      return work(static_cast<FloatController&>(channel));
    case DataSource::IntProperty:
      return work(static_cast<IntController&>(channel));
    case DataSource::BoolProperty:
      return work(static_cast<BoolController&>(channel));
    case DataSource::NoProperty:
      break;
  }
}

// The value of the layer that edits go to, which a relative one adds to.
inline Controller::Values layerValue(Controller const& channel, int64 time) {
  Controller::Values values;
  channel.evaluateLayer(time, values);
  return values;
}

// The nearest integer, as integer channels show values between their keys.
int nearestInt(double value);

// The results may be ones that cannot be held.
double changed(double current, double given, bool relative);
int64 changed(int current, int64 given, bool relative);
Vec3 changed(Vec3 const& current, Vec3 const& given, Change const& change);
// Angles by axis in radians, counted in an order.
TalixRotation changed(TalixRotation const& current, Vec3 const& angles, Change const& change,
                      TalixRotation::RotOrder order);

// Whether a channel or an attribute can hold a result: numbers are finite, integers have 32 bits.
bool canBeHeld(double value);
bool canBeHeld(int64 value);
inline bool canBeHeld(Vec3 const& value) { return isFinite(value); }
inline bool canBeHeld(TalixRotation const&) { return true; }
// Whether a value was held; else logs that it is too large for what on which module.
[[nodiscard]] bool isHeld(bool held, char const* what, Module const& module);
