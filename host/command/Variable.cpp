#include "host/command/Variable.h"

#include <charconv>
#include <type_traits>

namespace {

template <class>
inline constexpr bool isVector = false;
template <class T>
inline constexpr bool isVector<std::vector<T>> = true;

Vec3 const kZero;

// Calls read(element) with the single value or element i of the array; returns `otherwise` when there is
// none.
template <class Value, class Result, class Read>
Result readElement(Value const& value, int i, Result otherwise, Read read) {
  return std::visit(
      [&](auto const& held) -> Result {
        using Held = std::decay_t<decltype(held)>;
        if constexpr (isVector<Held>) {
          if (i < 0 || i >= static_cast<int>(held.size())) return otherwise;
          return read(held[static_cast<size_t>(i)]);
        } else {
          return read(held);
        }
      },
      value);
}

template <class T>
inline constexpr bool isNumeric =
    std::is_same_v<T, int> || std::is_same_v<T, double> || std::is_same_v<T, Variable::BoolType>;

// A double outside the range of int is its nearest int; casting it would be undefined.
int truncated(double value) {
  if (!(value > -2147483648.0)) return value != value ? 0 : -2147483647 - 1;
  return value >= 2147483647.0 ? 2147483647 : static_cast<int>(value);
}

template <class Number>
std::string numberText(Number value) {
  char text[32];
  return {text, std::to_chars(text, text + sizeof text, value).ptr};
}

}  // namespace

Variable::Variable(VarType type, int count) {
  size_t const n = count > 0 ? static_cast<size_t>(count) : 0;
  switch (type) {
    case None:
      break;
    case Int:
      m_value = 0;
      break;
    case Float:
      m_value = 0.0;
      break;
    case String:
      m_value = HString();
      break;
    case Bool:
      m_value = False;
      break;
    case Vector:
      m_value = Vec3();
      break;
    case IntArray:
      m_value = Ints(n);
      break;
    case FloatArray:
      m_value = Floats(n);
      break;
    case StringArray:
      m_value = Strings(n);
      break;
    case BoolArray:
      m_value = Bools(n);
      break;
    case VectorArray:
      m_value = Vectors(n);
      break;
  }
}

Variable::~Variable() = default;

Variable::VarType Variable::getType() const {
  static constexpr VarType types[] = {None,     Int,        Float,       String,    Bool,       Vector,
                                      IntArray, FloatArray, StringArray, BoolArray, VectorArray};
  return types[m_value.index()];
}

bool Variable::isArray() const { return getType() > kArray; }

bool Variable::isNumber() const {
  VarType const type = getType();
  return type == Int || type == Float || type == Bool;
}

int Variable::getNumItems() const {
  return std::visit(
      [](auto const& held) -> int {
        using Held = std::decay_t<decltype(held)>;
        if constexpr (isVector<Held>) return static_cast<int>(held.size());
        return std::is_same_v<Held, std::monostate> ? 0 : 1;
      },
      m_value);
}

Variable Variable::getArrayValue(int i) const {
  return readElement(m_value, i, Variable(), [](auto const& element) {
    Variable single;
    using Element = std::decay_t<decltype(element)>;
    if constexpr (std::is_same_v<Element, HString>) {
      single.setValue(element.GetStr(), -1);
    } else if constexpr (!std::is_same_v<Element, std::monostate>) {
      single.setValue(element, -1);
    }
    return single;
  });
}

double Variable::getFloatValue(int i) const {
  return readElement(m_value, i, 0.0, [](auto const& element) {
    if constexpr (isNumeric<std::decay_t<decltype(element)>>) return static_cast<double>(element);
    return 0.0;
  });
}

int Variable::getIntValue(int i) const {
  return readElement(m_value, i, 0, [](auto const& element) {
    using Element = std::decay_t<decltype(element)>;
    if constexpr (std::is_same_v<Element, double>) {
      return truncated(element);
    } else if constexpr (isNumeric<Element>) {
      return static_cast<int>(element);
    }
    return 0;
  });
}

Variable::BoolType Variable::getBoolValue(int i) const { return static_cast<BoolType>(getIntValue(i)); }

char const* Variable::getStringValue(int i) const {
  return readElement(m_value, i, "", [](auto const& element) -> char const* {
    if constexpr (std::is_same_v<std::decay_t<decltype(element)>, HString>) return element.GetStr();
    return "";
  });
}

Vec3 const& Variable::getVecValue(int i) const {
  return *readElement(m_value, i, &kZero, [](auto const& element) -> Vec3 const* {
    if constexpr (std::is_same_v<std::decay_t<decltype(element)>, Vec3>) return &element;
    return &kZero;
  });
}

template <class Set>
void Variable::setElement(int i, Set set) {
  std::visit(
      [&](auto& held) {
        if constexpr (isVector<std::decay_t<decltype(held)>>) {
          if (i >= 0 && i < static_cast<int>(held.size())) set(held[static_cast<size_t>(i)]);
        }
      },
      m_value);
}

void Variable::setValue(double value, int i) {
  if (i < 0) {
    m_value = value;
    return;
  }
  setElement(i, [&](auto& element) {
    using Element = std::decay_t<decltype(element)>;
    if constexpr (std::is_same_v<Element, int>) {
      element = truncated(value);
    } else if constexpr (isNumeric<Element>) {
      element = static_cast<Element>(value);
    }
  });
}

void Variable::setValue(int value, int i) {
  if (i < 0) {
    m_value = value;
  } else {
    setValue(static_cast<double>(value), i);
  }
}

void Variable::setValue(BoolType value, int i) {
  if (i < 0) {
    m_value = value;
  } else {
    setValue(static_cast<double>(value), i);
  }
}

void Variable::setValue(char const* value, int i) {
  if (i < 0) {
    m_value = HString(value);
    return;
  }
  setElement(i, [&](auto& element) {
    if constexpr (std::is_same_v<std::decay_t<decltype(element)>, HString>) element = value;
  });
}

void Variable::setValue(Vec3 const& value, int i) {
  if (i < 0) {
    m_value = value;
    return;
  }
  setElement(i, [&](auto& element) {
    if constexpr (std::is_same_v<std::decay_t<decltype(element)>, Vec3>) element = value;
  });
}

void Variable::convertToType(VarType type) {
  VarType const own = getType();
  if (own == type) return;
  if (isArray()) {
    if (type < kArray || own == VectorArray || type == VectorArray) return;
    Variable converted(type, getNumItems());
    auto const elementType = static_cast<VarType>(type - kArray);
    for (int i = 0; i < getNumItems(); ++i) {
      Variable element = getArrayValue(i);
      element.convertToType(elementType);
      if (element.getType() != elementType) return;
      if (elementType == String) {
        converted.setValue(element.getStringValue(-1), i);
      } else {
        converted.setValue(element.getFloatValue(-1), i);
      }
    }
    *this = std::move(converted);
    return;
  }
  if (type == Float && isNumber()) {
    setValue(getFloatValue(-1), -1);
  } else if (type == String && isNumber()) {
    static constexpr char const* words[] = {"false", "true", "toggle"};
    BoolType const value = getBoolValue(-1);
    bool const word = own == Bool && value >= False && value <= Toggle;
    HString const number = own == Float ? numberText(getFloatValue(-1)) : numberText(getIntValue(-1));
    setValue(word ? words[value] : number.GetStr(), -1);
  }
}
