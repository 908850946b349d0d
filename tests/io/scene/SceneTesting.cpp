#include "tests/io/scene/SceneTesting.h"

#include "tests/io/TakeTesting.h"

namespace talix {

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

}  // namespace talix
