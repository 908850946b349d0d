#include "io/FileProgress.h"

#include <filesystem>

#include "io/FileError.h"

namespace talix {

void FileProgress::tell(uint64 done, uint64 whole) {
  if (g_theOperationStack.isCancelled()) throw FileError(m_path, "cancelled");
  if (done == 0) return;
  if (!m_task) {
    std::string const name = std::filesystem::path(m_path).filename().string();
    m_task.emplace((m_doing + (" " + name)).c_str());
  }
  m_task->tell(static_cast<double>(done), static_cast<double>(whole));
}

}  // namespace talix
