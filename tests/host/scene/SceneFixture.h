// A new scene for each test, and short forms of what tests do to it.
#pragma once

#include <gtest/gtest.h>
#include <random>
#include <string>
#include <vector>

#include "host/scene/Character.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Marker.h"

class SceneTest : public testing::Test {
 protected:
  static constexpr int64 kFrame = kTicksPerSecond / 120;

  SceneTest() { g_db->newScene(); }
  ~SceneTest() override { g_db->newScene(); }

  template <class T>
  static T* create(char const* name, Module* parent = nullptr) {
    return static_cast<T*>(g_db->createModule(&T::staticClass(), name, parent));
  }
  static Module* named(std::string const& path, bool priorityOnly = false) {
    return g_db->getModuleWithPath(HString(path), nullptr, priorityOnly);
  }
  static void remove(Module* module) { g_db->removeFromScene(module, true, true, true, true); }

  size_t below(size_t end) { return std::uniform_int_distribution<size_t>(0, end - 1)(m_random); }
  template <class T>
  T& oneOf(std::vector<T>& items) {
    return items[below(items.size())];
  }
  double uniform(double low, double high) {
    return std::uniform_real_distribution<double>(low, high)(m_random);
  }
  Vec3 randomVec(double reach) {
    return {uniform(-reach, reach), uniform(-reach, reach), uniform(-reach, reach)};
  }
  TalixRotation randomRotation() { return TalixRotation(randomVec(3)); }

  std::mt19937_64 m_random{17};
};
