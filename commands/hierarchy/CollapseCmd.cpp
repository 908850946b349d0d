#include <map>

#include "host/command/ScriptCommand.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/services/HInterface.h"

namespace {

class CollapseCmd final : public ScriptCommand<CollapseCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "collapse",
      .displayName = "Collapse Hierarchies",
      .category = "Data Editing",
      .purpose =
          "Copies the motion of one selected hierarchy onto a second one "
          "with the same names, in the active clip.",
      .example = "collapse",
      .argsText =
          "Select exactly two modules: the first is the source, the second the target. Overwriting keys asks "
          "first. Nodes below them pair by name and class; default values and the keys of the active clip "
          "are copied."};

  ~CollapseCmd() override = default;
  bool execute(Given const&, Args const&, Variable&) override;

 private:
  void copyData(Module const* source, Module* target);
  void copyHierarchy(Module* source, Module* target);

  // For the length of one run.
  NLEClip* m_clip = nullptr;
  int m_copied = 0;
};

// Whether the module or a node below it has keys in a clip.
bool hasKeys(Module const* top, NLEClip const* clip) {
  std::vector<Module const*> open{top};
  while (!open.empty()) {
    Module const* module = open.back();
    open.pop_back();
    if (module->hasKeysInClip(clip, true)) return true;
    for (int i = module->getNumNodeChildren(); i-- > 0;) open.push_back(module->getNodeChild(i));
  }
  return false;
}

// Channels are paired by index: both modules are expected to be of one make.
void CollapseCmd::copyData(Module const* source, Module* target) {
  DataEdit edit(*target);
  target->addToClip(m_clip);
  bool copied = false;
  for (int i = 0; i < source->getNumChannels() && i < target->getNumChannels(); ++i)
    copied |= target->getChannel(i)->copyFrom(source->getChannel(i), true, false);
  if (copied) {
    ++m_copied;
  } else {
    edit.discard();
  }
}

void CollapseCmd::copyHierarchy(Module* source, Module* target) {
  std::vector<std::pair<Module*, Module*>> open{{source, target}};
  while (!open.empty()) {
    auto const [from, to] = open.back();
    open.pop_back();
    if (from->getName() == to->getName()) copyData(from, to);

    // The partner of a child is the first of its name and class.
    std::map<std::pair<std::string, HRuntimeClass const*>, Module*> partners;
    for (int i = 0; i < to->getNumNodeChildren(); ++i) {
      Module* child = to->getNodeChild(i);
      partners.emplace(std::pair(child->getName().GetString(), child->getRuntimeClass()), child);
    }
    for (int i = from->getNumNodeChildren(); i-- > 0;) {
      Module* child = from->getNodeChild(i);
      auto const partner = partners.find({child->getName().GetString(), child->getRuntimeClass()});
      if (partner != partners.end()) open.emplace_back(child, partner->second);
    }
  }
}

bool CollapseCmd::execute(Given const&, Args const&, Variable&) {
  if (g_db->getNumSelectedModules() != 2) {
    logError("There must be exactly two 2 selected Modules in the scene");  // kept: the doubled count
    return false;
  }
  Module* source = g_db->getSelectedModule(0);
  Module* target = g_db->getSelectedModule(1);
  m_clip = g_db->getActiveClip();
  m_copied = 0;
  if (!m_clip) {
    logError("There must be an active clip in the scene");
    return false;
  }
  if (hasKeys(target, m_clip) &&
      !g_interface->askQuestion("1 or more of the target node's descendants have key data for the active "
                                "clip\nAre you sure you want to overwrite?",
                                1)) {
    logError("User canceled collapse operation. Aborting.");
    return false;
  }
  copyHierarchy(source, target);
  m_copied ? logInfo("Copied data for %d Modules", m_copied) : logWarning("Didn't copy data for any Modules");
  m_clip = nullptr;
  return true;
}

}  // namespace

Command* newCollapseCmd() { return new (std::nothrow) CollapseCmd; }
