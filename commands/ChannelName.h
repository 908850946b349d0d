// A channel's name as scripts give it, with the component that a suffix picks.
#pragma once

#include "host/base/HString.h"

struct ChannelName {
  HString name;        // without the suffix
  int component = -1;  // 0 x, 1 y, 2 z; -1: the whole channel

  // 1 x, 2 y, 4 z, 7 all.
  unsigned mask() const { return component < 0 ? 7u : 1u << component; }
};

// What becomes of a suffix that is no component differs between the commands.
enum class Suffix {
  anyCut,        // whatever follows the last dot is cut, unless the dot ends the text
  componentCut,  // only .x .y .z (either case) are cut
  allCut,        // whatever follows the last dot is cut; only .x .y .z are components
};

// The text goes through Controller::fixChannelStr first.
ChannelName channelNameFrom(HString text, Suffix suffix);
