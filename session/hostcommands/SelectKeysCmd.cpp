#include "host/command/ChannelName.h"
#include "host/command/Frames.h"
#include "host/command/Targets.h"

namespace talix {

namespace {

// Which keys of a module: those in a range, of a channel, of the active properties, or of all channels.
class SelectKeysCmd final : public ScriptCommand<SelectKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "selectKeys",
      .displayName = "Select Keys",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Selects keys of a channel, else of the active channels, else of all, or deselects them.",
      .example = "selectKeys Translation -frames 0 10 -onMod LFHD",
      .args = {"[CHANNEL[.x]]", 0, 1, {Variable::String}},
      .argsText =
          "A channel, whole or by component; without it the active channels, and where none are, all "
          "channels. On the selected modules, in the active layer. Their former selected keys, on all "
          "channels, are deselected.",
      .options = {
          {"frames", "first and last frame, both included; default all time", 2, Variable::Float, 0b0010},
          {"all", "all channels, whatever is active", 0, Variable::None, 0b0101},
          {"none", "deselects these keys instead, and leaves the others", 0, Variable::None, 0b1010},
          {"add", "keeps the keys that were selected", 0, Variable::None, 0b0100},
          {"onMod", "path of the one module instead of the selected ones", 1, Variable::String}}};
  static constexpr int kFrames = info.option("frames"), kAll = info.option("all"),
                       kNone = info.option("none"), kAdd = info.option("add"), kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const& args, Variable&) override {
    GivenOptions const options(given);
    std::vector<ChannelChoice> channels;
    if (!chooseChannels(args, options.has(kAll), channels)) return false;
    HTimeRange range = HTimeRange::forever();
    if (CommandOption const* frames = options.find(kFrames)) {
      auto const chosen =
          rangeOfFrames(frames->getArg(0).getFloatValue(-1), frames->getArg(1).getFloatValue(-1));
      if (!chosen) return false;
      range = *chosen;
    }
    std::vector<Module*> modules;
    if (!chooseModules(options, modules)) return false;
    if (args.getCount() > 0 && !checkChannel(modules, channels.front(), args[0].getStringValue(-1)))
      return false;
    if (!g_db->getActiveClip()) {
      logWarning("No keys on Base Clip");
      return true;
    }
    Selecting selecting{channels, range, options.has(kNone), options.has(kAdd)};
    for (Module* module : modules) selecting.workOn(*module);
    logInfo("%s %d keys on %d channels", selecting.none ? "Deselected" : "Selected", selecting.keys,
            selecting.channels);
    return true;
  }

 private:
  // No channels mean all.
  static bool chooseChannels(Args const& args, bool all, std::vector<ChannelChoice>& channels) {
    if (args.getCount() > 0) {
      auto const channel = channelChoiceFrom(args[0].getStringValue(-1));
      if (channel) channels.push_back(*channel);
      return channel.has_value();
    }
    for (int i = 0; !all && i < g_db->getNumActiveProperties(); ++i)
      channels.push_back(ChannelChoice::of(g_db->getActiveProperty(i)));
    return true;
  }

  static bool chooseModules(GivenOptions const& options, std::vector<Module*>& modules) {
    if (options.has(kOnMod)) {
      modules.push_back(moduleAt(options.textOr(kOnMod, "")));
      return modules.front() != nullptr;
    }
    eachModule(Among::selected, [&](Module& module) { modules.push_back(&module); });
    if (modules.empty())
      logError(
          "Please select at least one Module or specify the module to be modified with the -onMod option.");
    return !modules.empty();
  }

  // Somebody must have the channel that was named.
  static bool checkChannel(std::vector<Module*> const& modules, ChannelChoice const& channel,
                           char const* name) {
    for (Module* module : modules)
      if (module->getProperty(channel.id)) return true;
    logError("Cannot find property named %s on module %s", name, modules.front()->getName().GetStr());
    return false;
  }

  // Works on one module after the other and counts what it touches.
  struct Selecting {
    std::vector<ChannelChoice> const& choices;  // none: all channels
    HTimeRange range;
    bool none, add;
    int keys = 0, channels = 0;

    void workOn(Module& module) {
      for (int i = 0; i < module.getNumChannels(); ++i) {
        Controller& channel = *module.getChannel(i);
        if (!none && !add) channel.deselectKeys(HTimeRange::forever(), 7);
        unsigned mask = choices.empty() ? 7 : 0;
        for (ChannelChoice const& choice : choices)
          if (choice.id == channel.getPropertyId()) mask |= choice.mask;
        if (mask == 0) continue;
        int const touched = none ? channel.deselectKeys(range, mask) : channel.selectKeys(range, mask);
        keys += touched;
        channels += touched > 0;
      }
    }
  };
};

}  // namespace

Command* newSelectKeysCmd() { return new SelectKeysCmd; }

}  // namespace talix
