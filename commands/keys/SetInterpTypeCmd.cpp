#include "host/command/Targets.h"

namespace {

class SetInterpTypeCmd final : public ScriptCommand<SetInterpTypeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setInterpType",
      .displayName = "Set Interpolation Type",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose =
          "Chooses how a channel runs from one key to the next: \"Constant\", \"Linear\" or \"Cubic\".",
      .example = "setInterpType Translation Linear -onMod LFHD",
      .args = {"propertyName interpType", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "propertyName is a whole channel, both words in exact case; not every kind of channel has all "
          "three. On all selected modules, each of which must have the channel; it holds for all its clips "
          "and layers.",
      .options = {{"onMod", "path of the one module to change instead of the selected ones", 1,
                   Variable::String}},
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

bool choose(Module const& module, HString const& name, HString const& type) {
  Controller* channel = module.getProperty(name);
  if (!channel) {
    Command::logError("%s is not a property on %s", name.GetStr(), module.getName().GetStr());
    return false;
  }
  for (int i = 0; i < channel->getNumInterpTypes(); ++i) {
    if (type != channel->getInterpTypeName(i)) continue;
    channel->setInterpType(i);
    return true;
  }
  Command::logError("Interpolation type %s not found on property %s", type.GetStr(), name.GetStr());
  return false;
}

bool SetInterpTypeCmd::execute(Given const& given, Args const& args, Variable&) {
  if (g_db->getActiveLayer() == -1) {
    logError("Can't set interp type on the base clip");
    return false;
  }
  Module* onMod = nullptr;
  if (!readOnMod(given, info.option("onMod"), kNoModuleAt, onMod)) return false;
  HString const name = args[0].getStringValue(-1), type = args[1].getStringValue(-1);
  if (name.IsEmpty()) {
    logError("Cannot pass empty string as property name");
    return false;
  }
  if (type.IsEmpty()) {
    logError("Cannot pass empty string as interp type");
    return false;
  }
  return eachTarget(onMod, [&](Module const& module) { return choose(module, name, type); });
}

}  // namespace

Command* newSetInterpTypeCmd() { return new (std::nothrow) SetInterpTypeCmd; }
