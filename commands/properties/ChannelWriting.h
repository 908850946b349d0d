// How setProperty writes one channel: its default value, or its selected keys.
#pragma once

#include "commands/ChannelValues.h"

struct ChannelWrite {
  bool byDefault = false;
  Change change;
  ChannelValue value;

  // Without a selected key nothing changes. Values that the channel cannot hold are not written, with a
  // warning. Whether the channel may be edited is the caller's business.
  void applyTo(Controller& channel) const;
};
