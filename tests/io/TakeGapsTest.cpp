#include <gtest/gtest.h>

#include "io/TakeGaps.h"

namespace talix {

namespace {

// A take whose frames from 10 on are those of `seen` that are no blanks.
TakeGaps gapsIn(const std::string& seen) {
  Take take;
  take.firstFrame = 10;
  take.frameCount = static_cast<int64>(seen.size());
  const int64 period = ticksPerFrameAt(take.rate);
  KeyTrack track(KeyTrack::Shape::Vector);
  for (size_t i = 0; i < seen.size(); ++i)
    if (seen[i] != ' ') track.set((10 + static_cast<int64>(i)) * period, {});
  // Neither between frames nor outside the take.
  track.set(9 * period, {});
  track.set(10 * period + 1, {});
  track.set((10 + take.frameCount) * period, {});
  return gapsOf(take, track);
}

TEST(TakeGaps, CountsRunsInsideAndAtBothEnds) {
  const TakeGaps gaps = gapsIn(" xx   x  x ");
  EXPECT_EQ(gaps.missing, 7);
  EXPECT_EQ(gaps.count, 4);
  EXPECT_EQ(gaps.longest, 3);
}

TEST(TakeGaps, NothingIsMissingOrEverythingIs) {
  EXPECT_EQ(gapsIn("xxxx").count, 0);
  EXPECT_EQ(gapsIn("    ").longest, 4);
  EXPECT_EQ(gapsIn("    ").count, 1);
}

}  // namespace

}  // namespace talix
