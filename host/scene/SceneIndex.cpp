#include "host/scene/SceneIndex.h"

#include <algorithm>
#include <charconv>

namespace {

std::vector<std::string_view> splitPath(std::string_view path) {
  std::vector<std::string_view> names;
  while (true) {
    size_t const end = path.find('\\');
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
  size_t const mark = name.rfind('_');
  if (mark == std::string_view::npos || mark == 0 || mark + 1 == name.size() || name[mark + 1] == '0')
    return 0;
  int number = 0;
  auto const [end, error] = std::from_chars(name.data() + mark + 1, name.data() + name.size(), number);
  if (error != std::errc() || end != name.data() + name.size() || number < 1) return 0;
  base = name.substr(0, mark);
  return number;
}

}  // namespace

void SceneIndex::ByAge::insert(Module* module) {
  if (empty()) {
    m_only = module;
    return;
  }
  if (!m_several) {
    auto several = std::make_unique<std::set<Module*, Earlier>>();
    several->insert(m_only);
    m_several = std::move(several);
    m_only = nullptr;
  }
  m_several->insert(m_several->end(), module);  // most often the last
}

void SceneIndex::ByAge::erase(Module* module) {
  if (!m_several) {
    if (m_only == module) m_only = nullptr;
    return;
  }
  m_several->erase(module);
  if (m_several->size() > 1) return;
  m_only = *m_several->begin();
  m_several.reset();
}

void SceneIndex::add(Module* module) {
  auto const insert = [&](auto& map, auto makeKey) {
    auto found = map.find(makeKey(std::string_view(module->m_name.GetString())));
    if (found == map.end()) {
      auto name = std::make_unique<std::string>(module->m_name.GetString());
      std::string_view const text = *name;
      found = map.emplace(makeKey(text), Bucket{std::move(name), {}}).first;
    }
    found->second.modules.insert(module);
  };
  try {
    insert(m_byName, [](std::string_view name) { return name; });
    insert(m_byParent, [&](std::string_view name) { return ChildKey{module->m_parent, name}; });
  } catch (...) {
    remove(module);
    throw;
  }
}

void SceneIndex::remove(Module* module) noexcept {
  auto const erase = [&](auto& map, auto const& key) {
    auto const found = map.find(key);
    if (found == map.end()) return;
    found->second.modules.erase(module);
    if (found->second.modules.empty()) map.erase(found);
  };
  std::string_view const name = module->m_name.GetString();
  erase(m_byName, name);
  erase(m_byParent, ChildKey{module->m_parent, name});
  freeNumber(module->m_parent, name);
}

SceneIndex::ByAge const* SceneIndex::modulesNamed(std::string_view name) const {
  auto const found = m_byName.find(name);
  return found == m_byName.end() ? nullptr : &found->second.modules;
}

SceneIndex::ByAge const* SceneIndex::childrenNamed(Module const* parent, std::string_view name) const {
  auto const found = m_byParent.find(ChildKey{parent, name});
  return found == m_byParent.end() ? nullptr : &found->second.modules;
}

Module* SceneIndex::findChild(Module const* parent, std::string_view name) const {
  ByAge const* children = childrenNamed(parent, name);
  return children ? children->first() : nullptr;
}

// Calls visit(module) for the modules to which these names lead from a module (null: the root) down, until it
// returns false; returns whether it never did.
template <class Visit>
bool SceneIndex::forEachBelow(Module* top, std::span<std::string_view const> names, Visit visit) const {
  std::vector<std::pair<Module*, size_t>> open{{top, 0}};
  while (!open.empty()) {
    auto const [module, depth] = open.back();
    open.pop_back();
    if (depth == names.size()) {
      if (!visit(module)) return false;
      continue;
    }
    forEachChild(module, names[depth], [&, next = depth + 1](Module* child) {
      open.emplace_back(child, next);
      return true;
    });
  }
  return true;
}

Module* SceneIndex::findFull(std::string_view path, HRuntimeClass const* filter, Module const* below) const {
  if (path.empty() || path.front() != '\\') return nullptr;
  std::vector<std::string_view> const names = splitPath(path.substr(1));
  // Siblings may share a name, so several modules may have the path.
  Module* first = nullptr;
  forEachBelow(nullptr, std::span(names).first(names.size() - 1), [&](Module* parent) {
    forEachChild(parent, names.back(), [&](Module* module) {
      if (!passes(module, filter) || !isBelow(module, below)) return true;
      if (!first || module->m_order < first->m_order) first = module;
      return false;  // its siblings of that name were created later
    });
    return true;
  });
  return first;
}

// Calls visit(module) for the modules whose path ends in these names, until it returns false. Starts from the
// rarer of the first and the last name.
template <class Visit>
void SceneIndex::forEachWithSuffix(std::vector<std::string_view> const& names, Visit visit) const {
  ByAge const* tops = modulesNamed(names.front());
  ByAge const* ends = modulesNamed(names.back());
  if (!tops || !ends) return;
  if (ends->size() > tops->size()) {
    std::span<std::string_view const> const rest = std::span(names).subspan(1);
    tops->forEach([&](Module* top) { return forEachBelow(top, rest, visit); });
    return;
  }
  ends->forEach([&](Module* module) {
    Module const* ancestor = module;
    size_t left = names.size();
    while (left > 0 && ancestor && ancestor->m_name.GetString() == names[left - 1])
      ancestor = ancestor->m_parent, --left;
    return left > 0 || visit(module);
  });
}

Module* SceneIndex::findSuffix(std::string_view path, HRuntimeClass const* filter,
                               Module const* below) const {
  Module* only = nullptr;
  forEachWithSuffix(splitPath(path), [&](Module* module) {
    if (!passes(module, filter) || !isBelow(module, below)) return true;
    bool const second = only != nullptr;
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
  Numbers& numbers = m_numbers[parent][wanted.GetString()];
  auto const isFree = [&](int number, HString& name) {
    name = HString(wanted.GetString() + "_" + std::to_string(number));
    return !findChild(parent, name.GetString());
  };
  HString name;
  while (!numbers.freed.empty()) {
    if (isFree(*numbers.freed.begin(), name)) return name;
    numbers.freed.erase(numbers.freed.begin());  // taken since
  }
  while (!isFree(numbers.next, name)) ++numbers.next;
  return name;
}

// A name has become free below a parent.
void SceneIndex::freeNumber(Module const* parent, std::string_view name) noexcept {
  auto const numbers = m_numbers.find(parent);
  if (numbers == m_numbers.end()) return;
  std::string_view base;
  int const number = trailingNumber(name, base);
  if (number == 0) return;
  try {
    auto const known = numbers->second.find(std::string(base));
    if (known != numbers->second.end() && number < known->second.next) known->second.freed.insert(number);
  } catch (std::bad_alloc const&) {
    m_numbers.erase(numbers);  // they are counted anew
  }
}
