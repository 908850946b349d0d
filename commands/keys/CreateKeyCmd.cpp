#include "host/command/ChannelName.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

namespace {

class CreateKeyCmd final : public ScriptCommand<CreateKeyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "createKey",
      .displayName = "Create Key",
      .category = "Data Editing",
      .purpose =
          "Keys every active channel of the selected modules at the current "
          "time, with the values they have there.",
      .example = "createKey",
      .argsText =
          "In the active layer of the active clip. New keys are whole and become selected. A channel that "
          "has a key there, or is locked, is passed over; with no active channel nothing happens."};

  bool execute(Given const&, Args const&, Variable&) override;
};

// The components that an active property selects: all when it names all, else the first that it names.
unsigned selectedMask(unsigned id) {
  unsigned const bits = markedComponents(id);
  return bits == 7 ? bits : bits & ~(bits - 1);
}

// The key is whole; it is left selected on the mask.
void keyAt(Controller& channel, int64 time, unsigned mask) {
  HTimeRange const range(time - 1, time + 1);
  DataEdit const edit(channel, range);
  Controller::Values value;
  channel.evaluateLayer(time, value);  // so that all layers together stay as they are
  channel.writeKeyAt(time, value, 7);
  channel.selectKeys(range, mask);
}

bool CreateKeyCmd::execute(Given const&, Args const&, Variable&) {
  int64 const now = HTimeManager::getInstance()->getTime();
  for (int i = 0; i < g_db->getNumSelectedModules(); ++i) {
    for (int k = 0; k < g_db->getNumActiveProperties(); ++k) {
      unsigned const id = g_db->getActiveProperty(k), mask = selectedMask(id);
      Controller* channel = g_db->getSelectedModule(i)->getProperty(id);
      if (mask && channel && channel->isEditable() && !channel->hasKeyAt(now)) keyAt(*channel, now, mask);
    }
  }
  return true;
}

}  // namespace

Command* newCreateKeyCmd() { return new (std::nothrow) CreateKeyCmd; }
