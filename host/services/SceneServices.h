// What commands find beside the scene itself, each scene with its own: events, progress, who answers
// questions, the edit tool. The names that commands use (g_eventManager, g_theOperationStack, g_interface,
// Manipulator) stand for those of the thread's current scene.
#pragma once

#include <functional>

#include "host/services/HEvent.h"
#include "host/services/Manipulator.h"
#include "host/services/OperationStack.h"

struct SceneServices {
  HEventManager events;
  OperationStack operations;
  std::function<bool(HString const&)> asker;  // of yes-or-no questions; none: the answer is no
  Manipulator::EToolType tool = Manipulator::Select;

  static SceneServices& getDefault();  // the default scene's
  static SceneServices& getCurrent();  // the default scene's on a thread that has no scene
  static void setCurrent(SceneServices& services);
};
