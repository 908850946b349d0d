// What undo leaves alone and a discarded step brings back all the same. Copying it costs next to nothing.
#pragma once

#include "host/scene/ClipboardManager.h"

class Module;

struct SceneAside {
  int64 time;
  Module* priority;
  ClipboardManager clipboard;
};
