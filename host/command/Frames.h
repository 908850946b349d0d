// Frames at the border of scripts: frames outside, ticks inside. A reader that returns nothing has logged
// why.
#pragma once

#include <optional>

#include "host/base/Types.h"
#include "host/time/HTimeRange.h"

// The time of a frame, which may be a fraction.
std::optional<int64> timeOfFrame(double frame);
// The time of a whole frame counted from a time.
std::optional<int64> timeOfWholeFrame(int frame, int64 origin = 0);
// From a start frame to an end frame, both included.
std::optional<HTimeRange> rangeOfFrames(double start, double end);
