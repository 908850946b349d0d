#include "commands/properties/ChannelWriting.h"

#include "host/command/Angles.h"
#include "host/scene/DataEdit.h"

namespace {

TalixRotation changedRotation(RotController const& channel, TalixRotation const& current,
                              ChannelWrite const& write) {
  return changed(current, write.value.vector, write.change, rotationOrderOf(*channel.getModule()));
}

// --- the default value: false when it cannot be held ---

bool writeDefault(Vec3Controller& channel, ChannelWrite const& write) {
  return channel.setConstValue(changed(channel.getConstValue(), write.value.vector, write.change), true,
                               false);
}

bool writeDefault(RotController& channel, ChannelWrite const& write) {
  channel.setConstValue(changedRotation(channel, channel.getConstValue(), write), true);
  return true;
}

bool writeDefault(FloatController& channel, ChannelWrite const& write) {
  double const value = changed(channel.getConstValue(), write.value.number, write.change.relative);
  if (canBeHeld(value)) channel.setConstValue(value, true);
  return canBeHeld(value);
}

bool writeDefault(IntController& channel, ChannelWrite const& write) {
  int64 const value = changed(channel.getConstValue(), write.value.integer, write.change.relative);
  if (canBeHeld(value)) channel.setConstValue(static_cast<int>(value), true);
  return canBeHeld(value);
}

bool writeDefault(BoolController& channel, ChannelWrite const& write) {
  channel.setConstValue(changed(channel.getConstValue(), write.value.state), true);
  return true;
}

// --- the i-th selected key: false when the value cannot be held ---

// A component that the key lacks counts with what it is there between its own keys.
bool writeKey(Vec3Controller& channel, int i, ChannelWrite const& write) {
  int const key = channel.getSelectedKeyIndex(i);
  Vec3 value = write.value.vector;
  if (write.change.relative)
    value = changed(Vec3(layerValue(channel, channel.getKeyTime(key)).data()), value, write.change);
  if (!canBeHeld(value)) return false;
  int const component = write.change.component;
  if (component >= 0)
    channel.setKeyComponentValue(key, value[component], 1u << component);
  else
    channel.setKeyValue(key, value, 7);
  return true;
}

// Kept: a component goes to the first keys by position, one for each selected key, not to the selected ones.
bool writeKey(RotController& channel, int i, ChannelWrite const& write) {
  int const key = write.change.component >= 0 ? i : channel.getSelectedKeyIndex(i);
  channel.setKeyValue(key, changedRotation(channel, channel.getKeyValue(key), write), 7);
  return true;
}

bool writeKey(FloatController& channel, int i, ChannelWrite const& write) {
  int const key = channel.getSelectedKeyIndex(i);
  double const value = changed(channel.getKeyValue(key), write.value.number, write.change.relative);
  if (canBeHeld(value)) channel.setKeyValue(key, value, 1);
  return canBeHeld(value);
}

bool writeKey(IntController& channel, int i, ChannelWrite const& write) {
  int const key = channel.getSelectedKeyIndex(i);
  int64 const value = changed(channel.getKeyValue(key), write.value.integer, write.change.relative);
  if (canBeHeld(value)) channel.setKeyValue(key, static_cast<int>(value), 1);
  return canBeHeld(value);
}

bool writeKey(BoolController& channel, int i, ChannelWrite const& write) {
  int const key = channel.getSelectedKeyIndex(i);
  channel.setKeyValue(key, changed(channel.getKeyValue(key), write.value.state), 1);
  return true;
}

}  // namespace

void ChannelWrite::applyTo(Controller& channel) const {
  int left = 0;
  if (byDefault) {
    DataEdit const edit = DataEdit::ofDefault(channel);
    withKind(channel, [&](auto& typed) { left += !writeDefault(typed, *this); });
  } else {
    DataEdit const edit(channel, channel.getKeyRange());
    withKind(channel, [&](auto& typed) {
      for (int i = 0; i < typed.getNumSelectedKeys(); ++i) left += !writeKey(typed, i, *this);
    });
  }
  // Kept: writing channels reports no failure.
  if (left > 0)
    Command::logWarning("%d values of %s on %s stay as they are: the new ones would be too large.", left,
                        channel.getName().GetStr(), channel.getModule()->getName().GetStr());
}
