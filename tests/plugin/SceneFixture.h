// A fresh scene and the plug-in's commands.
#pragma once

#include <gtest/gtest.h>

#include "host/scene/Database.h"
#include "tests/plugin/PluginLibrary.h"

class SceneFixture : public testing::Test {
 protected:
  SceneFixture() { g_db->newScene(); }
  ~SceneFixture() override { g_db->newScene(); }

  template <class T = Node>
  T* make(char const* name, Module* parent = nullptr) {
    return static_cast<T*>(g_db->createModule(&T::staticClass(), name, parent));
  }
  std::string run(char const* name, ArgList const& args = {}, std::vector<GivenOption> const& options = {}) {
    return ::run(commands[name], args, options);
  }

  PluginCommands commands;
};
