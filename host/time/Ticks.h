// The time unit. A tick is 1/705,600,000 s: every usual frame rate has a whole number of ticks per frame.
#pragma once

#include <cmath>

#include "host/base/Types.h"

inline constexpr int64 kTicksPerSecond = 705'600'000;

// The end of the time line, in ticks: times reach from -kForever to kForever.
inline constexpr int64 kForever = (int64{1} << 62) - 1;

// The number of the last whole frame at or before, and of the first at or after, a time. Frames lie at the
// multiples of a period in ticks.
inline int64 frameAtOrBefore(int64 time, int64 period) { return time / period - (time % period < 0 ? 1 : 0); }
inline int64 frameAtOrAfter(int64 time, int64 period) { return time / period + (time % period > 0 ? 1 : 0); }

// Ticks per frame at a rate in frames per second (above 0): the nearest whole number, within the time line.
inline int64 ticksPerFrameAt(double rate) {
  double const ticks = static_cast<double>(kTicksPerSecond) / rate;
  if (ticks >= static_cast<double>(kForever)) return kForever;
  return ticks < 1 ? 1 : std::llround(ticks);
}
