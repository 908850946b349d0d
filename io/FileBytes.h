// Whole files in and out.
#pragma once

#include <functional>
#include <ostream>
#include <string>
#include <string_view>

#include "io/FileProgress.h"

namespace talix {

// A file's content, mapped read-only, so that reading it takes no memory of its own. Throws FileError when
// the file is missing, is a folder, is empty, or cannot be read, each with its own text.
class FileBytes {
 public:
  explicit FileBytes(std::string const& path);
  ~FileBytes();
  FileBytes(FileBytes const&) = delete;
  FileBytes& operator=(FileBytes const&) = delete;

  std::string_view view() const { return {m_data, m_size}; }
  std::string const& path() const { return m_path; }
  // All before `offset` has been read: lets the system take those pages back, and tells how far it is. Throws
  // FileError when the user has cancelled.
  void passed(size_t offset) const;

 private:
  std::string m_path;
  char const* m_data = nullptr;
  size_t m_size = 0;
  mutable FileProgress m_progress{"Opening", m_path};
};

// Writes a file under a temporary name in the same folder and renames it once `write` has returned and all is
// on disk. Throws FileError, and leaves no temporary file, when anything fails; what stood at `path` is then
// untouched.
void writeFileAtomically(std::string const& path, std::function<void(std::ostream&)> const& write);

}  // namespace talix
