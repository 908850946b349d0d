// An edit of data: of the keys or the default value of a channel, or of all channels of a module. Edits may
// stand inside each other; whoever looks at the channel is told when the outermost ends, however it ends.
#pragma once

#include "host/scene/Module.h"

class DataEdit {
 public:
  // range: where keys may change, a hint. Of a module: the channels that it has now.
  explicit DataEdit(Controller& channel, HTimeRange const& range = HTimeRange::forever())
      : m_channel(&channel) {
    channel.beginDataEdit(range);
  }
  explicit DataEdit(Module& module, HTimeRange const& range = HTimeRange::forever()) : m_module(&module) {
    module.beginDataEdit(range);
  }
  static DataEdit ofDefault(Controller& channel) { return {channel, Default()}; }
  ~DataEdit() {
    if (m_channel) m_channel->endDataEdit();
    if (m_module) m_module->endDataEdit();
  }
  DataEdit(DataEdit const&) = delete;
  DataEdit& operator=(DataEdit const&) = delete;

  // Of a module: ends the edit and restores what was there when the outermost one began.
  void discard() {
    if (Module* module = std::exchange(m_module, nullptr)) module->discardDataEdit();
  }

 private:
  struct Default {};
  DataEdit(Controller& channel, Default) : m_channel(&channel) { channel.beginDefaultEdit(); }

  Controller* m_channel = nullptr;
  Module* m_module = nullptr;
};
