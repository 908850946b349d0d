// What the property getters share: the way to an attribute, a channel's value, and which getter to use
// instead.
#pragma once

#include "host/command/ScriptCommand.h"
#include "host/command/Targets.h"
#include "host/scene/HTimeManager.h"

// The getters that send the user elsewhere for kinds of attribute that they do not read.
enum class Getter { Int, Boolean, String, BooleanArray, IntArray, StringArray };

// Logs what to use instead for this kind of attribute and returns false, as the getter then does.
bool redirect(Getter getter, Attribute const& attribute);

// The attribute of that name, in exact case. Without one logs "Unknown property type" and returns null.
Attribute const* attributeNamed(Module const& module, HString const& name);
// The attribute that the first two arguments, a path and a name, stand for. Null, with a message, when there
// is no such module or attribute.
Attribute const* attributeAt(Args const& args, char const* badPath = kNoModuleAt);

// Whether "-c" or "-d" was given, which mean the same: the default value, not that at the current time.
template <class Getter>
bool isByDefault(Given const& given) {
  GivenOptions const options(given);
  return options.has(Getter::info.option("c")) || options.has(Getter::info.option("d"));
}

// The module's channel of a kind by its whole name; null when it has none.
template <class Channel>
Channel const* channelNamed(Module const& module, HString const& name) {
  return objectAs<Channel>(module.getProperty(Controller::mapPropertyName(name)));
}

template <class Channel>
auto valueOf(Channel const& channel, bool byDefault) {
  return byDefault ? channel.getConstValue() : channel.getValue(HTimeManager::getInstance()->getTime());
}

// The number that Module::getPropertyVal reads for the first two arguments; its text is logged when it
// cannot.
bool readNumber(Args const& args, char const* badPath, bool byDefault, Variable& result);
