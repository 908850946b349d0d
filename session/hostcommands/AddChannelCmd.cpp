#include <iterator>

#include "host/scene/PropertyTable.h"
#include "session/hostcommands/Arguments.h"

namespace talix {

namespace {

struct ChannelKind {
  char const* name;
  DataSource::PropertyType type;
};
constexpr ChannelKind kChannelKinds[] = {{"vector", DataSource::Vec3Property},
                                         {"rotation", DataSource::RotProperty},
                                         {"float", DataSource::FloatProperty},
                                         {"int", DataSource::IntProperty},
                                         {"bool", DataSource::BoolProperty}};

char const* kindName(DataSource::PropertyType type) {
  for (ChannelKind const& kind : kChannelKinds)
    if (kind.type == type) return kind.name;
  return "";
}

class AddChannelCmd final : public ScriptCommand<AddChannelCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "addChannel",
      .displayName = "Add Channel",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Adds a channel to a module; KIND is vector, rotation, float, int or bool.",
      .args = {"PATH NAME KIND", 3, 3, {Variable::String, Variable::String, Variable::String}}};

  bool execute(Given const&, Args const& args, Variable&) override {
    Module* module = moduleAt(args[0].getStringValue(-1));
    if (!module) return false;
    const HString name = args[1].getStringValue(-1), kindText = args[2].getStringValue(-1);
    ChannelKind const* kind = nullptr;
    for (ChannelKind const& known : kChannelKinds)
      if (kindText == known.name) kind = &known;
    if (!kind) {
      logError("%s is not a kind of channel: vector, rotation, float, int or bool.", kindText.GetStr());
      return false;
    }
    if (!mayAdd(*module, name, *kind)) return false;
    if (module->addChannel(name, kind->type)) return true;
    logError("The channel %s could not be added: there are too many channel names.", name.GetStr());
    return false;
  }

 private:
  static bool mayAdd(Module const& module, HString const& name, ChannelKind const& kind) {
    if (!Module::isValidPropertyName(name)) {
      logError("\"%s\" cannot be the name of a channel: it must not be empty nor hold a dot or a backslash.",
               name.GetStr());
      return false;
    }
    if (module.getProperty(name) || module.getAttribute(name.GetStr())) {
      logError("Module %s already has a property named %s.", module.getName().GetStr(), name.GetStr());
      return false;
    }
    const DataSource::PropertyType known = Controller::mapToPropertyType(name);
    if (known != DataSource::NoProperty && known != kind.type) {
      logError("%s is the name of %s channels and cannot name a %s channel.", name.GetStr(), kindName(known),
               kind.name);
      return false;
    }
    return true;
  }
};

}  // namespace

Command* newAddChannelCmd() { return new AddChannelCmd; }

}  // namespace talix
