#include "tests/io/scene/SceneTesting.h"

#include <cmath>

#include "tests/io/TakeTesting.h"

namespace talix {

namespace {

constexpr double kRounding = 1e-9;

std::string keyDifference(const KeyTrack& a, const KeyTrack& b) {
  if (a.count() != b.count()) return std::to_string(a.count()) + " keys are " + std::to_string(b.count());
  for (int64 i = 0; i < a.count(); ++i) {
    const KeyTrack::Key from = a.at(i), to = b.at(i);
    if (from.time != to.time || from.components != to.components) return "key " + std::to_string(i);
    for (size_t c = 0; c < static_cast<size_t>(a.width()); ++c)
      if (std::abs(from.values[c] - to.values[c]) > kRounding * std::max(1.0, std::abs(from.values[c])))
        return "key " + std::to_string(i) + ": " + std::to_string(from.values[c]) + " is " +
               std::to_string(to.values[c]);
  }
  return {};
}

// Compares by name, and remembers the first difference.
class Comparison {
 public:
  template <class T>
  void same(const std::string& what, const T& a, const T& b) {
    if (!(a == b)) say(what);
  }
  void same(const std::string& what, const KeyTrack& a, const KeyTrack& b) {
    if (const std::string text = keyDifference(a, b); !text.empty()) say(what + ", " + text);
  }
  // False when the numbers differ, so that the items cannot be compared.
  template <class T>
  bool sameCount(const std::string& what, const std::vector<T>& a, const std::vector<T>& b) {
    if (a.size() != b.size()) say(std::to_string(a.size()) + " " + what + " are " + std::to_string(b.size()));
    return a.size() == b.size();
  }
  const std::string& first() const { return m_first; }

 private:
  void say(const std::string& what) {
    if (m_first.empty()) m_first = what;
  }
  std::string m_first;
};

void comparePoints(Comparison& is, const Take& a, const Take& b) {
  if (!is.sameCount("points", a.points, b.points)) return;
  for (size_t i = 0; i < a.points.size(); ++i) {
    const TakePoint &from = a.points[i], &to = b.points[i];
    const std::string what = "point " + std::to_string(i) + " " + from.label + ": ";
    is.same(what + "label " + to.label, from.label, to.label);
    is.same(what + "subject " + to.subject, from.subject, to.subject);
    is.same(what + "description", from.description, to.description);
    is.same(what + "positions", from.positions, to.positions);
    is.same(what + "residuals", from.residuals, to.residuals);
    is.same(what + "cameras", from.cameras, to.cameras);
  }
}

void compareDevices(Comparison& is, const Take& a, const Take& b) {
  is.same("analog rate", a.analogRate, b.analogRate);
  if (!is.sameCount("outputs", a.outputs, b.outputs) || !is.sameCount("channels", a.analog, b.analog)) return;
  for (size_t i = 0; i < a.outputs.size(); ++i) {
    const TakeOutput &from = a.outputs[i], &to = b.outputs[i];
    is.same("output " + from.name + " is " + to.name, from.name + from.unit + from.kind,
            to.name + to.unit + to.kind);
    is.same("output " + from.name, from.values, to.values);
  }
  for (size_t i = 0; i < a.analog.size(); ++i) {
    const TakeAnalogChannel &from = a.analog[i], &to = b.analog[i];
    is.same("channel " + from.name + " is " + to.name, from.name + from.unit + from.description,
            to.name + to.unit + to.description);
    is.same("scale of " + from.name, from.scale, to.scale);
    is.same("offset of " + from.name, from.offset, to.offset);
    is.same("channel " + from.name, from.samples, to.samples);
  }
}

void compareJoints(Comparison& is, const Take& a, const Take& b) {
  if (!is.sameCount("joints", a.joints, b.joints)) return;
  for (size_t i = 0; i < a.joints.size(); ++i) {
    const TakeJoint &from = a.joints[i], &to = b.joints[i];
    const std::string what = "joint " + std::to_string(i) + " " + from.name + ": ";
    is.same(what + "name " + to.name, from.name, to.name);
    is.same(what + "parent", from.parent, to.parent);
    is.same(what + "end site", from.endSite, to.endSite);
    is.same(what + "offset", (from.offset - to.offset).length() <= kRounding, true);
    is.same(what + "order", from.rotationOrder, to.rotationOrder);
    is.same(what + "channels", from.channels, to.channels);
    is.same(what + "translations", from.translations, to.translations);
    is.same(what + "rotations", from.rotations, to.rotations);
  }
}

void compareEvents(Comparison& is, const Take& a, const Take& b) {
  if (!is.sameCount("events", a.events, b.events)) return;
  for (size_t i = 0; i < a.events.size(); ++i) {
    const TakeEvent &from = a.events[i], &to = b.events[i];
    is.same("event " + from.label, from.label + from.context + from.subject + from.description,
            to.label + to.context + to.subject + to.description);
    is.same("time of event " + from.label, from.seconds, to.seconds);
  }
}

}  // namespace

SceneTest::SceneTest() {
  g_db->newScene();
  HTimeManager::getInstance()->reset();
}

SceneTest::~SceneTest() { g_db->newScene(); }

void SceneTest::open(const Take& take, int up) {
  m_notes.clear();
  importTake(take, "folder/" + take.name + ".c3d", up, *g_db, m_notes);
}

void SceneTest::openFile(const std::string& name, int up) {
  m_notes.clear();
  importTake(readTake(dataFile(name)), dataFile(name), up, *g_db, m_notes);
}

Take SceneTest::save() {
  m_notes.clear();
  return exportTake(*g_db, m_notes);
}

std::string SceneTest::notes() const { return notesOf(m_notes); }

bool SceneTest::warned(const std::string& text) const {
  for (const TakeNote& note : m_notes)
    if (note.level == TakeNote::Level::Warning && note.text.find(text) != std::string::npos) return true;
  return false;
}

Take smallTake(const std::string& name, int64 frames, int64 first) {
  Take take;
  take.format = "C3D";
  take.name = name;
  take.rate = 100;
  take.firstFrame = first;
  take.frameCount = frames;
  return take;
}

TakePoint& addPoint(Take& take, const std::string& subject, const std::string& label, const Vec3& start,
                    const std::string& seen) {
  TakePoint& point = take.points.emplace_back();
  point.subject = subject;
  point.label = label;
  const int64 period = ticksPerFrameAt(take.rate);
  for (int64 i = 0; i < take.frameCount; ++i)
    if (seen.empty() || seen[static_cast<size_t>(i)] != ' ')
      point.positions.set((take.firstFrame + i) * period,
                          {start.x + static_cast<double>(i), start.y, start.z});
  return point;
}

std::string differenceOf(const Take& read, const Take& made) {
  Comparison is;
  is.same("format", read.format, made.format);
  is.same("name", read.name, made.name);
  is.same("rate", read.rate, made.rate);
  is.same("first frame", read.firstFrame, made.firstFrame);
  is.same("frames", read.frameCount, made.frameCount);
  is.same("unit", read.fileUnit, made.fileUnit);
  is.same("size of the unit", read.unitInMillimetres, made.unitInMillimetres);
  is.same("up axis", read.up, made.up);
  comparePoints(is, read, made);
  compareDevices(is, read, made);
  compareJoints(is, read, made);
  compareEvents(is, read, made);
  return is.first();
}

}  // namespace talix
