#include "host/scene/SceneScope.h"

#include "host/scene/Database.h"
#include "host/services/SceneServices.h"

SceneScope::SceneScope(Database& scene) : m_scene(scene), m_former(g_db) {
  scene.hold();
  Database::makeCurrent(&scene);
}

SceneScope::~SceneScope() {
  Database::makeCurrent(m_former);
  m_scene.release();
}

// The address of the thread's own g_db tells the thread.
void Database::hold() {
  void const* nobody = nullptr;
  if (m_holder.load(std::memory_order_relaxed) != &g_db &&
      !m_holder.compare_exchange_strong(nobody, &g_db, std::memory_order_acquire))
    throw SceneHeldError("the scene is in use by another thread");
  ++m_holds;
}

void Database::release() {
  if (--m_holds == 0) m_holder.store(nullptr, std::memory_order_release);
}

void Database::makeCurrent(Database* scene) {
  g_db = scene;
  SceneServices::setCurrent(scene ? *scene->m_services : SceneServices::getDefault());
  ControlID::setCounter(scene ? &scene->m_lastID : nullptr);
}

Database& Database::current() {
  if (!g_db) throw std::logic_error("this thread has no scene");
  return *g_db;
}

void Database::refuseThread() const {
  throw std::logic_error(m_holder ? "the scene is in use by another thread"
                                  : "the thread does not hold the scene");
}
