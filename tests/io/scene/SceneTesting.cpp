#include "tests/io/scene/SceneTesting.h"

#include <cmath>

#include "tests/io/TakeTesting.h"

namespace talix {

namespace {

// The values of a source where it has some.
KeyTrack tracked(SampleSourcePtr const& source, KeyTrack::Shape shape, SampleTimes const& times) {
  KeyTrack track(shape);
  SampleBlock block(source.get(), track.width());
  constexpr int64 kLength = 100;  // several blocks even in short takes
  for (int64 first = 0; source && first < times.count(); first += kLength) {
    SampleTimes const part = times.part(first, std::min(kLength, times.count() - first));
    block.read(part);
    for (int64 i = 0; i < part.count(); ++i) {
      KeyTrack::Values values{};
      if (!block.at(i)) continue;
      std::copy_n(block.at(i), track.width(), values.data());
      track.set(part[i], values);
    }
  }
  return track;
}

// All that a writer could pull.
Take collected(TakeSource const& source) {
  using enum KeyTrack::Shape;
  Take take{source, {}, {}, {}, {}, {}, {}};
  SampleTimes const frames = source.frameTimes();
  int64 const perFrame = std::llround(source.analogRate / source.rate);
  SampleTimes const samples(frames[0], perFrame ? ticksPerFrameAt(source.analogRate) : 1,
                            perFrame * frames.count());
  for (PointSource const& point : source.points) {
    TakePoint& made = take.points.emplace_back(TakePoint{
        point, tracked(point.positions, Vector, frames), tracked(point.residuals, Scalar, frames), {}});
    KeyTrack const masks = tracked(point.cameras, Scalar, frames);
    masks.forEach(0, masks.count(), [&](KeyTrack::Key const& key) {
      made.cameras.resize(static_cast<size_t>(frames.count()));
      made.cameras[static_cast<size_t>((key.time - frames[0]) / frames.period())] =
          static_cast<unsigned char>(std::lround(key.values[0]));
    });
  }
  for (ModelOutputSource const& output : source.outputs)
    take.outputs.push_back({output, tracked(output.values, Vector, frames)});
  for (AnalogSource const& channel : source.analog)
    take.analog.push_back({channel, tracked(channel.samples, Scalar, samples)});
  for (JointSource const& joint : source.joints)
    take.joints.push_back(
        {joint, tracked(joint.translations, Vector, frames), tracked(joint.rotations, Rotation, frames)});
  return take;
}

}  // namespace

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
  return collected(exportTake(*g_db, m_notes));
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
