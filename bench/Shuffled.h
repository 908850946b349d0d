// Orders in which benchmarks touch things: the same at each run.
#pragma once

#include <algorithm>
#include <numeric>
#include <random>
#include <vector>

#include "host/base/Types.h"

inline std::vector<int64> inOrder(int64 n) {
  std::vector<int64> order(static_cast<size_t>(n));
  std::iota(order.begin(), order.end(), 0);
  return order;
}

inline std::vector<int64> shuffled(int64 n) {
  std::vector<int64> order = inOrder(n);
  std::shuffle(order.begin(), order.end(), std::mt19937_64(7));
  return order;
}
