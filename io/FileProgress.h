// A task on the scene's operation stack for a file that is read or written. A file that is done with at once
// makes none.
#pragma once

#include <string>

#include "host/base/Types.h"

namespace talix {

class FileProgress {
 public:
  // doing: "Opening" or "Saving".
  FileProgress(char const* doing, std::string const& path) : m_doing(doing), m_path(path) {}
  ~FileProgress();
  FileProgress(FileProgress const&) = delete;
  FileProgress& operator=(FileProgress const&) = delete;

  // So much is done of the whole. Throws FileError when the user has cancelled.
  void tell(uint64 done, uint64 whole);

 private:
  char const* m_doing;
  std::string const& m_path;
  bool m_begun = false;
};

}  // namespace talix
