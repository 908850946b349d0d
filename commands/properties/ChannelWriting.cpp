#include "commands/properties/ChannelWriting.h"

#include "commands/Angles.h"
#include "host/scene/DataEdit.h"

namespace {

TalixRotation changedRotation(RotController const& channel, TalixRotation const& current,
                              ChannelWrite const& write) {
  return changed(current, write.value.vector, write.change, rotationOrderOf(*channel.getModule()));
}

// --- the default value ---

void writeDefault(Vec3Controller& channel, ChannelWrite const& write) {
  channel.setConstValue(changed(channel.getConstValue(), write.value.vector, write.change), true, false);
}

void writeDefault(RotController& channel, ChannelWrite const& write) {
  channel.setConstValue(changedRotation(channel, channel.getConstValue(), write), true);
}

void writeDefault(FloatController& channel, ChannelWrite const& write) {
  channel.setConstValue(changed(channel.getConstValue(), write.value.number, write.change.relative), true);
}

void writeDefault(IntController& channel, ChannelWrite const& write) {
  channel.setConstValue(changed(channel.getConstValue(), write.value.integer, write.change.relative), true);
}

void writeDefault(BoolController& channel, ChannelWrite const& write) {
  channel.setConstValue(changed(channel.getConstValue(), write.value.state), true);
}

// --- the i-th selected key ---

// A component that the key lacks counts with what it is there between its own keys.
void writeKey(Vec3Controller& channel, int i, ChannelWrite const& write) {
  const int key = channel.getSelectedKeyIndex(i);
  Vec3 value = write.value.vector;
  if (write.change.relative)
    value = changed(Vec3(layerValue(channel, channel.getKeyTime(key)).data()), value, write.change);
  const int component = write.change.component;
  if (component >= 0)
    channel.setKeyComponentValue(key, value[component], 1u << component);
  else
    channel.setKeyValue(key, value, 7);
}

// Kept: a component goes to the first keys by position, one for each selected key, not to the selected ones.
void writeKey(RotController& channel, int i, ChannelWrite const& write) {
  const int key = write.change.component >= 0 ? i : channel.getSelectedKeyIndex(i);
  channel.setKeyValue(key, changedRotation(channel, channel.getKeyValue(key), write), 7);
}

void writeKey(FloatController& channel, int i, ChannelWrite const& write) {
  const int key = channel.getSelectedKeyIndex(i);
  channel.setKeyValue(key, changed(channel.getKeyValue(key), write.value.number, write.change.relative), 1);
}

void writeKey(IntController& channel, int i, ChannelWrite const& write) {
  const int key = channel.getSelectedKeyIndex(i);
  channel.setKeyValue(key, changed(channel.getKeyValue(key), write.value.integer, write.change.relative), 1);
}

void writeKey(BoolController& channel, int i, ChannelWrite const& write) {
  const int key = channel.getSelectedKeyIndex(i);
  channel.setKeyValue(key, changed(channel.getKeyValue(key), write.value.state), 1);
}

}  // namespace

void ChannelWrite::applyTo(Controller& channel) const {
  if (byDefault) {
    const DataEdit edit = DataEdit::ofDefault(channel);
    withKind(channel, [&](auto& typed) { writeDefault(typed, *this); });
  } else {
    const DataEdit edit(channel, channel.getKeyRange());
    withKind(channel, [&](auto& typed) {
      for (int i = 0; i < typed.getNumSelectedKeys(); ++i) writeKey(typed, i, *this);
    });
  }
}
