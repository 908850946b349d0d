// Argument checks that several commands share, beyond number and types.
#pragma once

#include <algorithm>

#include "host/command/ScriptCommand.h"

// Whether every argument is a number, whole or not.
inline bool areNumbers(Args const& args) {
  return std::all_of(args.begin(), args.end(), [](Variable const& arg) { return arg.isNumber(); });
}
