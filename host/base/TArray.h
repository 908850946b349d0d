// The host's array of values that need construction: script arguments, options, texts.
#pragma once

#include <vector>

template <class T>
class TArray {
 public:
  TArray() = default;
  TArray(std::initializer_list<T> values) : m_items(values) {}

  int getCount() const { return static_cast<int>(m_items.size()); }
  T& operator[](int i) { return m_items[static_cast<size_t>(i)]; }
  T const& operator[](int i) const { return m_items[static_cast<size_t>(i)]; }
  auto begin() { return m_items.begin(); }
  auto end() { return m_items.end(); }
  auto begin() const { return m_items.begin(); }
  auto end() const { return m_items.end(); }

  void add(T value) { m_items.push_back(std::move(value)); }
  void clear() { m_items.clear(); }

 private:
  std::vector<T> m_items;
};
