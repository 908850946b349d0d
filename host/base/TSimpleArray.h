// The host's growable array of plain values: the elements are copied bit by bit, it never shrinks, and it
// owns nothing that its elements point to.
#pragma once

#include <algorithm>
#include <new>
#include <type_traits>
#include <utility>

template <class T>
class TSimpleArray {
  static_assert(std::is_trivially_copyable_v<T>);

 public:
  TSimpleArray() = default;
  // Starts with room for `initial` elements and grows by `step` of them, by a quarter when it is large.
  TSimpleArray(int initial, int step) : growBy(step > 0 ? step : 1) {
    if (initial > 0) reserve(initial);
  }
  TSimpleArray(TSimpleArray const& o) : growBy(o.growBy) {
    if (o.count == 0) return;
    reserve(o.count);
    std::copy_n(o.data, o.count, data);
    count = o.count;
  }
  TSimpleArray(TSimpleArray&& o) noexcept { swap(o); }
  TSimpleArray& operator=(TSimpleArray o) noexcept { return swap(o), *this; }
  virtual ~TSimpleArray() { delete[] data; }

  int getCount() const { return count; }
  int getCapacity() const { return capacity; }
  T& operator[](int i) { return data[i]; }
  T const& operator[](int i) const { return data[i]; }
  T* begin() { return data; }
  T* end() { return data + count; }
  T const* begin() const { return data; }
  T const* end() const { return data + count; }

  void add(T value) {
    if (count == capacity) addSpace();
    data[count++] = value;
  }
  void clear() { count = 0; }
  void swap(TSimpleArray& o) noexcept {
    std::swap(count, o.count), std::swap(capacity, o.capacity);
    std::swap(growBy, o.growBy), std::swap(data, o.data);
  }

 private:
  static constexpr int kLarge = 1024;  // steps alone would copy larger arrays too often

  void addSpace() { reserve(capacity + std::max(growBy, capacity < kLarge ? 0 : capacity / 4)); }
  // Raises the text that the host's users know when memory runs out; the elements stay.
  void reserve(int wanted) {
    T* larger = new (std::nothrow) T[static_cast<size_t>(wanted)];
    if (!larger) throw "E1224: Out of memory in TSimpleArray::addSpace";
    std::copy_n(data, count, larger);
    delete[] data;
    data = larger;
    capacity = wanted;
  }

  bool m_flag [[maybe_unused]] = false;  // kept: part of the host's layout, read by nobody
  int count = 0;
  int capacity = 0;
  int growBy = 16;
  T* data = nullptr;
};
