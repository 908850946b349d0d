#include "io/TakeGaps.h"

#include <algorithm>

#include "host/keys/DataRanges.h"

namespace talix {

TakeGaps gapsOf(Take const& take, KeyTrack const& positions) {
  int64 const period = ticksPerFrameAt(take.rate);
  TakeGaps gaps;
  DataRanges(positions, period)
      .visitGaps(take.firstFrame * period, (take.firstFrame + take.frameCount - 1) * period,
                 [&](int64 start, int64 end) {
                   int64 const run = (end - start) / period + 1;
                   gaps.missing += run;
                   ++gaps.count;
                   gaps.longest = std::max(gaps.longest, run);
                 });
  return gaps;
}

}  // namespace talix
