// The parameter section of a C3D file: named groups of named arrays of text or numbers.
//
// An array holds at most 255 along a dimension; longer lists go on in parameters named NAME2, NAME3, ...
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "io/Take.h"
#include "io/c3d/C3DBytes.h"

namespace talix {

struct C3DParameter {
  // The values are those in the file.
  enum class Type : signed char { Text = -1, Byte = 1, Integer = 2, Real = 4 };

  std::string name;  // upper case
  Type type = Type::Integer;
  std::vector<int> dimensions;  // 0 to 255 each, the first runs fastest; none: a single value
  std::string characters;       // of a text, one string of the first dimension's length after the other
  std::vector<double> numbers;  // of all other types; integers are signed as stored

  size_t textCount() const;
  std::string text(size_t index) const;  // without the blanks around it
};

struct C3DGroup {
  std::string name;  // upper case
  std::string description;
  std::vector<C3DParameter> parameters;
};

class C3DParameters {
 public:
  std::vector<C3DGroup> groups;

  C3DParameter const* find(std::string_view group, std::string_view name) const;  // null: none
  // Of the parameter and those that go on with it; empty when there is none.
  std::vector<std::string> texts(std::string_view group, std::string_view name) const;
  std::vector<double> numbers(std::string_view group, std::string_view name) const;
  // The first value of a parameter, or the fallback.
  double number(std::string_view group, std::string_view name, double fallback) const;
  std::string text(std::string_view group, std::string_view name) const;  // empty: none
};

// An integer as the 16 bits without sign that many programs store in it. Reals stay as they are.
inline double c3dUnsigned(double value) { return value < 0 && value >= -32768 ? value + 65536 : value; }

struct C3DParameterSection {
  C3DParameters parameters;
  size_t end = 0;  // offset after the last record
};

// Reads the section at `start`, once the processor is known to `bytes`. Leads back to no record twice: each
// one lies after the one before. An array that says to be longer than its record is cut, with a warning.
C3DParameterSection readC3DParameters(C3DBytes const& bytes, size_t start, size_t declaredEnd,
                                      std::vector<TakeNote>& notes);

}  // namespace talix
