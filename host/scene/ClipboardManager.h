// The key clipboard. One that was never filled fits every channel and holds no keys.
#pragma once

#include <memory>
#include <vector>

#include "host/base/ItemAt.h"
#include "host/math/TalixRotation.h"
#include "host/time/HTimeRange.h"

class ClipboardManager {
 public:
  enum ClipboardDataType { NoData = 0, ModuleData = 1, ControllerData = 2 };
  enum ControllerDataType { OtherKeys = 0, FloatKeys = 1, Vec3Keys = 2, RotKeys = 3, BoolKeys = 4 };

  struct tagKey {
    int64 time = 0;  // ticks
    double x = 0, y = 0,
           z = 0;             // one-valued channels use x; rotations are Euler radians in the source's order
    unsigned components = 0;  // 1 x, 2 y, 4 z
    unsigned flags = 0;       // the key's own, as its channel reports them
    unsigned bridges = 0;     // components whose data goes on to the next record that has them
  };

  // What is added until finishClipboardCopy replaces the content; keep: false takes the copy back. order: the
  // source's, in which the angles of rotations are given.
  void startClipboardCopy(ClipboardDataType data, ControllerDataType type,
                          TalixRotation::RotOrder order = TalixRotation::XYZ);
  void addKey(tagKey key) { m_incoming.push_back(key); }
  void finishClipboardCopy(bool keep);

  bool isEmpty() const { return !m_filled; }
  ControllerDataType getControllerDataType() const { return m_type; }
  TalixRotation::RotOrder getRotationOrder() const { return m_order; }
  int getNumControllerKeys() const { return m_keys ? static_cast<int>(m_keys->size()) : 0; }
  tagKey getControllerKey(int i) const { return m_keys ? itemAt(*m_keys, i) : tagKey(); }
  // From the earliest to the latest key; empty without keys.
  HTimeRange getControllerDataRange() const;

 private:
  std::shared_ptr<std::vector<tagKey> const> m_keys;  // null: none; shared by copies, which cost nothing
  std::vector<tagKey> m_incoming;
  ControllerDataType m_type = OtherKeys, m_incomingType = OtherKeys;
  TalixRotation::RotOrder m_order = TalixRotation::XYZ, m_incomingOrder = TalixRotation::XYZ;
  bool m_filled = false;
};
