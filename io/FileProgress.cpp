#include "io/FileProgress.h"

#include <filesystem>

#include "host/services/OperationStack.h"
#include "io/FileError.h"

namespace talix {

namespace {

constexpr int kSteps = 1000;

}  // namespace

FileProgress::~FileProgress() {
  if (m_begun) g_theOperationStack.popTask();
}

void FileProgress::tell(uint64 done, uint64 whole) {
  if (g_theOperationStack.isCancelled()) throw FileError(m_path, "cancelled");
  if (done == 0) return;
  if (!m_begun) {
    std::string const name = std::filesystem::path(m_path).filename().string();
    g_theOperationStack.pushTask(0, kSteps, 0, 1, true, (m_doing + (" " + name)).c_str());
    m_begun = true;
  }
  double const part = whole ? static_cast<double>(done) / static_cast<double>(whole) : 1;
  g_theOperationStack.setTaskPos(static_cast<int>(part * kSteps));
}

}  // namespace talix
