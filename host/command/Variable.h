// A script value: an argument or a result.
//
// The index of the readers and setters is -1 for a single value, else that of an array's element; an index
// outside the array reads as nothing (0, empty) and sets nothing. Numbers convert into each other when read:
// a double is truncated toward zero, a boolean is its number.
#pragma once

#include <variant>
#include <vector>

#include "host/base/HString.h"
#include "host/math/Vec3.h"

class Variable {
 public:
  enum VarType : int {
    None = 0,
    Int = 1,
    Float = 2,
    String = 3,
    Bool = 4,
    Vector = 5,
    IntArray = 17,
    FloatArray = 18,
    StringArray = 19,
    BoolArray = 20,
    VectorArray = 21
  };
  static constexpr int kArray = 16;  // an array type is its scalar type plus this
  enum BoolType : int { False = 0, True = 1, Toggle = 2 };

  Variable() = default;
  // A value of a type: zero, empty; an array of `count` such elements.
  Variable(VarType type, int count);
  Variable(Variable const&) = default;
  Variable(Variable&&) noexcept = default;
  Variable& operator=(Variable const&) = default;
  Variable& operator=(Variable&&) noexcept = default;
  virtual ~Variable();

  virtual VarType getType() const;
  virtual bool isArray() const;
  // Integers, doubles and booleans.
  bool isNumber() const;
  // Elements of an array; 1 for a single value, 0 for none.
  int getNumItems() const;
  // Element i as a value of its own; a single value is its own element.
  Variable getArrayValue(int i) const;

  int getIntValue(int i) const;
  double getFloatValue(int i) const;
  // A number truncated, so that 2 is toggle; other numbers are returned as they are.
  BoolType getBoolValue(int i) const;
  char const* getStringValue(int i) const;
  Vec3 const& getVecValue(int i) const;

  // With index -1 the variable becomes a single value of that type; else the element is set, converted to the
  // array's type.
  void setValue(Variable const& value) { *this = value; }
  void setValue(int value, int i);
  void setValue(double value, int i);
  void setValue(BoolType value, int i);
  void setValue(char const* value, int i);
  void setValue(Vec3 const& value, int i);

  // Converts in place where nothing is lost: integers and booleans to doubles, numbers to strings, an array
  // by its elements. A value that cannot be converted stays as it is.
  void convertToType(VarType type);

 private:
  using Ints = std::vector<int>;
  using Floats = std::vector<double>;
  using Strings = std::vector<HString>;
  using Bools = std::vector<BoolType>;
  using Vectors = std::vector<Vec3>;
  template <class Set>
  void setElement(int i, Set set);

  // In the order of VarType: scalars, then arrays.
  std::variant<std::monostate, int, double, HString, BoolType, Vec3, Ints, Floats, Strings, Bools, Vectors>
      m_value;
};
