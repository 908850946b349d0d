#include "io/TakeGaps.h"

#include <algorithm>

#include "host/keys/DataRanges.h"

namespace talix {

TakeGaps gapsOf(const Take& take, const KeyTrack& positions) {
  const int64 period = ticksPerFrameAt(take.rate);
  TakeGaps gaps;
  DataRanges(positions, period)
      .visitGaps(take.firstFrame * period, (take.firstFrame + take.frameCount - 1) * period,
                 [&](int64 start, int64 end) {
                   const int64 run = (end - start) / period + 1;
                   gaps.missing += run;
                   ++gaps.count;
                   gaps.longest = std::max(gaps.longest, run);
                 });
  return gaps;
}

}  // namespace talix
