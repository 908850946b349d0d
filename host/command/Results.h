// Results in one line: each sets the value and returns true, as a command that has succeeded does.
#pragma once

#include <type_traits>

#include "host/command/Variable.h"

template <class T>
bool answer(Variable& result, T const& value) {
  if constexpr (std::is_same_v<T, Variable>)
    result = value;
  else if constexpr (std::is_same_v<T, bool>)
    result.setValue(value ? Variable::True : Variable::False, -1);
  else
    result.setValue(value, -1);
  return true;
}

// A number as an integer, truncated toward zero; beyond the integers the nearest one.
inline bool answerTruncated(Variable& result, double value) {
  Variable number;
  number.setValue(value, -1);
  return answer(result, number.getIntValue(-1));
}
