#include "host/scene/ControllerKinds.h"

#include <algorithm>
#include <bit>
#include <cmath>

#include "host/scene/Clips.h"
#include "host/scene/Database.h"
#include "host/scene/RawValues.h"

H_DEFINE_CLASS(FloatController);
H_DEFINE_CLASS(IntController);
H_DEFINE_CLASS(BoolController);
H_DEFINE_CLASS(Vec3Controller);
H_DEFINE_CLASS(RotController);

namespace {

using Values = Controller::Values;

Values scalar(double value) { return {value}; }

double first(Controller const& channel, int64 time) {
  Values values;
  channel.evaluate(time, values);
  return values[0];
}

double firstOfKey(Controller const& channel, int key) {
  Values values;
  channel.readKey(key, values);
  return values[0];
}

int rounded(double value) {
  return static_cast<int>(std::clamp(std::round(value), -2147483648.0, 2147483647.0));
}

// The index of a mask's lowest component.
size_t component(unsigned mask) { return static_cast<size_t>(std::countr_zero(mask & 7 ? mask & 7 : 1)); }

}  // namespace

double FloatController::getValue(int64 time) const { return first(*this, time); }
double FloatController::getKeyValue(int key) const { return firstOfKey(*this, key); }
void FloatController::setKeyValue(int key, double value, unsigned mask) {
  writeKey(key, scalar(value), mask);
}
void FloatController::setKey(int64 time, double value, unsigned mask) {
  writeKeyAt(time, scalar(value), mask);
}
void FloatController::setConstValue(double value, bool) { setDefaultValues(scalar(value)); }

int IntController::getValue(int64 time) const { return rounded(first(*this, time)); }
int IntController::getKeyValue(int key) const { return rounded(firstOfKey(*this, key)); }
void IntController::setKeyValue(int key, int value, unsigned mask) { writeKey(key, scalar(value), mask); }
void IntController::setKey(int64 time, int value, unsigned mask) { writeKeyAt(time, scalar(value), mask); }
int IntController::getConstValue() const { return rounded(m_default[0]); }
void IntController::setConstValue(int value, bool) { setDefaultValues(scalar(value)); }

bool BoolController::getValue(int64 time) const { return first(*this, time) != 0; }
bool BoolController::getKeyValue(int key) const { return firstOfKey(*this, key) != 0; }
void BoolController::setKeyValue(int key, bool value, unsigned mask) { writeKey(key, scalar(value), mask); }
void BoolController::setKey(int64 time, bool value, unsigned mask) { writeKeyAt(time, scalar(value), mask); }
void BoolController::setConstValue(bool value, bool) { setDefaultValues(scalar(value)); }
void BoolController::compose(Values& values, Values const& layer) const { values = layer; }

Vec3 Vec3Controller::getValue(int64 time) const {
  Values values;
  evaluate(time, values);
  return Vec3(values.data());
}

double Vec3Controller::getComponentValue(int64 time, unsigned mask) const {
  return getValue(time)[static_cast<int>(component(mask))];
}

Vec3 Vec3Controller::getKeyValue(int key) const {
  Values values;
  readKey(key, values);
  return Vec3(values.data());
}

double Vec3Controller::getKeyComponentValue(int key, unsigned mask) const {
  return getKeyValue(key)[static_cast<int>(component(mask))];
}

void Vec3Controller::setKeyValue(int key, Vec3 const& value, unsigned mask) {
  writeKey(key, rawValues(value), mask);
}

void Vec3Controller::setKeyComponentValue(int key, double value, unsigned mask) {
  writeKey(key, {value, value, value}, mask);
}

void Vec3Controller::setKey(int64 time, Vec3 const& value, unsigned mask) {
  writeKeyAt(time, rawValues(value), mask);
}

void Vec3Controller::setComponentKey(int64 time, double value, unsigned mask) {
  writeKeyAt(time, {value, value, value}, mask);
}

bool Vec3Controller::setConstValue(Vec3 value, bool, bool) {
  if (!std::isfinite(value.x) || !std::isfinite(value.y) || !std::isfinite(value.z)) return false;
  setDefaultValues(rawValues(value));
  return true;
}

TalixRotation RotController::getValue(int64 time) const {
  Values values;
  evaluate(time, values);
  return rotationOf(values);
}

TalixRotation RotController::getKeyValue(int key) const {
  Values values;
  readKey(key, values);
  return rotationOf(values);
}

void RotController::setKeyValue(int key, TalixRotation const& value, unsigned mask) {
  writeKey(key, rawValues(value), mask);
}

void RotController::setKey(int64 time, TalixRotation const& value, unsigned mask) {
  writeKeyAt(time, rawValues(value), mask);
}

TalixRotation RotController::getConstValue() const { return rotationOf(m_default); }

void RotController::setConstValue(TalixRotation const& value, bool) { setDefaultValues(rawValues(value)); }

void RotController::compose(Values& values, Values const& layer) const {
  values = rawValues(rotationOf(values) * rotationOf(layer));
}

// Of L0 * ... * La * ... * Ln = wanted, the factor La.
Values RotController::solveLayer(int64 time, Values const& wanted) const {
  Database const& scene = *getDatabase();
  scene.checkThread();
  NLEClip const* clip = scene.getActiveClip();
  if (!clip) return wanted;
  TalixRotation below, above;
  for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
    Values values;
    evaluateLayer(clip, layer, time, values);
    if (layer < scene.getActiveLayer()) below *= rotationOf(values);
    if (layer > scene.getActiveLayer()) above *= rotationOf(values);
  }
  return rawValues(below.inverse() * rotationOf(wanted) * above.inverse());
}

// The weighted mean of quaternions on the first one's side, made a unit again.
void RotController::blend(Values const* values, double const* weights, int count, Values& out) const {
  Values sum{};
  for (int i = 0; i < count; ++i) {
    double dot = 0;
    for (size_t k = 0; k < 4; ++k) dot += values[i][k] * values[0][k];
    double const weight = dot < 0 ? -weights[i] : weights[i];
    for (size_t k = 0; k < 4; ++k) sum[k] += weight * values[i][k];
  }
  out = rawValues(rotationOf(sum));
}
