#include <filesystem>

#include "host/keys/DataRanges.h"
#include "host/scene/HTimeManager.h"
#include "io/FileError.h"
#include "io/TakeScene.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeImportParts.h"

namespace talix {

namespace {

constexpr char const* kAxisNames[] = {"x", "y", "z"};

// Taken before anything changes: what a failed import goes back to.
class ImportRollback {
 public:
  explicit ImportRollback(Database& scene)
      : m_scene(scene), m_clip(scene.getActiveClip()), m_layer(scene.getActiveLayer()) {}

  void takeBack(Clip* clip, std::vector<Module*> const& created) const {
    for (size_t i = created.size(); i-- > 0;) m_scene.removeFromScene(created[i], true, true, true, true);
    m_scene.removeFromScene(clip, true, true, true, true);
    m_scene.setActiveClip(m_clip);
    if (m_clip) m_scene.setActiveLayer(m_layer);
  }

 private:
  Database& m_scene;
  NLEClip* m_clip;
  int m_layer;
};

void checkTake(Take const& take, std::string const& path, Database const& scene) {
  if (scene.getNumClips() >= NLEClip::kMaximum)
    throw FileError(
        path, "the scene has " + std::to_string(NLEClip::kMaximum) + " clips already and takes no more");
  for (size_t i = 0; i < take.joints.size(); ++i) {
    TakeJoint const& joint = take.joints[i];
    if (joint.parent >= static_cast<int>(i) || joint.parent < -1)
      throw FileError(path, "the joint \"" + joint.name + "\" stands before its parent");
    if (joint.name.empty()) throw FileError(path, "joint " + std::to_string(i + 1) + " has no name");
  }
}

HFrameRate frameRate(double rate) {
  HFrameRate result;
  for (ETimecodeStandard const standard : {NTSC, PAL, FILM, FILM_NTSC}) {
    HFrameRate known;
    known.setTimecodeStandard(standard);
    if (known.getFrameRate() == rate) return known;
  }
  result.setFrameRate(rate);
  return result;
}

// Whether the scene can have the take's rate.
bool takesRate(Take const& take) { return take.rate <= HFrameRate::kMaximum; }

bool hasSceneRate(Take const& take, Database const& scene) {
  return scene.getTimeManager()->getTicksPerFrame() == ticksPerFrameAt(take.rate);
}

// Between consecutive samples there is data, at the scene's frames as well.
void bridgeSamples(Take& take) {
  auto const bridge = [](KeyTrack& track, double rate) {
    KeyTrack const samples = track;
    DataRanges(samples, ticksPerFrameAt(rate)).bridge(track);
  };
  for (TakePoint& point : take.points) {
    bridge(point.positions, take.rate);
    bridge(point.residuals, take.rate);
  }
  for (ModelOutput& output : take.outputs) bridge(output.values, take.rate);
  for (TakeAnalogChannel& analog : take.analog) bridge(analog.samples, take.analogRate);
  for (TakeJoint& joint : take.joints) {
    bridge(joint.translations, take.rate);
    bridge(joint.rotations, take.rate);
  }
}

void setSceneTime(TakeImport& import, Take const& take) {
  HTimeManager* time = import.clip().getDatabase()->getTimeManager();
  if (!takesRate(take))
    import.warn("the scene counts at most " + fileMetadata::numberText(HFrameRate::kMaximum) +
                " frames a second and keeps its rate; keys lie at their times");
  else
    time->setFrameRate(frameRate(take.rate));
  int64 const period = ticksPerFrameAt(take.rate);
  int64 const last = take.firstFrame + std::max<int64>(take.frameCount, 1) - 1;
  HTimeRange const range(take.firstFrame * period, last * period);
  time->setAnimRange(range, false);
  time->setPlayRange(range, false);
}

void noteSceneTime(TakeImport& import, Take const& take) {
  HTimeManager* time = import.clip().getDatabase()->getTimeManager();
  time->setAnimRange(time->getAnimRange(), false);
  HFrameRate const& rate = time->getFrameRate();
  if (!hasSceneRate(take, *import.clip().getDatabase()))
    import.info("the take has " + fileMetadata::numberText(take.rate) + " frames a second, the scene " +
                fileMetadata::numberText(rate.getFrameRate()) + "; keys keep their times");
}

// The scene's up axis, from the user, else as it was, else from the take.
int sceneUpAxis(Take const& take, int up, Database const& scene) {
  if (up >= 0) return up;
  return scene.getUpAxis() >= 0 ? scene.getUpAxis() : static_cast<int>(take.up);
}

void noteAxes(TakeImport& import, Take const& take, int formerAxis, int axis, bool firstTake) {
  if (formerAxis >= 0 && formerAxis != axis && !firstTake)
    import.warn(std::string("the scene's up axis was ") + kAxisNames[formerAxis] + " and is " +
                kAxisNames[axis] + " now; what the scene held before was not turned");
  if (!import.turn().isIdentity())
    import.info(std::string("turned from ") + kAxisNames[static_cast<int>(take.up)] + " up to the scene's " +
                kAxisNames[axis] + " up");
}

void rememberFile(Clip& clip, Take const& take) {
  fileMetadata::setText(clip, fileMetadata::kFileName, take.name);
  fileMetadata::setText(clip, fileMetadata::kFileFormat, take.format);
  fileMetadata::setText(clip, fileMetadata::kFileUnit, take.fileUnit);
  fileMetadata::setNumber(clip, fileMetadata::kFileUnitInMillimetres, take.unitInMillimetres);
  if (take.events.empty()) return;
  std::vector<fileMetadata::Record> events;
  for (TakeEvent const& event : take.events)
    events.push_back({fileMetadata::numberText(event.seconds), event.label, event.context, event.subject,
                      event.description});
  fileMetadata::setRecords(clip, fileMetadata::kEvents, events);
}

}  // namespace

void importTake(Take take, std::string const& path, int up, Database& scene, std::vector<TakeNote>& notes) {
  checkTake(take, path, scene);
  bool const firstTake = scene.getNumClips() == 0;
  int const formerAxis = scene.getUpAxis(), axis = sceneUpAxis(take, up, scene);
  ImportRollback const undoing(scene);
  // With its suffix, so that the clip and the character that stands for the file do not share a path.
  std::string const fileName = std::filesystem::path(path).filename().string();
  std::string const clipName = moduleName(fileName);
  auto* clip = static_cast<Clip*>(scene.createModule(&Clip::staticClass(), clipName.c_str(), nullptr));
  if (!clip) throw FileError(path, "the scene takes no further clip");
  scene.setActiveClip(clip);

  std::vector<TakeNote> said;
  TakeImport import(scene, *clip, UpAxisConversion(static_cast<int>(take.up), axis), fileName, said);
  if (firstTake ? !takesRate(take) : !hasSceneRate(take, scene)) bridgeSamples(take);
  for (TakeNote const& note : take.notes)
    note.level == TakeNote::Level::Warning ? import.warn(note.text) : import.info(note.text);
  try {
    importDevices(import, take, path);
  } catch (...) {
    undoing.takeBack(clip, import.created());
    throw;
  }
  if (take.unitInMillimetres != 1) import.info("lengths converted from " + take.fileUnit + " to mm");
  noteAxes(import, take, formerAxis, axis, firstTake);
  scene.setUpAxis(axis);
  rememberFile(*clip, take);
  clip->setFileTime({take.rate, take.firstFrame, take.frameCount, take.analogRate});
  importPoints(import, take);
  importJoints(import, take);
  import.noteRepeatedNames();
  if (firstTake)
    setSceneTime(import, take);
  else
    noteSceneTime(import, take);
  notes.insert(notes.end(), said.begin(), said.end());
}

}  // namespace talix
