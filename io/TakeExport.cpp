#include "host/scene/HTimeManager.h"
#include "io/TakeScene.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeExportParts.h"

namespace talix {

namespace {

// The whole frames of the animation range.
FrameGrid animationFrames(const Database& scene) {
  const HTimeManager* time = scene.getTimeManager();
  const HTimeRange range = time->getAnimRange();
  FrameGrid grid;
  grid.period = time->getTicksPerFrame();
  const auto floorFrame = [&](int64 ticks) {
    return ticks >= 0 ? ticks / grid.period : -((-ticks + grid.period - 1) / grid.period);
  };
  grid.firstFrame = floorFrame(range.getStart() + grid.period - 1);
  grid.count = range.isEmpty() ? 0 : std::max<int64>(0, floorFrame(range.getEnd()) - grid.firstFrame + 1);
  return grid;
}

void recallFile(Take& take, const NLEClip& clip) {
  take.name = fileMetadata::text(clip, fileMetadata::kFileName);
  if (take.name.empty()) take.name = clip.getName().GetString();
  take.format = fileMetadata::text(clip, fileMetadata::kFileFormat);
  const double unit = fileMetadata::number(clip, fileMetadata::kFileUnitInMillimetres, 0);
  if (unit > 0) {
    take.unitInMillimetres = unit;
    take.fileUnit = fileMetadata::text(clip, fileMetadata::kFileUnit);
  }
  for (const fileMetadata::Record& record : fileMetadata::records(clip, fileMetadata::kEvents, 5))
    take.events.push_back({record[1], record[2], record[3], record[4], fileMetadata::textNumber(record[0])});
}

}  // namespace

Take exportTake(Database& scene, std::vector<TakeNote>& notes) {
  const FrameGrid grid = animationFrames(scene);
  Take take;
  take.rate = scene.getTimeManager()->getFrameRate().getFrameRate();
  take.firstFrame = grid.firstFrame;
  take.frameCount = grid.count;
  if (scene.getUpAxis() >= 0) take.up = static_cast<Axis>(scene.getUpAxis());
  if (const NLEClip* clip = scene.getActiveClip()) recallFile(take, *clip);

  TakeExport out{scene, FrameSampler(scene, grid), take, notes};
  exportPoints(out);
  exportDevices(out);
  exportJoints(out);
  if (out.keysLeftOut)
    out.warn("takes hold the whole frames of the animation range only; " + std::to_string(out.keysLeftOut) +
             (out.keysLeftOut == 1 ? " key" : " keys") + " between or outside them " +
             (out.keysLeftOut == 1 ? "was" : "were") + " left out");
  return take;
}

}  // namespace talix
