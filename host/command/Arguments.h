// Argument checks that several commands share, beyond number and types.
#pragma once

#include <algorithm>

#include "host/command/ScriptCommand.h"

// Whether every argument is a number, whole or not; booleans count as numbers.
inline bool areNumbers(Args const& args) {
  return std::all_of(args.begin(), args.end(), [](Variable const& arg) { return arg.isNumber(); });
}

// The same without booleans.
inline bool isIntOrFloat(Variable const& value) {
  return value.getType() == Variable::Int || value.getType() == Variable::Float;
}
inline bool areIntsOrFloats(Args const& args) { return std::all_of(args.begin(), args.end(), isIntOrFloat); }

// One text or several.
inline bool isText(Variable const& value) {
  return value.getType() == Variable::String || value.getType() == Variable::StringArray;
}
inline bool areTexts(Args const& args) { return std::all_of(args.begin(), args.end(), isText); }

// What a given state makes of the present one.
inline bool changed(bool current, Variable::BoolType given) {
  return given == Variable::Toggle ? !current : given == Variable::True;
}
