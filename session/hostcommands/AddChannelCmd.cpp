#include <algorithm>
#include <iterator>

#include "host/command/Targets.h"
#include "host/scene/PropertyTable.h"
#include "session/hostcommands/NewProperty.h"

namespace talix {

namespace {

constexpr DataSource::PropertyType kChannelKinds[] = {DataSource::Vec3Property, DataSource::RotProperty,
                                                      DataSource::FloatProperty, DataSource::IntProperty,
                                                      DataSource::BoolProperty};

class AddChannelCmd final : public ScriptCommand<AddChannelCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "addChannel",
      .displayName = "Add Channel",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Adds a channel to a module; KIND is vector, rotation, float, int or bool.",
      .example = "addChannel LFHD Speed float",
      .args = {"PATH NAME KIND", 3, 3, {Variable::String, Variable::String, Variable::String}},
      .argsText = "NAME must be new on the module. A channel name has one kind in the whole scene."};

  bool execute(Given const&, Args const& args, Variable&) override {
    Module* module = moduleAt(args[0].getStringValue(-1));
    if (!module) return false;
    HString const name = args[1].getStringValue(-1), kindText = args[2].getStringValue(-1);
    auto const* kind = std::ranges::find_if(kChannelKinds, [&](DataSource::PropertyType type) {
      return kindText == PropertyTable::getTypeName(type);
    });
    if (kind == std::end(kChannelKinds)) {
      logError("%s is not a kind of channel: vector, rotation, float, int or bool.", kindText.GetStr());
      return false;
    }
    if (!isNewProperty(*module, name, "a channel",
                       PropertyTable::getInstance().obstacleToChannel(name, *kind)))
      return false;
    if (module->addChannel(name, *kind)) return true;
    logError("The channel %s could not be added: there are too many channel names.", name.GetStr());
    return false;
  }
};

}  // namespace

Command* newAddChannelCmd() { return new AddChannelCmd; }

}  // namespace talix
