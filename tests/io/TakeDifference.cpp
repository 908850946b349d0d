#include <algorithm>
#include <cmath>
#include <numeric>

#include "tests/io/TakeTesting.h"

namespace talix {

namespace {

constexpr double kRotationTolerance = 1e-10;

bool near(double a, double b, double tolerance) {
  return std::abs(a - b) <= tolerance * std::max(1.0, std::abs(a));
}

std::string keyDifference(KeyTrack const& a, KeyTrack const& b, double tolerance) {
  if (a.count() != b.count()) return std::to_string(a.count()) + " keys are " + std::to_string(b.count());
  for (int64 i = 0; i < a.count(); ++i) {
    KeyTrack::Key const from = a.at(i), to = b.at(i);
    if (from.time != to.time || from.components != to.components) return "key " + std::to_string(i);
    double sign = 1;
    if (a.shape() == KeyTrack::Shape::Rotation) {  // a quaternion's negative is the same rotation
      tolerance = std::min(tolerance, kRotationTolerance);
      if (std::inner_product(from.values.begin(), from.values.end(), to.values.begin(), 0.0) < 0) sign = -1;
    }
    for (size_t c = 0; c < static_cast<size_t>(a.width()); ++c)
      if (!near(from.values[c], sign * to.values[c], tolerance))
        return "key " + std::to_string(i) + ": " + std::to_string(from.values[c]) + " is " +
               std::to_string(to.values[c]);
  }
  return {};
}

// Compares by name, and remembers the first difference.
class Comparison {
 public:
  explicit Comparison(double tolerance) : m_tolerance(tolerance) {}

  template <class T>
  void same(std::string const& what, T const& a, T const& b) {
    if (!(a == b)) say(what);
  }
  void same(std::string const& what, KeyTrack const& a, KeyTrack const& b) {
    if (std::string const text = keyDifference(a, b, m_tolerance); !text.empty()) say(what + ", " + text);
  }
  void same(std::string const& what, double a, double b) {
    if (!near(a, b, m_tolerance)) say(what);
  }
  // False when the numbers differ, so that the items cannot be compared.
  template <class T>
  bool sameCount(std::string const& what, std::vector<T> const& a, std::vector<T> const& b) {
    if (a.size() != b.size()) say(std::to_string(a.size()) + " " + what + " are " + std::to_string(b.size()));
    return a.size() == b.size();
  }
  std::string const& first() const { return m_first; }

 private:
  void say(std::string const& what) {
    if (m_first.empty()) m_first = what;
  }

  double m_tolerance;
  std::string m_first;
};

void comparePoints(Comparison& is, Take const& a, Take const& b) {
  if (!is.sameCount("points", a.points, b.points)) return;
  for (size_t i = 0; i < a.points.size(); ++i) {
    TakePoint const &from = a.points[i], &to = b.points[i];
    std::string const what = "point " + std::to_string(i) + " " + from.label + ": ";
    is.same(what + "label " + to.label, from.label, to.label);
    is.same(what + "subject " + to.subject, from.subject, to.subject);
    is.same(what + "description", from.description, to.description);
    is.same(what + "positions", from.positions, to.positions);
    is.same(what + "residuals", from.residuals, to.residuals);
    is.same(what + "cameras", from.cameras, to.cameras);
  }
}

void compareDevices(Comparison& is, Take const& a, Take const& b) {
  is.same("analog rate", a.analogRate, b.analogRate);
  if (!is.sameCount("outputs", a.outputs, b.outputs) || !is.sameCount("channels", a.analog, b.analog)) return;
  for (size_t i = 0; i < a.outputs.size(); ++i) {
    ModelOutput const &from = a.outputs[i], &to = b.outputs[i];
    is.same("output " + from.name + " is " + to.name, from.name + from.unit + from.kind,
            to.name + to.unit + to.kind);
    is.same("output " + from.name, from.values, to.values);
  }
  for (size_t i = 0; i < a.analog.size(); ++i) {
    TakeAnalogChannel const &from = a.analog[i], &to = b.analog[i];
    is.same("channel " + from.name + " is " + to.name, from.name + from.unit + from.description,
            to.name + to.unit + to.description);
    is.same("channel " + from.name, from.samples, to.samples);
  }
}

void compareJoints(Comparison& is, Take const& a, Take const& b) {
  if (!is.sameCount("joints", a.joints, b.joints)) return;
  for (size_t i = 0; i < a.joints.size(); ++i) {
    TakeJoint const &from = a.joints[i], &to = b.joints[i];
    std::string const what = "joint " + std::to_string(i) + " " + from.name + ": ";
    is.same(what + "name " + to.name, from.name, to.name);
    is.same(what + "parent", from.parent, to.parent);
    is.same(what + "end site", from.endSite, to.endSite);
    is.same(what + "offset", (from.offset - to.offset).length(), 0.0);
    is.same(what + "order", from.rotationOrder, to.rotationOrder);
    is.same(what + "channels", from.channels, to.channels);
    is.same(what + "translations", from.translations, to.translations);
    is.same(what + "rotations", from.rotations, to.rotations);
  }
}

void compareEvents(Comparison& is, Take const& a, Take const& b) {
  if (!is.sameCount("events", a.events, b.events)) return;
  for (size_t i = 0; i < a.events.size(); ++i) {
    TakeEvent const &from = a.events[i], &to = b.events[i];
    is.same("event " + from.label, from.label + from.context + from.subject + from.description,
            to.label + to.context + to.subject + to.description);
    is.same("time of event " + from.label, from.seconds, to.seconds);
  }
}

}  // namespace

std::string differenceOf(Take const& a, Take const& b, double tolerance) {
  Comparison is(tolerance);
  is.same("rate", std::abs(a.rate - b.rate) <= 1e-12 * a.rate, true);
  is.same("first frame", a.firstFrame, b.firstFrame);
  is.same("frames", a.frameCount, b.frameCount);
  is.same("unit", a.fileUnit, b.fileUnit);
  is.same("size of the unit", a.unitInMillimetres, b.unitInMillimetres);
  is.same("up axis", a.up, b.up);
  comparePoints(is, a, b);
  compareDevices(is, a, b);
  compareJoints(is, a, b);
  compareEvents(is, a, b);
  return is.first();
}

}  // namespace talix
