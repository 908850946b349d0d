// A task on the scene's operation stack for a file that is read or written. A file that is done with at once
// makes none.
#pragma once

#include <optional>
#include <string>

#include "host/services/OperationStack.h"

namespace talix {

class FileProgress {
 public:
  // doing: "Opening" or "Saving".
  FileProgress(char const* doing, std::string const& path) : m_doing(doing), m_path(path) {}

  // So much is done of the whole. Throws FileError when the user has cancelled.
  void tell(uint64 done, uint64 whole);

 private:
  char const* m_doing;
  std::string const& m_path;
  std::optional<OperationTask> m_task;
};

}  // namespace talix
