// What a reader or writer throws: one sentence that names the file, where in it, and what was expected.
#pragma once

#include <stdexcept>
#include <string>

#include "host/base/Types.h"

namespace talix {

class FileError : public std::runtime_error {
 public:
  // "FILE: WHAT"
  FileError(const std::string& file, const std::string& what) : std::runtime_error(file + ": " + what) {}

  // "FILE, offset N: WHAT"
  static FileError atOffset(const std::string& file, uint64 offset, const std::string& what) {
    return FileError(file + ", offset " + std::to_string(offset), what);
  }
  // "FILE, line N: WHAT"; lines count from 1
  static FileError atLine(const std::string& file, int64 line, const std::string& what) {
    return FileError(file + ", line " + std::to_string(line), what);
  }
};

}  // namespace talix
