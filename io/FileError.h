// What a reader or writer throws: one sentence that names the file, where in it, and what was expected.
#pragma once

#include <stdexcept>
#include <string>

#include "host/base/Types.h"

namespace talix {

class FileError : public std::runtime_error {
 public:
  // "FILE: WHAT"
  FileError(std::string const& file, std::string const& what) : std::runtime_error(file + ": " + what) {}

  // "FILE, offset N: WHAT"
  static FileError atOffset(std::string const& file, uint64 offset, std::string const& what) {
    return FileError(file + ", offset " + std::to_string(offset), what);
  }
  // "FILE, line N: WHAT"; lines count from 1
  static FileError atLine(std::string const& file, int64 line, std::string const& what) {
    return FileError(file + ", line " + std::to_string(line), what);
  }
};

}  // namespace talix
