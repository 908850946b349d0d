// What "undo" and "redo" share: going several steps and telling how far it went.
#pragma once

#include "host/command/ScriptCommand.h"
#include "host/scene/UndoJournal.h"

namespace talix {

// COUNT, at least 1.
bool isStepCount(Args const& args);

// Goes the steps that the arguments ask for (one without any). `name`: "undo", "redo"; `done`: "Undone",
// "Redone". Nothing left is a warning.
void goSteps(Args const& args, bool (UndoJournal::*go)(HString&), char const* name, char const* done);

}  // namespace talix
