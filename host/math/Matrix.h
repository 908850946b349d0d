// A square matrix of doubles, row by row.
#pragma once

#include <vector>

#include "host/base/Types.h"

class Matrix {
 public:
  // n by n, all 0.
  explicit Matrix(uint64 n = 0) : m_n(n), m_values(n * n) {}

  uint64 rows() const { return m_n; }
  uint64 cols() const { return m_n; }
  double* operator[](uint64 row) { return m_values.data() + row * m_n; }
  double const* operator[](uint64 row) const { return m_values.data() + row * m_n; }
  bool operator==(Matrix const&) const = default;

 private:
  uint64 m_n;
  std::vector<double> m_values;
};
