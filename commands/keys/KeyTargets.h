// What the key commands share: the channel and components that they work on.
#pragma once

#include "host/command/ChannelName.h"
#include "host/command/Results.h"
#include "host/command/Targets.h"
#include "host/scene/Controller.h"

// --- one channel by name: "-onMod", else the primary selection, and a channel name ---

struct ChannelComponents {
  Controller const* channel = nullptr;
  unsigned mask = KeyTrack::kAll;
};

struct KeyQueryTexts {
  char const* noKeys;                 // with no active clip
  char const* badPath = kNoModuleAt;  // its %s is the path
};

// Whether keys can be listed. With no active clip logs `texts.noKeys` as a warning.
bool hasKeysToList(KeyQueryTexts const& texts);
// The channel that the name means on the module of the last "-onMod", every one of which must name a module,
// else on the primary selected one. Null, with a message, when there is none. The module owns the channel.
ChannelComponents channelNamed(HString const& name, Given const& given, int onMod,
                               KeyQueryTexts const& texts);

// Returns work(channel, mask) for the channel that a query is about. On the base clip it succeeds without a
// result.
template <class Work>
bool queryKeys(Args const& args, Given const& given, int onMod, KeyQueryTexts const& texts, Work work) {
  if (!hasKeysToList(texts)) return true;
  ChannelComponents const target = channelNamed(args[0].getStringValue(-1), given, onMod, texts);
  return target.channel && work(*target.channel, target.mask);
}

// The frames of those keys of the channel that wanted(key, mask) accepts, as an integer array, in order of
// time.
Variable framesOf(Controller const& channel, unsigned mask,
                  bool (*wanted)(KeyTrack::Key const&, unsigned mask));

inline bool isOneValued(Controller const& channel) {
  return Controller::shapeOf(channel.getPropertyType()) == KeyTrack::Shape::Scalar;
}

// --- active properties ---

// The mask on which keys of an active property are worked on: one component or all. 0: none, since two
// components are never worked on together.
unsigned componentMask(unsigned id);
