// A command that is declared but cannot run yet: it is listed, checks its arguments, and fails with an error.
#pragma once

#include "host/command/ScriptCommand.h"

template <class Self>
class PendingCommand : public ScriptCommand<Self> {
 public:
  bool execute(Given const&, Args const&, Variable&) override {
    Command::logError("%s is not available yet.", Self::info.name);
    return false;
  }
};
