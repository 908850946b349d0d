#include "tests/io/scene/SceneTesting.h"

#include "tests/io/TakeTesting.h"

namespace talix {

SceneTest::SceneTest() {
  g_db->newScene();
  HTimeManager::getInstance()->reset();
}

SceneTest::~SceneTest() { g_db->newScene(); }

void SceneTest::open(Take const& take, int up) {
  m_notes.clear();
  importTake(take, "folder/" + take.name + ".c3d", up, *g_db, m_notes);
}

void SceneTest::openFile(std::string const& name, int up) {
  m_notes.clear();
  importTake(readTake(dataFile(name)), dataFile(name), up, *g_db, m_notes);
}

Take SceneTest::save() {
  m_notes.clear();
  return exportTake(*g_db, m_notes);
}

std::string SceneTest::notes() const { return notesOf(m_notes); }

bool SceneTest::warned(std::string const& text) const {
  for (TakeNote const& note : m_notes)
    if (note.level == TakeNote::Level::Warning && note.text.find(text) != std::string::npos) return true;
  return false;
}

Take smallTake(std::string const& name, int64 frames, int64 first) {
  Take take;
  take.format = "C3D";
  take.name = name;
  take.rate = 100;
  take.firstFrame = first;
  take.frameCount = frames;
  return take;
}

TakePoint& addPoint(Take& take, std::string const& subject, std::string const& label, Vec3 const& start,
                    std::string const& seen) {
  TakePoint& point = take.points.emplace_back();
  point.subject = subject;
  point.label = label;
  int64 const period = ticksPerFrameAt(take.rate);
  for (int64 i = 0; i < take.frameCount; ++i)
    if (seen.empty() || seen[static_cast<size_t>(i)] != ' ')
      point.positions.set((take.firstFrame + i) * period,
                          {start.x + static_cast<double>(i), start.y, start.z});
  return point;
}

}  // namespace talix
