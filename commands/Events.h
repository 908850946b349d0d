// Events of the plug-in: they tell views to read again, and hold no data. At most one of each waits in the
// queue.
#pragma once

#include "host/services/HEvent.h"

// Attribute views drop what the user typed and read the values again.
class HReloadAttributesEvent final : public HDontSubmitIfAnotherQueuedEvent {
 public:
  std::unique_ptr<HEvent> clone() const override { return std::make_unique<HReloadAttributesEvent>(); }
};

// Channel views read the keys and their selection again.
class HControllerSelectionChangedEvent final : public HDontSubmitIfAnotherQueuedEvent {
 public:
  std::unique_ptr<HEvent> clone() const override {
    return std::make_unique<HControllerSelectionChangedEvent>();
  }
};

// Views draw the connecting lines of nodes anew.
class HConnectionLinesChangedEvent final : public HDontSubmitIfAnotherQueuedEvent {
 public:
  std::unique_ptr<HEvent> clone() const override { return std::make_unique<HConnectionLinesChangedEvent>(); }
};
