// One array of a key leaf. Erasing moves the shorter side, so at the front an offset; growth doubles, up to a
// limit that a full leaf meets exactly.
#pragma once

#include <algorithm>
#include <cstring>
#include <memory>
#include <new>
#include <type_traits>

#include "host/base/Types.h"

template <class T>
class KeyColumn {
  static_assert(std::is_trivially_copyable_v<T>);

 public:
  KeyColumn() = default;
  KeyColumn(KeyColumn const& o) : KeyColumn(o, 0, o.m_size) {}
  KeyColumn(KeyColumn const& o, int from, int n) { insert(0, o.data() + from, n, n); }
  KeyColumn& operator=(KeyColumn&& o) noexcept = default;

  int size() const { return m_size; }
  bool empty() const { return m_size == 0; }
  T* data() { return m_data.get() + m_begin; }
  T const* data() const { return m_data.get() + m_begin; }
  T& operator[](int i) { return data()[i]; }
  T const& operator[](int i) const { return data()[i]; }
  int64 bytes() const { return static_cast<int64>(m_capacity) * static_cast<int64>(sizeof(T)); }

  void clear() {
    m_data.reset();
    m_begin = m_size = m_capacity = 0;
  }

  // Opens a gap of n elements at `at` and returns its start. The limit bounds the capacity.
  T* open(int at, int n, int limit) {
    if (at == 0 && m_begin >= n) {
      m_begin -= n;
    } else {
      if (m_begin + m_size + n > m_capacity) makeRoom(n, limit);
      move(data() + at + n, data() + at, m_size - at);
    }
    m_size += n;
    return data() + at;
  }

  void insert(int at, T const* from, int n, int limit) {
    if (n > 0) move(open(at, n, limit), from, n);
  }

  void erase(int from, int to) {
    if (from < m_size - to) {
      move(data() + to - from, data(), from);
      m_begin += to - from;
    } else {
      move(data() + from, data() + to, m_size - to);
    }
    m_size -= to - from;
    if (m_size < m_capacity / 4) shrink();
  }

  // Leaves n groups of `width` elements, by ascending position.
  void keep(int const* groups, int n, int width) {
    for (int i = 0; i < n; ++i) move(data() + i * width, data() + groups[i] * width, width);
    m_size = n * width;
  }

  // Gives back the room for more elements, if there is memory to do it with.
  void shrink() {
    if (m_size == m_capacity) return;
    if (m_size == 0) return clear();
    if (T* fresh = new (std::nothrow) T[static_cast<size_t>(m_size)]) adopt(fresh, m_size);
  }

 private:
  static void move(T* to, T const* from, int n) {
    if (n > 0) std::memmove(to, from, static_cast<size_t>(n) * sizeof(T));
  }

  void makeRoom(int n, int limit) {
    int const needed = m_size + n;
    if (needed <= m_capacity) {
      move(m_data.get(), data(), m_size);
      m_begin = 0;
      return;
    }
    reallocate(std::max(needed, std::min(m_size + m_size / 2, limit)));
  }

  void reallocate(int capacity) { adopt(new T[static_cast<size_t>(capacity)], capacity); }

  void adopt(T* fresh, int capacity) {
    move(fresh, data(), m_size);
    m_data.reset(fresh);
    m_begin = 0;
    m_capacity = capacity;
  }

  std::unique_ptr<T[]> m_data;
  int m_begin = 0;
  int m_size = 0;
  int m_capacity = 0;
};
