// What a step changed: keys, attributes and settings, modules that came, went or moved, the selection.
//
// Each thing stands once, with the state before the step and after it; what is the same again is left out. A
// module that the step brought into the scene or took out of it is told as that alone.
#pragma once

#include <vector>

#include "host/base/ControlID.h"
#include "host/base/HString.h"
#include "host/time/HTimeRange.h"

struct SceneChange {
  enum class Kind : unsigned char {
    keys,       // of one channel in one clip and layer
    created,    // a module; with a name: a channel of it
    removed,    // a module
    renamed,    // before, after: the names
    parent,     // before, after: the parents' paths, empty for the root
    attribute,  // name: the attribute's, or that of a setting of the module or (id blank) of the scene
    byDefault,  // name: the channel whose default value differs
    selection   // "true" or "false" for a module; the scene's "Primary": paths
  };

  Kind kind = Kind::keys;
  ControlID id{};             // the module's; blank: the scene's own
  HString path{};             // the module's full path after the step; that before it when it was removed
  HString name{};             // of keys that of the channel
  HString before{}, after{};  // as texts, empty for nothing; numbers are raw: radians, millimetres, ticks

  // Of keys only.
  ControlID clip{};
  int layer = 0;
  HTimeRange range{};  // from the first to the last key that differs, in ticks
  int64 added = 0, removed = 0;
  int64 changed = 0;   // another value, component, bridge or selection flag at the same time
  double largest = 0;  // the largest change of a component; of a rotation the largest angle
};

// In order of the modules' identifiers, the scene's own first.
using ChangeSet = std::vector<SceneChange>;
