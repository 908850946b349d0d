// What reading or writing a take has to say, into the log.
#pragma once

#include <vector>

#include "host/command/Command.h"
#include "io/Take.h"

namespace talix {

inline void logNotes(std::vector<TakeNote> const& notes) {
  for (TakeNote const& note : notes) {
    auto const log = note.level == TakeNote::Level::Warning ? &Command::logWarning : &Command::logInfo;
    log("%s", note.text.c_str());
  }
}

}  // namespace talix
