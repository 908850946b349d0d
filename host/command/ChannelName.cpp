#include "host/command/ChannelName.h"

#include "host/command/Command.h"
#include "host/scene/Controller.h"

namespace {

// The component that a suffix's first letter names, -1 for other letters.
int componentOf(char letter) {
  int const component = (letter | 0x20) - 'x';
  return component >= 0 && component <= 2 ? component : -1;
}

}  // namespace

ChannelName channelNameFrom(HString text, Suffix suffix) {
  Controller::fixChannelStr(text);
  int const dot = text.ReverseFind('.'), last = text.GetLength() - 1;
  if (dot < 0 || (dot == last && suffix != Suffix::allCut)) return {text, -1};
  bool const isLetter = dot + 1 == last;
  int const component = isLetter || suffix == Suffix::anyCut ? componentOf(text[dot + 1]) : -1;
  if (suffix == Suffix::componentCut && component < 0) return {text, -1};
  return {text.Left(static_cast<uint64>(dot)), component};
}

std::optional<ChannelChoice> channelChoiceFrom(HString const& text) {
  ChannelName channel{text};
  Controller::fixChannelStr(channel.name);
  unsigned id = Controller::mapPropertyName(channel.name);
  if (id == 0) {
    channel = channelNameFrom(text, Suffix::componentCut);
    id = Controller::mapPropertyName(channel.name);
  }
  if (id == 0) {
    Command::logError("Unknown property type: %s", text.GetStr());
    return {};
  }
  if (channel.component >= 0 && !hasComponents(Controller::mapToPropertyType(id))) {
    Command::logError("%s has no components.", channel.name.GetStr());
    return {};
  }
  return ChannelChoice{id, channel.mask()};
}
