#include "commands/properties/EachAttribute.h"

bool eachAttribute(Candidates const& candidates, HString const& name, AttributeTexts const& texts,
                   std::function<bool(Attribute&)> const& work) {
  bool found = false;
  auto const workOn = [&](Module& module) {
    Attribute* attribute = module.getAttribute(name.GetStr());
    if (!attribute) return true;
    found = true;
    if (work(*attribute)) return true;
    Command::logError(texts.failed, name.GetStr(), module.getName().GetStr());
    return false;
  };
  if (Module* module = candidates.getOnMod()) {
    if (!workOn(*module)) return false;
  } else {
    if (!candidates.exist(texts.noModules, texts.noSelection) || !candidates.each(workOn)) return false;
  }
  if (!found) Command::logError("Unknown property type: %s", name.GetStr());
  return found;
}
