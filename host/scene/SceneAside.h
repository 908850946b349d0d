// What undo leaves alone and a discarded step brings back all the same. Copying it costs next to nothing.
#pragma once

#include "host/scene/ClipboardManager.h"

class Module;

struct SceneAside {
  int64 time = 0;
  Module* priority = nullptr;
  ClipboardManager clipboard;
};
