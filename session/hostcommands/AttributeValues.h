// Attributes from script values: the kinds by their script names, and how the values of each are read.
#pragma once

#include <memory>
#include <string>

#include "host/command/ScriptCommand.h"
#include "host/scene/Module.h"

namespace talix {

struct AttributeKind {
  char const* name;
  Attribute::Type type;
  char const* values;  // what it takes, for messages

  // Its values are its labels.
  bool takesLabels() const { return type == Attribute::Enumeration || type == Attribute::BitField; }
};

AttributeKind const* findAttributeKind(HString const& name);  // null: none
std::string attributeKindNames();

// A new attribute for `module` with the values from args[first] on, which become its default; without values
// it has the kind's own. Null, and a logged error, when they do not fit the kind.
std::unique_ptr<Attribute> makeAttribute(AttributeKind const& kind, HString const& name, Args const& args,
                                         int first, Module const& module);

}  // namespace talix
