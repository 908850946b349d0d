#include "commands/keys/KeyClipboard.h"
#include "commands/keys/KeyTargets.h"
#include "host/command/Frames.h"
#include "host/scene/DataEdit.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

namespace {

class PasteKeysCmd final : public ScriptCommand<PasteKeysCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "pasteKeys",
      .displayName = "Paste Keys",
      .category = "Data Editing",
      .purpose =
          "Writes the keys on the clipboard to the selected module, from the current time or a frame on.",
      .example = "pasteKeys -useFrame 100",
      .argsText =
          "Needs exactly one selected module and one active channel of the kind that was copied. Writes into "
          "the active layer. Keys between the pasted ones stay; the message counts one key less.",
      .options = {{"useFrame", "frame of the first pasted key; default the current time", 1, Variable::Int}}};

  bool execute(Given const& given, Args const&, Variable&) override;
};

// Angles that the record does not hold stay as the layer has them.
TalixRotation rotationOf(ClipboardManager::tagKey const& record, RotController const& channel, int64 time) {
  TalixRotation::RotOrder const order = g_db->getClipboardManager()->getRotationOrder();
  TalixRotation rotation;
  Vec3 angles(record.x, record.y, record.z);
  if (record.components != KeyTrack::kAll) {
    Controller::Values values;
    channel.evaluateLayer(time, values);
    rotation.setQuaternion(values.data());
    Vec3 present;
    rotation.getAsEuler(order, present);
    for (int i = 0; i < 3; ++i)
      if (!(record.components >> i & 1)) angles[i] = present[i];
  }
  rotation.setAsEuler(order, angles);
  return rotation;
}

void paste(ClipboardManager::tagKey const& record, Controller& channel, int64 time) {
  if (auto* rotations = objectAs<RotController>(&channel)) {
    if (record.components) rotations->setKey(time, rotationOf(record, *rotations, time), KeyTrack::kAll);
    return;
  }
  unsigned const mask = record.components & (isOneValued(channel) ? 1 : KeyTrack::kAll);
  if (mask) channel.writeKeyAt(time, {record.x, record.y, record.z}, mask);
}

// The data that goes on from record to record does so from key to key, keys that were there before included.
void pasteBridges(ClipboardManager const& clipboard, Controller& channel, int64 shift) {
  bool const split = channel.getPropertyType() == DataSource::Vec3Property;
  for (unsigned const part : {1u, 2u, 4u}) {
    if (!split && part != 1) break;
    unsigned const mask = split ? part : KeyTrack::kAll;
    int64 start = 0;
    bool goesOn = false;
    for (int i = 0; i < clipboard.getNumControllerKeys(); ++i) {
      ClipboardManager::tagKey const record = clipboard.getControllerKey(i);
      if (!(record.components & mask)) continue;
      bool const bridges = (record.bridges & mask) != 0;
      if (goesOn && !bridges) channel.bridgeKeys(HTimeRange(start, record.time + shift - 1), mask);
      if (!goesOn && bridges) start = record.time + shift;
      goesOn = bridges;
    }
  }
}

// All keys, the first of them at `time`. False, with a message, when they reach beyond the time line.
bool pasteAll(ClipboardManager const& clipboard, Controller& channel, int64 time) {
  HTimeRange const source = clipboard.getControllerDataRange();
  int64 const length = source.getEnd() - source.getStart();
  if (length > kForever - time) {
    Command::logError("The pasted keys would lie beyond the time line.");
    return false;
  }
  DataEdit const edit(channel, HTimeRange(time, time + length));
  for (int i = 0; i < clipboard.getNumControllerKeys(); ++i) {
    ClipboardManager::tagKey const record = clipboard.getControllerKey(i);
    paste(record, channel, time + (record.time - source.getStart()));
  }
  pasteBridges(clipboard, channel, time - source.getStart());
  return true;
}

bool PasteKeysCmd::execute(Given const& given, Args const&, Variable&) {
  // Step 1: one module, some channel.
  if (g_db->getNumSelectedModules() != 1) {
    logWarning("Can only paste onto one selected module");
    return true;
  }
  if (g_db->getNumActiveProperties() == 0) {
    logWarning("Must have at least one channel selected");
    return true;
  }

  // Step 2: where to.
  CommandOption const* frame = GivenOptions(given).find(info.option("useFrame"));
  auto const time = frame ? timeOfWholeFrame(frame->getArg(0).getIntValue(-1))
                          : std::optional(HTimeManager::getInstance()->getTime());
  if (!time) return false;

  // Step 3: one channel that takes these keys.
  if (!nameOneChannel()) {
    logWarning("Can only paste onto one set of keys");
    return true;
  }
  Controller* channel = activeChannel();
  if (!channel || !channel->isEditable()) {
    logWarning("Controller is not editable");
    return true;
  }
  ClipboardManager const& clipboard = *g_db->getClipboardManager();
  if (!clipboard.isEmpty() && clipboard.getControllerDataType() != clipboardTypeOf(channel)) {
    logError("Channel data types don't match between copyKeys/pasteKeys");
    return false;
  }

  // Step 4: the keys.
  int const count = clipboard.getNumControllerKeys();
  if (count == 0) {
    logInfo("Pasted 0 keys");
    return true;
  }
  if (!pasteAll(clipboard, *channel, *time)) return false;
  logInfo("Pasted %d keys from the clipboard", count - 1);  // kept: one less than were pasted
  return true;
}

}  // namespace

Command* newPasteKeysCmd() { return new (std::nothrow) PasteKeysCmd; }
