// Channels as scripts name them, with the component that a suffix picks.
#pragma once

#include <optional>

#include "host/base/HString.h"
#include "host/scene/PropertyTable.h"

// --- a text taken apart ---

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

inline bool hasComponents(DataSource::PropertyType kind) {
  return kind == DataSource::Vec3Property || kind == DataSource::RotProperty;
}

// --- channels by id, as active properties name them ---

// The components that an active property marks: 1 x, 2 y, 4 z.
inline unsigned markedComponents(unsigned property) {
  return (property & PropertyTable::kWhole) / PropertyTable::kX;
}

struct ChannelChoice {
  unsigned id = 0;
  unsigned mask = 7;  // 1 x, 2 y, 4 z; 7: the whole channel

  static ChannelChoice of(unsigned property) {
    return {property & PropertyTable::kIdMask, markedComponents(property)};
  }
  unsigned property() const { return id | mask * PropertyTable::kX; }
};

// The channel of a name, whole or with a component, that the scene knows. Without one logs why.
std::optional<ChannelChoice> channelChoiceFrom(HString const& text);
