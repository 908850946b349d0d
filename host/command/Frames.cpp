#include "host/command/Frames.h"

#include <cstdlib>

#include "host/command/Command.h"
#include "host/scene/HTimeManager.h"

std::optional<int64> timeOfFrame(double frame) {
  HTimeManager const& times = *HTimeManager::getInstance();
  if (times.isOnTimeLine(frame)) return times.getTimeFromFrameDouble(frame);
  Command::logError("Frame %g lies beyond the time line.", frame);
  return {};
}

std::optional<int64> timeOfWholeFrame(int frame, int64 origin) {
  int64 const ticks = HTimeManager::getInstance()->getTicksPerFrame();
  if (std::abs(int64{frame}) <= kForever / ticks && std::abs(origin + frame * ticks) <= kForever)
    return origin + frame * ticks;
  Command::logError("Frame %d lies beyond the time line.", frame);
  return {};
}

std::optional<HTimeRange> rangeOfFrames(double start, double end) {
  std::optional<int64> const first = timeOfFrame(start);
  if (!first) return {};
  std::optional<int64> const last = timeOfFrame(end);
  if (!last) return {};
  if (*first > *last) {
    Command::logError("The start frame %g lies after the end frame %g.", start, end);
    return {};
  }
  return HTimeRange(*first, *last);
}
