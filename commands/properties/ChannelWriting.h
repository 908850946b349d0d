// How setProperty writes one channel: its default value, or its selected keys.
#pragma once

#include "commands/ChannelValues.h"

struct ChannelWrite {
  bool byDefault = false;
  Change change;
  ChannelValue value;

  // Without a selected key nothing changes. Whether the channel may be edited is the caller's business.
  void applyTo(Controller& channel) const;
};
