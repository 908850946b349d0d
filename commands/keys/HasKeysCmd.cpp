#include "commands/keys/KeyTargets.h"
#include "host/command/Frames.h"
#include "host/scene/HTimeManager.h"

namespace {

class HasKeysCmd final : public ScriptCommand<HasKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "hasKey",
      .displayName = "Has Key",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Tells whether a channel has a key at the current time, at a frame, or anywhere.",
      .example = "hasKey LFHD Translation -frame 10 -selected",
      .args = {"\"moduleName\" \"propertyName\"", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "moduleName is a path, propertyName a channel, or a component of one that the key must hold. In "
          "the active layer; without an option at the current time.",
      .options = {{"selected", "the key must be selected too", 0, Variable::None, 8},
                  {"seconds", "a number of frames, not seconds, from the start of the animation range", 1,
                   Variable::Int, 12},
                  {"frame", "the frame to look at; default the current time", 1, Variable::Int, 10},
                  {"allTime",
                   "at any time; without -any only keys a whole number of frames after the first one count",
                   0, Variable::None, 6},
                  {"any", "a key on any component will do"}},
      .returns = Variable::Bool,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;

 private:
  static bool timeAsked(Given const& given, int64& time);
};

// The current time, or that of the last "-frame" or "-seconds". False, with a message, beyond the time line.
bool HasKeysCmd::timeAsked(Given const& given, int64& time) {
  HTimeManager const* manager = HTimeManager::getInstance();
  time = manager->getTime();
  for (CommandOption const& option : given) {
    // kept: "-seconds" counts frames as well, from where the animation range begins.
    bool const isFrame = option.getIndex() == info.option("frame");
    if (!isFrame && option.getIndex() != info.option("seconds")) continue;
    int64 const start = manager->getAnimRange().getStart();
    int64 const origin = isFrame ? 0 : manager->frameTime(start, HTimeManager::RoundDown, 0);
    auto const asked = timeOfWholeFrame(option.getArg(0).getIntValue(-1), origin);
    if (!asked) return false;
    time = *asked;
  }
  return true;
}

// Whether one of the keys, at whole frames from the first one on, holds the components.
bool hasKeyOnFrames(KeyTrack const* track, unsigned mask, bool selected) {
  if (!track || track->empty()) return false;
  int64 const ticks = HTimeManager::getInstance()->getTicksPerFrame(), start = track->timeAt(0);
  KeyTrack::Reader keys(*track, 0);
  for (int64 left = track->count(); left > 0; --left) {
    KeyTrack::Key const key = keys.next();
    if ((key.components & mask) == mask && (!selected || key.selected & mask) &&
        (key.time - start) % ticks == 0)
      return true;
  }
  return false;
}

bool HasKeysCmd::execute(Given const& given, Args const& args, Variable& result) {
  // Step 1: the time.
  int64 time = 0;
  if (!timeAsked(given, time)) return false;

  // Step 2: the channel.
  Module const* module = moduleAt(args[0].getStringValue(-1),
                                  "%s  is not a valid unique path to a Module in the scene.");  // kept
  if (!module) return false;
  ChannelName const wanted = channelNameFrom(args[1].getStringValue(-1), Suffix::allCut);
  Controller const* channel = module->getProperty(wanted.name);
  if (!channel) {
    // kept: the module's name stands in the channel's place.
    Command::logError("Channel \"%s\" not found on module %s", module->getName().GetStr(),
                      wanted.name.GetStr());
    return false;
  }

  // Step 3: its keys.
  GivenOptions const options(given);
  bool const selected = options.has(info.option("selected")), any = options.has(info.option("any"));
  unsigned const mask = wanted.mask();
  if (!options.has(info.option("allTime"))) {
    if (any)
      return answer(result,
                    selected ? channel->isKeySelectedAt(time, KeyTrack::kAll) : channel->hasKeyAt(time));
    return answer(result,
                  channel->hasKeyAt(time, mask) && (!selected || channel->isKeySelectedAt(time, mask)));
  }
  if (!any) return answer(result, hasKeyOnFrames(channel->findActiveTrack(), mask, selected));
  if (selected) return answer(result, channel->getNumSelectedKeys(mask) > 0);
  return answer(result, (mask == KeyTrack::kAll ? channel->getNumKeys() : channel->getNumKeys(mask)) > 0);
}

}  // namespace

Command* newHasKeysCmd() { return new (std::nothrow) HasKeysCmd; }
