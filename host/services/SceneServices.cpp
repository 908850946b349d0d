#include "host/services/SceneServices.h"

#include "host/base/ThreadLocal.h"

namespace {

SceneServices s_default;
TALIX_THREAD_LOCAL SceneServices* t_current = &s_default;

}  // namespace

TALIX_THREAD_LOCAL HEventManager* g_eventManager = &s_default.events;

SceneServices& SceneServices::getDefault() { return s_default; }

SceneServices& SceneServices::getCurrent() { return *t_current; }

void SceneServices::setCurrent(SceneServices& services) {
  t_current = &services;
  g_eventManager = &services.events;
}
