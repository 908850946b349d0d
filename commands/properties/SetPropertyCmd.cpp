#include "commands/Events.h"
#include "commands/properties/AttributeWriting.h"
#include "commands/properties/ChannelWriting.h"
#include "commands/properties/EachAttribute.h"
#include "host/command/ChannelName.h"

namespace {

class SetPropertyCmd final : public ScriptCommand<SetPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setProperty",
      .displayName = "Set Property",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose =
          "Sets a property of modules: an attribute, or the selected keys or the default of a channel.",
      .example = "setProperty Color 255 0 0 -onMod LFHD",
      .args = {"propertyName propertyVal1 propertyVal2 ...", 2, ArgsInfo::kAny, {Variable::String}},
      .argsText =
          "propertyName is a channel, a component of one (tx, Translation.x) or an attribute in exact case. "
          "On all selected modules that have it. A channel takes the value on its selected keys, not at the "
          "current time; -d sets its default value. Lengths are mm, angles degrees, times frames. Vector "
          "channels are written even where they are locked, others only with -onMod.",
      .options =
          {{"c", "the same as -d", 0, Variable::None, 0, true},
           {"r",
            "adds to the present value; refused for boolean channels, no effect on texts, lists and states"},
           {"all", "every module of the scene that has the property, selected or not"},
           {"onMod", "path of the one module to change", 1, Variable::String, 16},
           {"type", "class name: of those modules only the ones of exactly this class", 1, Variable::String,
            8},
           {"d",
            "sets the default value of a channel instead of its selected keys; no effect on attributes"}},
      .solo = Solo::no};
  static constexpr int kConst = info.option("c"), kRelative = info.option("r"), kDefault = info.option("d");
  static constexpr Candidates::Options kCandidates = {info.option("all"), info.option("onMod"),
                                                      info.option("type")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

constexpr char const kNoModules[] = "No modules to set property on";
constexpr char const kNoSelection[] = "No selected modules to set property on.";

bool setAttributes(Candidates const& candidates, HString const& name, Args const& args,
                   Change const& change) {
  AttributeTexts const texts = {kNoModules, kNoSelection, "Failed to set attribute %s on module %s"};
  if (eachAttribute(candidates, name, texts, [&](Attribute& attribute) {
        return setAttribute(attribute, args, change, SetPropertyCmd::info.name);
      }))
    return true;
  HEventManager::safeSubmit(HReloadAttributesEvent());  // views drop what the user typed
  return false;
}

bool readChannelValue(Args const& args, DataSource::PropertyType kind, ChannelWrite& write) {
  if (!readValue(args, kind, write.change.component, write.value)) {
    Command::logError("Invalid number or type of arguments for %s", SetPropertyCmd::info.name);
    return false;
  }
  if (kind == DataSource::BoolProperty && write.change.relative) {
    Command::logError("Can't use -r option for %s", SetPropertyCmd::info.name);
    return false;
  }
  return true;
}

bool writeChannels(Candidates const& candidates, unsigned id, DataSource::PropertyType kind,
                   ChannelWrite const& write) {
  if (Module const* module = candidates.getOnMod()) {
    // Kept: written even where it is locked; a module without the channel is no error.
    if (Controller* channel = module->getProperty(id)) write.applyTo(*channel);
    return true;
  }
  // Kept: without any module channels of one value succeed silently.
  if (hasComponents(kind) && !candidates.exist(kNoModules, kNoSelection)) return false;
  return candidates.each([&](Module& module) {
    Controller* channel = module.getProperty(id);
    // Kept: vector channels are written even where they are locked.
    bool const writable =
        channel && (channel->isKindOf(&Vec3Controller::s_classVec3Controller) || channel->isEditable());
    if (writable) write.applyTo(*channel);
    return true;
  });
}

bool SetPropertyCmd::execute(Given const& given, Args const& args, Variable&) {
  GivenOptions const options(given);
  Candidates candidates;
  if (!candidates.read(given, kCandidates)) return false;
  ChannelName const property = channelNameFrom(args[0].getStringValue(-1), Suffix::anyCut);
  unsigned const id = Controller::mapPropertyName(property.name);
  DataSource::PropertyType const kind = Controller::mapToPropertyType(id);
  Change const change = {property.component, options.has(kRelative)};
  if (kind == DataSource::NoProperty) return setAttributes(candidates, property.name, args, change);

  ChannelWrite write = {options.has(kConst) || options.has(kDefault), change, {}};
  return readChannelValue(args, kind, write) && writeChannels(candidates, id, kind, write);
}

}  // namespace

Command* newSetPropertyCmd() { return new (std::nothrow) SetPropertyCmd; }
