#include "host/scene/Devices.h"
#include "host/scene/HTimeManager.h"
#include "io/TakeScene.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeExportParts.h"

namespace talix {

namespace {

// The whole frames in a range.
FrameGrid framesIn(HTimeRange const& range, int64 period) {
  FrameGrid grid;
  grid.period = period;
  grid.firstFrame = frameAtOrAfter(range.getStart(), period);
  if (!range.isEmpty())
    grid.count = std::max<int64>(0, frameAtOrBefore(range.getEnd(), period) - grid.firstFrame + 1);
  return grid;
}

// Of what a take can hold.
HTimeRange keyRangeIn(Database const& scene, NLEClip const& clip) {
  HTimeRange range;
  for (int i = 0; i < scene.getNumModules(); ++i) {
    Module const* module = scene.getModule(i);
    if (!module->isKindOf(&Node::staticClass()) && !module->isKindOf(&AnalogDevice::staticClass())) continue;
    for (int k = 0; k < module->getNumChannels(); ++k)
      range.include(module->getChannel(k)->getKeyRangeInClip(&clip));
  }
  return range;
}

// Those of the active clip's file, and of keys beyond, as far as an animation range that the user chose goes;
// without a file the animation range.
FrameGrid framesToSave(Database const& scene, std::vector<TakeNote>& notes) {
  HTimeManager const* time = scene.getTimeManager();
  auto const* clip = objectAs<Clip>(scene.getActiveClip());
  if (!clip || !(clip->getFileTime().rate > 0))
    return framesIn(time->getAnimRange(), time->getTicksPerFrame());

  Clip::FileTime const& file = clip->getFileTime();
  int64 const period = clip->getFramePeriod();
  HTimeRange range = keyRangeIn(scene, *clip);
  if (file.frameCount > 0)
    range.include(HTimeRange(file.firstFrame * period, (file.firstFrame + file.frameCount - 1) * period));
  int64 const all = framesIn(range, period).count;
  if (time->isAnimRangeChosen()) range.intersect(time->getAnimRange());
  FrameGrid const grid = framesIn(range, period);
  if (grid.count < all)
    notes.push_back({TakeNote::Level::Warning, "the animation range leaves out " +
                                                   std::to_string(all - grid.count) + " of the clip's " +
                                                   std::to_string(all) + " frames"});
  return grid;
}

void recallFile(TakeInfo& take, NLEClip const& clip) {
  take.name = fileMetadata::text(clip, fileMetadata::kFileName);
  if (take.name.empty()) take.name = clip.getName().GetString();
  take.format = fileMetadata::text(clip, fileMetadata::kFileFormat);
  double const unit = fileMetadata::number(clip, fileMetadata::kFileUnitInMillimetres, 0);
  if (unit > 0) {
    take.unitInMillimetres = unit;
    take.fileUnit = fileMetadata::text(clip, fileMetadata::kFileUnit);
  }
  for (fileMetadata::Record const& record : fileMetadata::records(clip, fileMetadata::kEvents, 5))
    take.events.push_back({record[1], record[2], record[3], record[4], fileMetadata::textNumber(record[0])});
}

}  // namespace

TakeSource exportTake(Database& scene, std::vector<TakeNote>& notes) {
  FrameGrid const grid = framesToSave(scene, notes);
  TakeSource take;
  auto const* clip = objectAs<Clip>(scene.getActiveClip());
  take.rate = clip && clip->getFileTime().rate > 0 ? clip->getFileTime().rate
                                                   : scene.getTimeManager()->getFrameRate().getFrameRate();
  take.firstFrame = grid.firstFrame;
  take.frameCount = grid.count;
  if (scene.getUpAxis() >= 0) take.up = static_cast<Axis>(scene.getUpAxis());
  if (NLEClip const* active = scene.getActiveClip()) recallFile(take, *active);

  TakeExport out{scene, std::make_shared<FrameSampler>(scene, grid), take, notes};
  exportPoints(out);
  exportDevices(out);
  exportJoints(out);
  if (out.keysLeftOut)
    out.warn("takes hold values at whole frames of their range only; " + std::to_string(out.keysLeftOut) +
             (out.keysLeftOut == 1 ? " key" : " keys") + " between or outside them " +
             (out.keysLeftOut == 1 ? "was" : "were") + " left out");
  return take;
}

}  // namespace talix
