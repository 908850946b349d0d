// The five kinds of channel: their values in place of raw doubles.
//
// Setters and getters by key take the key's index in the active layer. notify, force: for views; nothing
// hangs on them here.
#pragma once

#include "host/scene/Controller.h"

class FloatController : public Controller {
  H_DECLARE_CLASS(FloatController, Controller)

 public:
  FloatController() : Controller(Interpolation::Linear, 3) {}
  PropertyType getPropertyType() const override { return FloatProperty; }
  double getValue(int64 time) const;
  double getKeyValue(int key) const;
  void setKeyValue(int key, double value, unsigned mask);
  void setKey(int64 time, double value, unsigned mask);
  double getConstValue() const { return m_default[0]; }
  void setConstValue(double value, bool notify);
};

class IntController : public Controller {
  H_DECLARE_CLASS(IntController, Controller)

 public:
  IntController() : Controller(Interpolation::Constant, 3) {}
  PropertyType getPropertyType() const override { return IntProperty; }
  int getValue(int64 time) const;  // rounded to the nearest
  int getKeyValue(int key) const;
  void setKeyValue(int key, int value, unsigned mask);
  void setKey(int64 time, int value, unsigned mask);
  int getConstValue() const;
  void setConstValue(int value, bool notify);
};

class BoolController : public Controller {
  H_DECLARE_CLASS(BoolController, Controller)

 public:
  BoolController() : Controller(Interpolation::Constant, 1) {}
  PropertyType getPropertyType() const override { return BoolProperty; }
  bool getValue(int64 time) const;
  bool getKeyValue(int key) const;
  void setKeyValue(int key, bool value, unsigned mask);
  void setKey(int64 time, bool value, unsigned mask);
  bool getConstValue() const { return m_default[0] != 0; }
  void setConstValue(bool value, bool notify);
  // A later layer's value replaces the one below.
  Values solveLayer(int64, Values const& wanted) const override { return wanted; }

 protected:
  void compose(Values& values, Values const& layer) const override;
};

class Vec3Controller : public Controller {
  H_DECLARE_CLASS(Vec3Controller, Controller)

 public:
  Vec3Controller() : Controller(Interpolation::Linear, 3) {}
  PropertyType getPropertyType() const override { return Vec3Property; }
  Vec3 getValue(int64 time) const;
  double getComponentValue(int64 time, unsigned mask) const;  // mask 1, 2 or 4
  Vec3 getKeyValue(int key) const;
  double getKeyComponentValue(int key, unsigned mask) const;
  void setKeyValue(int key, Vec3 const& value, unsigned mask);
  void setKeyComponentValue(int key, double value, unsigned mask);
  void setKey(int64 time, Vec3 const& value, unsigned mask);
  void setComponentKey(int64 time, double value, unsigned mask);
  Vec3 getConstValue() const { return Vec3(m_default.data()); }
  // Returns whether the value was taken: a vector that is not finite is not.
  bool setConstValue(Vec3 value, bool notify, bool force);
};

class RotController : public Controller {
  H_DECLARE_CLASS(RotController, Controller)

 public:
  RotController() : Controller(Interpolation::Linear, 3) { m_default[3] = 1; }
  PropertyType getPropertyType() const override { return RotProperty; }
  TalixRotation getValue(int64 time) const;
  TalixRotation getKeyValue(int key) const;
  void setKeyValue(int key, TalixRotation const& value, unsigned mask);
  void setKey(int64 time, TalixRotation const& value, unsigned mask);
  TalixRotation getConstValue() const;
  void setConstValue(TalixRotation const& value, bool notify);

  Values solveLayer(int64 time, Values const& wanted) const override;

  Values neutral() const override { return {0, 0, 0, 1}; }

 protected:
  void compose(Values& values, Values const& layer) const override;
  void blend(Values const* values, double const* weights, int count, Values& out) const override;
};
