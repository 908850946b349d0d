#include "host/base/FileLock.h"

#include <cerrno>
#include <fcntl.h>
#include <filesystem>
#include <sys/file.h>
#include <unistd.h>

FileLock::FileLock(std::string const& path) {
  std::error_code error;
  // The folder of the file itself: links are followed, as they are in writing.
  std::filesystem::path file = std::filesystem::weakly_canonical(path, error);
  std::filesystem::path const folder = (error ? std::filesystem::path(path) : file).parent_path();
  m_folder = ::open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  while (m_folder >= 0 && ::flock(m_folder, LOCK_EX) != 0 && errno == EINTR) continue;
}

FileLock::~FileLock() {
  if (m_folder >= 0) ::close(m_folder);
}
