// Namespaces: the prefixes of a module's name, joined by ":", outermost first.

#include <string_view>

#include "host/scene/Module.h"

namespace {

constexpr char kJoint = ':';

bool isValidNamespace(HString const& name) {
  std::string const& text = name.GetString();
  return !text.empty() && text.find('\\') == std::string::npos && text.front() != kJoint &&
         text.back() != kJoint && text.find("::") == std::string::npos;
}

// Where the namespace stands among the parts of a prefix ("actor1" in "stage:actor1"), as whole parts; npos:
// nowhere.
size_t findParts(std::string_view prefix, std::string_view parts) {
  for (size_t at = prefix.find(parts); at != std::string_view::npos; at = prefix.find(parts, at + 1)) {
    size_t const end = at + parts.size();
    if ((at == 0 || prefix[at - 1] == kJoint) && (end == prefix.size() || prefix[end] == kJoint)) return at;
  }
  return std::string_view::npos;
}

std::string_view prefixOf(std::string_view name) {
  size_t const joint = name.rfind(kJoint);
  return joint == std::string_view::npos ? std::string_view() : name.substr(0, joint);
}

}  // namespace

void Module::getNamespace(HString& out) const {
  HString const name = getName();
  out = HString(prefixOf(name.GetString()));
}

void Module::getNamespaces(TArray<HString>& out) const {
  out.clear();
  HString const name = getName();
  std::string_view prefix = prefixOf(name.GetString());
  while (!prefix.empty()) {
    size_t const joint = prefix.find(kJoint);
    out.add(HString(prefix.substr(0, joint)));
    prefix.remove_prefix(joint == std::string_view::npos ? prefix.size() : joint + 1);
  }
}

bool Module::addNamespace(HString const& name) {
  HString const own = getName();
  if (!isValidNamespace(name) ||
      findParts(prefixOf(own.GetString()), name.GetString()) != std::string_view::npos)
    return false;
  return setName(name + ":" + own);
}

bool Module::removeNamespace(HString const& name) {
  HString const own = getName();
  size_t const at = isValidNamespace(name) ? findParts(prefixOf(own.GetString()), name.GetString())
                                           : std::string_view::npos;
  if (at == std::string_view::npos) return false;
  std::string text = own.GetString();
  return setName(HString(text.erase(at, name.GetString().size() + 1)));
}

bool Module::replaceNamespace(HString const& former, HString const& name) {
  HString const own = getName();
  size_t const at = isValidNamespace(name) ? findParts(prefixOf(own.GetString()), former.GetString())
                                           : std::string_view::npos;
  if (former.IsEmpty() || at == std::string_view::npos) return false;
  // What addNamespace refuses cannot come in this way: one that the other parts hold.
  std::string text = own.GetString();
  std::string const before = text.substr(0, at), after = text.substr(at + former.GetString().size());
  if (former != name && (findParts(before, name.GetString()) != std::string_view::npos ||
                         findParts(prefixOf(after), name.GetString()) != std::string_view::npos))
    return false;
  return setName(HString(before + name.GetString() + after));
}
