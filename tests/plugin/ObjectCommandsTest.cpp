// Unique paths against the rule taken literally.
#include <algorithm>
#include <random>

#include "tests/plugin/SceneFixture.h"

namespace {

class ObjectCommands : public SceneFixture {
 protected:
  static std::vector<std::string> names() {
    std::vector<std::string> all;
    for (int i = 0; i < g_db->getNumModules(); ++i) all.push_back(g_db->getModule(i)->getName().GetString());
    return all;
  }
};

// The rule step by step: a list of seen paths, every candidate tried from the start.
void makeUniqueLiterally() {
  std::vector<HString> seen;
  int const count = g_db->getNumModules();
  for (int i = 0; i < count; ++i) {
    Module* module = g_db->getModule(i);
    HString const path = module->getFullPathString();
    if (std::find(seen.begin(), seen.end(), path) == seen.end()) {
      seen.push_back(path);
      continue;
    }
    HString const name = module->getName();
    int const length = name.GetLength();
    int last = length - 1;
    while (last >= 0 && name[last] >= '0' && name[last] <= '9') --last;
    HString base = name;
    int number = 0;
    if (last != length - 1 && last > 0 && name[last - 1] == '_') {
      base = name.Left(static_cast<uint64>(last - 1));
      number = std::stoi(name.Right(static_cast<uint64>(length - last - 1)).GetString());
    }
    HString const parent = module->getParent() ? module->getParent()->getFullPathString() : HString();
    HString candidate;
    do candidate.Format("%s_%d", base.GetStr(), ++number);
    while (g_db->getModuleWithPath(parent + "\\" + candidate, nullptr, false));
    module->setName(candidate);
  }
}

TEST_F(ObjectCommands, UniquePathsFollowTheRule) {
  // Parents made before and after their children, names that are one another's candidates.
  auto const build = [&](unsigned seed) {
    static constexpr char const* kNames[] = {"a",    "a_1", "a_2", "a_x1", "a_x2",
                                             "a__1", "7",   "_2",  "a_3",  "a_y2"};
    std::mt19937 random(seed);
    auto const below = [&](size_t end) { return std::uniform_int_distribution<size_t>(0, end - 1)(random); };
    g_db->newScene();
    std::vector<Module*> modules;
    size_t const names = 1 + below(10);
    for (size_t i = 0; i < 60; ++i) modules.push_back(make("x"));
    for (Module* module : modules) module->setName(kNames[below(names)]);
    for (size_t i = 0; i < 40; ++i) modules[below(modules.size())]->addChild(modules[below(modules.size())]);
  };
  for (unsigned seed = 0; seed < 300; ++seed) {
    build(seed);
    makeUniqueLiterally();
    std::vector<std::string> const expected = names();
    build(seed);
    ASSERT_NE(expected, names());
    EXPECT_EQ(run("makeUnique"), "nothing");
    ASSERT_EQ(names(), expected) << seed;
  }
}

}  // namespace
