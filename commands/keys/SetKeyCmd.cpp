#include "commands/ChannelValues.h"
#include "commands/Events.h"
#include "commands/keys/KeyTargets.h"
#include "host/command/Angles.h"
#include "host/command/Candidates.h"
#include "host/command/Frames.h"
#include "host/scene/DataEdit.h"
#include "host/scene/HTimeManager.h"

namespace {

class SetKeyCmd final : public ScriptCommand<SetKeyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setKey",
      .displayName = "Set Key",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Writes a key on a channel, at the current time or at a frame.",
      .example = "setKey Translation 1 2.5 3 -t 10 -onMod LFHD",
      .args = {"\"propertyType\" value1 ...", 2, 4, {Variable::String}},
      .argsText =
          "propertyType is a channel, or a component of one (tx, Translation.x). Lengths are mm, angles "
          "degrees. Vectors and rotations take <x y z> or three numbers; angles count in XYZ, with -onMod in "
          "the node's order. Keys every selected module that has the channel, in the active layer of the "
          "active clip. What is locked is passed over.",
      .options = {{"t", "frame of the key; default the current time", 1, Variable::Int},
                  {"r", "adds to the value of the active layer there; refused for booleans"},
                  {"all", "every module of the scene that has the channel, selected or not"},
                  {"onMod", "path of the one module to key; an error when it lacks the channel or is locked",
                   1, Variable::String, 16},
                  {"type", "class name: of those modules only the ones of exactly this class", 1,
                   Variable::String, 8}},
      .solo = Solo::no};
  static constexpr int kFrame = info.option("t"), kRelative = info.option("r");
  static constexpr Candidates::Options kCandidates = {info.option("all"), info.option("onMod"),
                                                      info.option("type")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

// The key that a line writes, on one channel or on many.
struct NewKey {
  int64 time = 0;
  Change change;
  ChannelValue value;
  TalixRotation::RotOrder givenOrder = TalixRotation::XYZ;  // of three angles

  // False, with a message, when the channel cannot hold the value.
  [[nodiscard]] bool writeOn(Controller& channel) const;

 private:
  bool write(Vec3Controller& channel) const;
  bool write(RotController& channel) const;
  bool write(FloatController& channel) const;
  bool write(IntController& channel) const;
  bool write(BoolController& channel) const;
};

bool NewKey::write(Vec3Controller& channel) const {
  Vec3 wanted = value.vector;
  if (change.relative) wanted = changed(Vec3(layerValue(channel, time).data()), wanted, change);
  if (!canBeHeld(wanted)) return false;
  if (change.component >= 0)
    channel.setComponentKey(time, wanted[change.component], 1u << change.component);
  else
    channel.setKey(time, wanted, 7);
  return true;
}

bool NewKey::write(RotController& channel) const {
  TalixRotation current;
  if (change.relative || change.component >= 0) current.setQuaternion(layerValue(channel, time).data());
  // Kept: without "-onMod" three angles count in XYZ, while a component counts in the module's own order.
  TalixRotation::RotOrder const order =
      change.component < 0 ? givenOrder : rotationOrderOf(*channel.getModule());
  channel.setKey(time, changed(current, value.vector, change, order), 7);
  return true;
}

bool NewKey::write(FloatController& channel) const {
  double const wanted =
      changed(change.relative ? layerValue(channel, time)[0] : 0, value.number, change.relative);
  if (!canBeHeld(wanted)) return false;
  channel.setKey(time, wanted, 1);
  return true;
}

bool NewKey::write(IntController& channel) const {
  int const current = change.relative ? nearestInt(layerValue(channel, time)[0]) : 0;
  int64 const wanted = changed(current, value.integer, change.relative);
  if (!canBeHeld(wanted)) return false;
  channel.setKey(time, static_cast<int>(wanted), 1);
  return true;
}

bool NewKey::write(BoolController& channel) const {
  channel.setKey(time, changed(layerValue(channel, time)[0] != 0, value.state), 1);
  return true;
}

bool NewKey::writeOn(Controller& channel) const {
  bool taken = true;
  {
    DataEdit const edit(channel, HTimeRange(time - 1, time + 1));
    withKind(channel, [&](auto& typed) { taken = write(typed); });
  }
  return isHeld(taken, channel.getName().GetStr(), *channel.getModule());
}

// Reads the value for a channel of that kind; false, with a message, when it cannot be keyed.
bool readKeyValue(Args const& args, DataSource::PropertyType kind, NewKey& key) {
  bool const boolean = kind == DataSource::BoolProperty;
  if (!readValue(args, kind, key.change.component, key.value) ||
      (boolean && args[1].getType() != Variable::Bool)) {
    if (hasComponents(kind))
      Command::logError("Invalid number or type of arguments for %s", SetKeyCmd::info.name);
    else
      Command::logError("Invalid number or type of arguments");  // kept: without the command's name
    return false;
  }
  if (boolean && key.change.relative) {
    Command::logError("Cannot use -r option on Boolean types");
    return false;
  }
  return true;
}

// The time of the last "-t", else now.
std::optional<int64> readTime(GivenOptions const& options) {
  CommandOption const* frame = options.find(SetKeyCmd::kFrame);
  return frame ? timeOfWholeFrame(frame->getArg(0).getIntValue(-1))
               : std::optional(HTimeManager::getInstance()->getTime());
}

bool writeOnMod(NewKey const& key, Module const& module, unsigned id, char const* typed) {
  Controller* channel = module.getProperty(id);
  if (!channel) {
    Command::logError("%s is not a property on module: %s", typed, module.getName().GetStr());
    return false;
  }
  if (!channel->isEditable()) {
    Command::logError("%s is not an editable property on module: %s. This may be due to the active clip.",
                      typed, module.getName().GetStr());
    return false;
  }
  return key.writeOn(*channel);
}

bool writeOnCandidates(NewKey const& key, Candidates const& candidates, unsigned id) {
  if (!candidates.exist("No modules to set property on", "No selected modules to set property on."))
    return false;
  return candidates.each([&](Module& module) {
    Controller* channel = module.getProperty(id);
    return !channel || !channel->isEditable() || key.writeOn(*channel);
  });
}

bool SetKeyCmd::execute(Given const& given, Args const& args, Variable&) {
  GivenOptions const options(given);
  NewKey key;
  Candidates candidates;
  auto const time = readTime(options);
  if (!time || !candidates.read(given, kCandidates)) return false;
  key.time = *time;
  key.change.relative = options.has(kRelative);

  char const* typed = args[0].getStringValue(-1);
  ChannelName const channel = channelNameFrom(typed, Suffix::anyCut);
  key.change.component = channel.component;
  unsigned const id = Controller::mapPropertyName(channel.name);
  DataSource::PropertyType const kind = Controller::mapToPropertyType(id);
  if (kind == DataSource::NoProperty) {
    logError("Unknown property type: %s", channel.name.GetStr());
    return false;
  }
  if (!readKeyValue(args, kind, key)) return false;

  Module* module = candidates.getOnMod();
  if (module) key.givenOrder = rotationOrderOf(*module);
  if (!(module ? writeOnMod(key, *module, id, typed) : writeOnCandidates(key, candidates, id))) return false;

  if (g_db->getAutoUpdateProperties()) g_db->syncActiveProperties(true);
  HEventManager::safeSubmit(HControllerSelectionChangedEvent());
  return true;
}

}  // namespace

Command* newSetKeyCmd() { return new (std::nothrow) SetKeyCmd; }
