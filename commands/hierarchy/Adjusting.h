// What "parent" and "unparent" share: the options about adjusting, and the adjusting of one node.
#pragma once

#include "host/command/ScriptCommand.h"
#include "host/scene/Node.h"

struct Adjusting {
  bool adjust;        // keep the motion in the world
  bool move;          // change the hierarchy
  bool showProgress;  // and let the user cancel
  bool ranges;        // adjust in the selected time ranges only

  // The options as given to a command.
  template <class Cmd>
  static Adjusting from(Given const& given) {
    GivenOptions const options(given);
    bool const only = options.has(Cmd::info.option("adjustOnly"));
    return {only || options.has(Cmd::info.option("adjust")), !only,
            options.has(Cmd::info.option("showProgress")), options.has(Cmd::info.option("ranges"))};
  }
};

// The module as a node; says that one that is none has nothing to adjust, and returns null.
Node* nodeToAdjust(Module* module);
// Keeps the motion of a node in the world for a new parent (null: the world), and steps the progress. False
// when the user cancelled.
bool adjustNode(Adjusting const& adjusting, Node& node, Node* target);
