// Objects in order: the i-th one, appending and removing cost at most logarithmic time, however many there
// are.
//
// Each object remembers its slot in a member that the list is told of, so an object can stand in several
// lists. Removing leaves a hole; a Fenwick tree counts what lies before a slot, and the list closes its holes
// when they outnumber the objects. Removing never fails: without memory for the tree the list only gets
// slower.
#pragma once

#include <algorithm>
#include <bit>
#include <new>
#include <vector>

#include "host/base/Types.h"

inline constexpr uint32 kNoSlot = 0xffffffff;

template <class T, auto Slot>
class OrderedList {
 public:
  int getCount() const { return m_count; }
  static bool contains(T const* object) { return object->*Slot != kNoSlot; }

  // The i-th object; null beyond them.
  T* at(int64 i) const {
    if (i < 0 || i >= m_count) return nullptr;
    return m_objects[holes() == 0 ? static_cast<size_t>(i) : slotOf(static_cast<int>(i))];
  }
  // How many objects stand before this one.
  int indexOf(T const* object) const { return countBefore(object->*Slot); }

  // On an exception the list is as before.
  void append(T* object) {
    m_objects.push_back(object);
    try {
      if (!m_sums.empty()) appendSum();
    } catch (...) {
      m_objects.pop_back();
      throw;
    }
    object->*Slot = static_cast<uint32>(m_objects.size() - 1);
    ++m_count;
  }

  // Nothing when the object is not in the list.
  void remove(T* object) noexcept {
    if (!contains(object)) return;
    uint32 const slot = object->*Slot;
    object->*Slot = kNoSlot;
    --m_count;
    if (slot + 1 == m_objects.size()) {
      m_objects.pop_back();
      if (!m_sums.empty()) m_sums.pop_back();
    } else {
      if (m_sums.empty()) buildSums();
      m_objects[slot] = nullptr;
      for (size_t i = slot + 1; i < m_sums.size(); i += i & -i) --m_sums[i];
    }
    if (m_count == 0) return clear();
    if (holes() > 32 && holes() > m_count) closeHoles();
  }

  // The objects in order.
  std::vector<T*> toVector() const {
    std::vector<T*> all;
    all.reserve(static_cast<size_t>(m_count));
    for (T* object : m_objects)
      if (object) all.push_back(object);
    return all;
  }
  template <class Less>
  void sort(Less less) noexcept {
    closeHoles();
    std::sort(m_objects.begin(), m_objects.end(), less);
    for (size_t i = 0; i < m_objects.size(); ++i) m_objects[i]->*Slot = static_cast<uint32>(i);
  }
  void clear() noexcept {
    for (T* object : m_objects)
      if (object) object->*Slot = kNoSlot;
    m_objects.clear();
    m_sums.clear();
    m_count = 0;
  }

 private:
  int holes() const { return static_cast<int>(m_objects.size()) - m_count; }

  void closeHoles() noexcept {
    size_t to = 0;
    for (T* object : m_objects) {
      if (!object) continue;
      object->*Slot = static_cast<uint32>(to);
      m_objects[to++] = object;
    }
    m_objects.resize(to);
    m_sums.clear();
  }

  // Fenwick tree from 1: m_sums[i] counts the objects in the (i & -i) slots up to slot i - 1. Made at the
  // first hole: most lists never have one. Without memory there is none.
  void buildSums() noexcept {
    try {
      m_sums.reserve(m_objects.size() + 1);
    } catch (std::bad_alloc const&) {
      return;
    }
    m_sums.assign(1, 0);
    for (size_t i = 0; i < m_objects.size(); ++i) appendSum();
  }
  void appendSum() {
    size_t const i = m_sums.size();
    int sum = m_objects[i - 1] ? 1 : 0;
    for (size_t k = 1; k < (i & -i); k *= 2) sum += m_sums[i - k];
    m_sums.push_back(sum);
  }
  int countBefore(uint32 slot) const {
    if (holes() == 0) return static_cast<int>(slot);
    int sum = 0;
    if (m_sums.empty()) {
      for (size_t i = 0; i < slot; ++i) sum += m_objects[i] ? 1 : 0;
      return sum;
    }
    for (size_t i = slot; i > 0; i -= i & -i) sum += m_sums[i];
    return sum;
  }
  size_t slotOf(int index) const {
    size_t slot = 0;
    if (m_sums.empty()) {
      while (!m_objects[slot] || index-- > 0) ++slot;
      return slot;
    }
    for (size_t step = std::bit_floor(m_sums.size()); step > 0; step /= 2) {
      if (slot + step < m_sums.size() && m_sums[slot + step] <= index) {
        slot += step;
        index -= m_sums[slot];
      }
    }
    return slot;
  }

  std::vector<T*> m_objects;
  std::vector<int> m_sums;
  int m_count = 0;
};
