// Arguments that several host commands take: modules, channels, frames. A reader that returns nothing has
// logged why.
#pragma once

#include <optional>

#include "host/command/ScriptCommand.h"
#include "host/scene/Controller.h"
#include "host/scene/Module.h"

namespace talix {

// The module that a path names, of a class (null: any).
Module* moduleAt(HString const& path, HRuntimeClass const* type = nullptr);

// A channel by name, with the components that a suffix names.
struct ChannelChoice {
  unsigned id = 0;
  unsigned mask = 7;  // 1 x, 2 y, 4 z; 7: the whole channel
};
std::optional<ChannelChoice> channelNamed(HString const& name);

// Whether a module has no property of that name, and `obstacle` is empty: why the name cannot be that of
// `what`.
bool isNew(Module const& module, HString const& name, char const* what, HString const& obstacle);

// Integers and floats; booleans are none.
bool isFrameNumber(Variable const& value);
bool areFrameNumbers(Args const& args);
// The time of a frame, which may be a fraction.
std::optional<int64> timeOfFrame(double frame);
// From a start and an end frame.
std::optional<HTimeRange> rangeOfFrames(double start, double end);

}  // namespace talix
