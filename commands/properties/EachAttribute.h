// How the commands that change attributes go through modules.
#pragma once

#include <functional>

#include "host/command/Candidates.h"

struct AttributeTexts {
  char const* noModules;    // "-all" in an empty scene
  char const* noSelection;  // neither a module nor a selection
  char const* failed;       // %s: the attribute's name, the module's name
};

// Calls work(attribute) for the attribute of that name, in exact case, of the module of "-onMod", else of
// each candidate that has one. Stops at the first that returns false; what was changed before stays. False,
// with a message, then and when there is no such attribute.
bool eachAttribute(Candidates const& candidates, HString const& name, AttributeTexts const& texts,
                   std::function<bool(Attribute&)> const& work);
