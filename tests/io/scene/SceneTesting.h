// What the tests of takes in the scene share.
#pragma once

#include <gtest/gtest.h>

#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "io/TakeFormats.h"
#include "io/TakeScene.h"

namespace talix {

// A new scene for each test.
class SceneTest : public testing::Test {
 protected:
  SceneTest();
  ~SceneTest() override;

  // Takes a take into the scene as if it came from "folder/NAME.c3d".
  void open(Take const& take, int up = -1);
  void openFile(std::string const& name, int up = -1);
  Take save();

  // By full path; fails the test when there is no such module of that class.
  template <class T>
  T* at(std::string const& path) {
    auto* found = objectAs<T>(g_db->getModuleWithPath(path, &T::staticClass(), false));
    EXPECT_NE(found, nullptr) << path;
    return found;
  }
  bool has(std::string const& path) { return g_db->getModuleWithPath(path, nullptr, false) != nullptr; }

  std::string notes() const;  // since the last call of open or save
  bool warned(std::string const& text) const;

 private:
  std::vector<TakeNote> m_notes;
};

// A take of `frames` frames at 100 a second from frame `first` on; its points are added with addPoint.
Take smallTake(std::string const& name, int64 frames = 5, int64 first = 1);
// Frame i lies at start + (i, 0, 0); no key where `seen` holds a blank.
TakePoint& addPoint(Take& take, std::string const& subject, std::string const& label, Vec3 const& start,
                    std::string const& seen = "");

}  // namespace talix
