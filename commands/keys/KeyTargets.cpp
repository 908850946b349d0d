#include "commands/keys/KeyTargets.h"

#include <climits>

#include "host/scene/HTimeManager.h"

bool hasKeysToList(KeyQueryTexts const& texts) {
  if (g_db->getActiveClip()) return true;
  Command::logWarning("%s", texts.noKeys);
  return false;
}

ChannelComponents channelNamed(HString const& name, Given const& given, int onMod,
                               KeyQueryTexts const& texts) {
  Module const* module = onModOrPrimary(given, onMod, texts.badPath, "No primary selected Module.");
  if (!module) return {};
  ChannelName const wanted = channelNameFrom(name, Suffix::componentCut);
  Controller const* channel = module->getProperty(wanted.name);
  if (!channel)
    Command::logError("Cannot find property named %s on module %s", name.GetStr(),
                      module->getName().GetStr());
  return {channel, wanted.mask()};
}

Variable framesOf(Controller const& channel, unsigned mask,
                  bool (*wanted)(KeyTrack::Key const&, unsigned mask)) {
  TSimpleArray<int> frames(0, 64);
  int beyond = 0;
  HTimeManager const* time = HTimeManager::getInstance();
  if (KeyTrack const* track = channel.findActiveTrack())
    track->forEach(0, track->count(), [&](KeyTrack::Key const& key) {
      if (!wanted(key, mask)) return;
      int64 const frame = key.time / time->getTicksPerFrame();
      frame >= INT_MIN&& frame <= INT_MAX ? frames.add(static_cast<int>(frame)) : static_cast<void>(++beyond);
    });
  if (beyond > 0)
    Command::logWarning("%d keys are not listed: their frames are beyond the range of integers.", beyond);
  Variable list(Variable::IntArray, frames.getCount());
  for (int i = 0; i < frames.getCount(); ++i) list.setValue(frames[i], i);
  return list;
}

unsigned componentMask(unsigned id) {
  unsigned const marked = markedComponents(id);
  return marked == 3 || marked == 5 || marked == 6 ? 0 : marked;
}
