// Names and paths against a search of the whole scene, under clashing names and random edits.
#include <set>

#include "host/scene/Devices.h"
#include "host/scene/SceneIndex.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

bool endsWithNames(std::string const& path, std::string const& suffix) {
  return path.size() > suffix.size() && path.ends_with(suffix) &&
         path[path.size() - suffix.size() - 1] == '\\';
}

bool isAtOrBelow(Module const* module, Module const* top) {
  return !top || module == top || module->isDescendedFrom(top);
}

class PathTest : public SceneTest {
 protected:
  // What a path names, by looking at every module.
  static Module* search(std::string const& path, HRuntimeClass const* filter, bool priorityOnly) {
    Module const* priority = g_db->getPriorityModule();
    auto const fitting = [&](Module const* below) {
      std::vector<Module*> found;
      for (int i = 0; i < g_db->getNumModules(); ++i) {
        Module* module = g_db->getModule(i);
        std::string const full = module->getFullPathString().GetString();
        bool const fits = path.starts_with('\\') ? full == path : endsWithNames(full, path);
        if (fits && (!filter || module->isKindOf(filter)) && isAtOrBelow(module, below))
          found.push_back(module);
      }
      return found;
    };
    std::vector<Module*> found = fitting(priorityOnly ? priority : nullptr);
    if (path.starts_with('\\')) return found.empty() ? nullptr : found.front();
    if (found.size() > 1 && priority && !priorityOnly) found = fitting(priority);
    return found.size() == 1 ? found.front() : nullptr;
  }

  static std::string shortest(Module const* module, bool withinPriority) {
    Module const* priority = withinPriority ? g_db->getPriorityModule() : nullptr;
    if (priority && !isAtOrBelow(module, priority)) priority = nullptr;
    std::string const full = module->getFullPathString().GetString();
    for (size_t at = full.rfind('\\'); at != std::string::npos; at = at ? full.rfind('\\', at - 1) : at - 1) {
      std::string const suffix = full.substr(at + 1);
      int fitting = 0;
      for (int i = 0; i < g_db->getNumModules(); ++i)
        fitting += isAtOrBelow(g_db->getModule(i), priority) &&
                   endsWithNames(g_db->getModule(i)->getFullPathString().GetString(), suffix);
      if (fitting == 1) return suffix;
    }
    return full;
  }

  void edit() {
    static char const* const names[] = {"a", "b", "c", "a_1", "Hips"};
    auto const some = [&]() { return m_modules.empty() ? nullptr : oneOf(m_modules); };
    Module* module = some();
    switch (below(9)) {
      case 0:
        if (!module || m_modules.size() < 20) return;
        if (below(4) == 0) remove(module);
        std::erase_if(m_modules, [](Module* m) { return !m->isInScene(); });
        return;
      case 1:
      case 2:
        if (module) module->setName(names[below(5)]);
        return;
      case 3:
      case 4:
        if (module) some()->addChild(module);
        return;
      case 5:
        if (module && module->getParent()) module->getParent()->removeChild(module, true);
        return;
      case 6:
        return g_db->setPrioritySearchModule(below(3) ? module : nullptr);
      default: {
        if (m_modules.size() > 60) return;
        Module* parent = below(3) ? module : nullptr;
        m_modules.push_back(below(2) ? static_cast<Module*>(create<Marker>(names[below(5)], parent))
                                     : create<AnalogDevice>(names[below(5)], parent));
      }
    }
  }

  std::vector<Module*> m_modules;
};

TEST_F(PathTest, LookUpAgreesWithASearchOfTheWholeScene) {
  HRuntimeClass const* const filters[] = {nullptr, &Marker::s_classMarker, &Node::s_classNode,
                                          &AnalogDevice::s_classAnalogDevice};
  for (int step = 0; step < 1500; ++step) {
    edit();
    if (m_modules.empty()) continue;
    for (int i = 0; i < 4; ++i) {
      std::string path = oneOf(m_modules)->getFullPathString().GetString();
      if (below(3)) path = path.substr(1 + below(path.size() - 1));
      if (below(10) == 0) path += "\\";
      HRuntimeClass const* filter = filters[below(4)];
      bool const priorityOnly = below(2);
      ASSERT_EQ(g_db->getModuleWithPath(HString(path), filter, priorityOnly),
                search(path, filter, priorityOnly))
          << path << " at step " << step;
    }
    Module const* module = oneOf(m_modules);
    bool const withinPriority = below(2);
    ASSERT_EQ(module->getMinimumPathString(withinPriority), shortest(module, withinPriority).c_str());
  }
}

TEST_F(PathTest, FormsOfAPath) {
  auto* subject = create<Character>("Subject");
  auto* hips = create<Node>("Hips", subject);
  create<Node>("Hips");
  EXPECT_EQ(hips->getPath(Module::NameOnly), "Hips");
  EXPECT_EQ(hips->getPath(Module::ShortestPath), "Subject\\Hips");
  EXPECT_EQ(hips->getPath(Module::FullPath), "\\Subject\\Hips");
  EXPECT_EQ(named("Subject\\Hips"), hips);
  EXPECT_EQ(named("\\Hips")->getParent(), nullptr);
  for (char const* none : {"", "\\", "Hips", "subject", "\\Subject\\Hips\\", "Subject\\\\Hips", "ect\\Hips"})
    EXPECT_EQ(named(none), nullptr) << none;
}

TEST_F(PathTest, OfEqualFullPathsTheFirstCreatedIsMeant) {
  Module *a = create<Node>("a"), *b = create<Marker>("b"), *c = create<Node>("c");
  c->setName("a");
  b->setName("a");
  EXPECT_EQ(named("\\a"), a);
  EXPECT_EQ(g_db->getModuleWithPath("\\a", &Marker::s_classMarker, false), b);
  remove(a);
  EXPECT_EQ(named("\\a"), b);
  b->setName("x");
  EXPECT_EQ(named("\\a"), c);
  EXPECT_EQ(c->getMinimumPathString(false), "a");
}

// The lowest free number, whatever came and went before.
TEST_F(PathTest, NewNamesAreTheLowestFree) {
  std::vector<Module*> parents{nullptr, create<Node>("p"), create<Node>("q")};
  std::vector<Module*> modules;
  static char const* const wishes[] = {"a", "a_1", "a_2", "a_1_1", "a_01", "b"};
  for (int step = 0; step < 4000; ++step) {
    if (below(5) < 3 || modules.empty()) {
      Module* parent = oneOf(parents);
      std::string const wish = wishes[below(6)];
      std::set<std::string> taken;
      for (Module* module : modules)
        if (module->getParent() == parent) taken.insert(module->getName().GetString());
      std::string expected = wish;
      for (int number = 1; taken.contains(expected); ++number) expected = wish + "_" + std::to_string(number);
      modules.push_back(create<Node>(wish.c_str(), parent));
      ASSERT_EQ(modules.back()->getName(), expected.c_str()) << "step " << step;
      continue;
    }
    size_t const at = below(modules.size());
    Module* module = modules[at];
    switch (below(4)) {
      case 0:
        module->setName(HString("a_" + std::to_string(below(12))));
        break;
      case 1:
        if (Module* parent = oneOf(parents)) parent->addChild(module);
        break;
      default:
        remove(module);
        modules.erase(modules.begin() + static_cast<std::ptrdiff_t>(at));
    }
  }
}

}  // namespace
