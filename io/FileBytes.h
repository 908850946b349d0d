// Whole files in and out.
#pragma once

#include <functional>
#include <ostream>
#include <string>
#include <string_view>

namespace talix {

// A file's content, mapped read-only, so that reading it takes no memory of its own. Throws FileError when
// the file is missing, is a folder, is empty, or cannot be read, each with its own text.
class FileBytes {
 public:
  explicit FileBytes(const std::string& path);
  ~FileBytes();
  FileBytes(const FileBytes&) = delete;
  FileBytes& operator=(const FileBytes&) = delete;

  std::string_view view() const { return {m_data, m_size}; }
  const std::string& path() const { return m_path; }
  // Lets the system take back the pages before `offset`, which will not be read again soon.
  void release(size_t offset) const;

 private:
  std::string m_path;
  const char* m_data = nullptr;
  size_t m_size = 0;
};

// Writes a file under a temporary name in the same folder and renames it once `write` has returned and all is
// on disk. Throws FileError, and leaves no temporary file, when anything fails; what stood at `path` is then
// untouched.
void writeFileAtomically(const std::string& path, const std::function<void(std::ostream&)>& write);

}  // namespace talix
