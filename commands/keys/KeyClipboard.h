// What copying and pasting keys share: the one channel that the active properties name.
#pragma once

#include "host/scene/ClipboardManager.h"
#include "host/scene/Controller.h"

// Whether all active properties, of which there is at least one, name the same channel, whatever components
// they mark.
bool nameOneChannel();
// The channel of the first active property on the primary selected module; null when that lacks it.
Controller* activeChannel();

// OtherKeys without a channel.
ClipboardManager::ControllerDataType clipboardTypeOf(Controller const* channel);
