#include "host/scene/SceneIndex.h"

#include <algorithm>
#include <charconv>

namespace {

std::vector<std::string_view> splitPath(std::string_view path) {
  std::vector<std::string_view> names;
  while (true) {
    const size_t end = path.find('\\');
    names.push_back(path.substr(0, end));
    if (end == std::string_view::npos) return names;
    path.remove_prefix(end + 1);
  }
}

bool isBelow(Module const* module, Module const* below) {
  return !below || module == below || module->isDescendedFrom(below);
}

bool passes(Module const* module, HRuntimeClass const* filter) { return !filter || module->isKindOf(filter); }

// Splits "name_12" into "name" and 12; 0 when the name does not end so.
int trailingNumber(std::string_view name, std::string_view& base) {
  const size_t mark = name.rfind('_');
  if (mark == std::string_view::npos || mark == 0 || mark + 1 == name.size() || name[mark + 1] == '0')
    return 0;
  int number = 0;
  const auto [end, error] = std::from_chars(name.data() + mark + 1, name.data() + name.size(), number);
  if (error != std::errc() || end != name.data() + name.size() || number < 1) return 0;
  base = name.substr(0, mark);
  return number;
}

}  // namespace

void SceneIndex::add(Module* module) {
  const auto insert = [&](auto& map, auto makeKey) {
    auto found = map.find(makeKey(std::string_view(module->m_name.GetString())));
    if (found == map.end()) {
      auto name = std::make_unique<std::string>(module->m_name.GetString());
      const std::string_view text = *name;
      found = map.emplace(makeKey(text), Bucket{std::move(name), {}}).first;
    }
    auto& modules = found->second.modules;
    const auto later = [](Module const* a, Module const* b) { return a->m_order < b->m_order; };
    modules.insert(std::upper_bound(modules.begin(), modules.end(), module, later), module);
  };
  insert(m_byName, [](std::string_view name) { return name; });
  insert(m_byParent, [&](std::string_view name) { return ChildKey{module->m_parent, name}; });
}

void SceneIndex::remove(Module* module) {
  const auto erase = [&](auto& map, auto const& key) {
    const auto found = map.find(key);
    auto& modules = found->second.modules;
    const auto earlier = [](Module const* a, Module const* b) { return a->m_order < b->m_order; };
    modules.erase(std::lower_bound(modules.begin(), modules.end(), module, earlier));
    if (modules.empty()) map.erase(found);
  };
  const std::string_view name = module->m_name.GetString();
  erase(m_byName, name);
  erase(m_byParent, ChildKey{module->m_parent, name});
  freeNumber(module->m_parent, name);
  m_nextNumber.erase(module);
}

SceneIndex::Bucket const* SceneIndex::bucket(std::string_view name) const {
  const auto found = m_byName.find(name);
  return found == m_byName.end() ? nullptr : &found->second;
}

Module* SceneIndex::findChild(Module const* parent, std::string_view name) const {
  const auto found = m_byParent.find(ChildKey{parent, name});
  return found == m_byParent.end() ? nullptr : found->second.modules.front();
}

Module* SceneIndex::findFull(std::string_view path, HRuntimeClass const* filter, Module const* below) const {
  if (path.empty() || path.front() != '\\') return nullptr;
  const std::vector<std::string_view> names = splitPath(path.substr(1));
  // Siblings may share a name, so each level may have several modules.
  std::vector<Module const*> parents{nullptr};
  Module* first = nullptr;
  for (size_t level = 0; level < names.size(); ++level) {
    std::vector<Module const*> next;
    for (Module const* parent : parents) {
      const auto found = m_byParent.find(ChildKey{parent, names[level]});
      if (found == m_byParent.end()) continue;
      if (level + 1 < names.size()) {
        next.insert(next.end(), found->second.modules.begin(), found->second.modules.end());
        continue;
      }
      for (Module* module : found->second.modules) {
        if (!passes(module, filter) || !isBelow(module, below)) continue;
        if (!first || module->m_order < first->m_order) first = module;
        break;  // the others were created later
      }
    }
    parents = std::move(next);
  }
  return first;
}

// Calls visit(module) for the modules whose path ends in these names, until it answers false. Starts from the
// rarer of the first and the last name.
template <class Visit>
void SceneIndex::forEachWithSuffix(std::vector<std::string_view> const& names, Visit visit) const {
  Bucket const* tops = bucket(names.front());
  Bucket const* ends = bucket(names.back());
  if (!tops || !ends) return;
  if (names.size() == 1 || ends->modules.size() <= tops->modules.size()) {
    for (Module* module : ends->modules) {
      Module const* ancestor = module;
      size_t left = names.size();
      while (left > 0 && ancestor && ancestor->m_name.GetString() == names[left - 1])
        ancestor = ancestor->m_parent, --left;
      if (left == 0 && !visit(module)) return;
    }
    return;
  }
  std::vector<Module*> level = tops->modules, next;
  for (size_t i = 1; i < names.size(); ++i) {
    next.clear();
    for (Module const* parent : level) {
      const auto found = m_byParent.find(ChildKey{parent, names[i]});
      if (found != m_byParent.end())
        next.insert(next.end(), found->second.modules.begin(), found->second.modules.end());
    }
    level.swap(next);
  }
  for (Module* module : level)
    if (!visit(module)) return;
}

Module* SceneIndex::findSuffix(std::string_view path, HRuntimeClass const* filter,
                               Module const* below) const {
  Module* only = nullptr;
  forEachWithSuffix(splitPath(path), [&](Module* module) {
    if (!passes(module, filter) || !isBelow(module, below)) return true;
    const bool second = only != nullptr;
    only = second ? nullptr : module;
    return !second;
  });
  return only;
}

int SceneIndex::levelsToTell(Module const* module, Module const* below) const {
  std::vector<std::string_view> names;
  int levels = 0;
  for (Module const* ancestor = module; ancestor; ancestor = ancestor->m_parent) {
    names.insert(names.begin(), ancestor->m_name.GetString());
    ++levels;
    int found = 0;
    forEachWithSuffix(names, [&](Module* other) { return !isBelow(other, below) || ++found < 2; });
    if (found == 1) return levels;
  }
  return 0;
}

HString SceneIndex::freeName(Module const* parent, HString const& wanted) {
  if (!findChild(parent, wanted.GetString())) return wanted;
  int& next = m_nextNumber[parent].try_emplace(wanted.GetString(), 1).first->second;
  while (true) {
    HString name(wanted.GetString() + "_" + std::to_string(next));
    if (!findChild(parent, name.GetString())) return name;
    ++next;
  }
}

// A name has become free below a parent: numbers are counted from it again.
void SceneIndex::freeNumber(Module const* parent, std::string_view name) {
  const auto numbers = m_nextNumber.find(parent);
  if (numbers == m_nextNumber.end()) return;
  std::string_view base;
  const int number = trailingNumber(name, base);
  if (number == 0) return;
  const auto next = numbers->second.find(std::string(base));
  if (next != numbers->second.end()) next->second = std::min(next->second, number);
}
