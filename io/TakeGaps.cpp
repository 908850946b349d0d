#include "io/TakeGaps.h"

#include <algorithm>

namespace talix {

TakeGaps gapsOf(const Take& take, const KeyTrack& positions) {
  const int64 period = ticksPerFrameAt(take.rate), start = take.firstFrame * period;
  TakeGaps gaps;
  int64 next = 0;  // the frame after the last one seen
  const auto seeAt = [&](int64 frame) {
    if (const int64 run = frame - next; run > 0) {
      gaps.missing += run;
      ++gaps.count;
      gaps.longest = std::max(gaps.longest, run);
    }
    next = frame + 1;
  };
  positions.forEach(0, positions.count(), [&](const KeyTrack::Key& key) {
    const int64 time = key.time - start;
    if (time >= 0 && time % period == 0 && time / period < take.frameCount) seeAt(time / period);
  });
  seeAt(take.frameCount);
  return gaps;
}

}  // namespace talix
