// Which scene a thread works on.
//
// A thread holds a scene as long as it has a scope for it; meanwhile no other thread can. Only who holds a
// scene may change it or ask what is cached (world transforms, values of channels). Scopes stand inside each
// other: the innermost one's scene is the current one, for which g_db, g_eventManager, g_theOperationStack,
// the getInstance() of the scene's parts and static functions such as Controller::mapPropertyName stand;
// those of outer scopes are held still. The thread that runs main holds the default scene from the start.
#pragma once

#include <stdexcept>

class Database;

class SceneHeldError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

class SceneScope {
 public:
  // The scene must live longer. Throws SceneHeldError when another thread holds it.
  explicit SceneScope(Database& scene);
  ~SceneScope();
  SceneScope(SceneScope const&) = delete;
  SceneScope& operator=(SceneScope const&) = delete;

 private:
  Database& m_scene;
  Database* m_former;
};
