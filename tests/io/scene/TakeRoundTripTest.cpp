// Real takes into the scene and out of it.
#include <filesystem>

#include "tests/io/TakeTesting.h"
#include "tests/io/scene/SceneTesting.h"

namespace talix {

namespace {

class TakeRoundTrip : public SceneTest {};

std::vector<std::string> takeFiles() {
  std::vector<std::string> names;
  for (auto const& entry : std::filesystem::directory_iterator(dataFile(""))) {
    std::string const name = entry.path().filename().string(), suffix = entry.path().extension().string();
    if (suffix == ".c3d" || suffix == ".bvh" || suffix == ".trc") names.push_back(name);
  }
  return names;
}

TEST_F(TakeRoundTrip, EveryRealTakeComesBackAsItWasRead) {
  int read = 0;
  for (std::string const& name : takeFiles()) {
    Take take;
    if (!errorOf([&] { take = readTake(dataFile(name)); }).empty()) continue;
    g_db->newScene();
    HTimeManager::getInstance()->reset();
    open(take);
    Take const made = save();
    EXPECT_EQ(differenceOf(take, made), "") << name;
    EXPECT_EQ(made.format + " " + made.name, take.format + " " + take.name);
    for (size_t i = 0; i < take.analog.size(); ++i)
      EXPECT_TRUE(made.analog[i].scale == take.analog[i].scale &&
                  made.analog[i].offset == take.analog[i].offset);
    EXPECT_FALSE(warned("left out")) << name << ": " << notes();
    ++read;
  }
  EXPECT_GE(read, 30);
}

}  // namespace

}  // namespace talix
