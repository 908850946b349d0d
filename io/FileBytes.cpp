#include "io/FileBytes.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>

#include "host/base/ReplaceFile.h"
#include "io/FileError.h"

namespace talix {

namespace {

std::string systemReason() { return std::strerror(errno); }

// Closes the file at the end of a scope.
struct Descriptor {
  int fd;
  ~Descriptor() {
    if (fd >= 0) ::close(fd);
  }
};

}  // namespace

FileBytes::FileBytes(std::string const& path) : m_path(path) {
  Descriptor file{::open(path.c_str(), O_RDONLY | O_CLOEXEC)};
  if (file.fd < 0)
    throw FileError(path, errno == ENOENT ? "there is no such file" : "cannot be read: " + systemReason());
  struct stat status {};
  if (::fstat(file.fd, &status) != 0) throw FileError(path, "cannot be read: " + systemReason());
  if (S_ISDIR(status.st_mode)) throw FileError(path, "is a folder, not a file");
  if (!S_ISREG(status.st_mode)) throw FileError(path, "is not a regular file");
  if (status.st_size == 0) throw FileError(path, "the file is empty");
  m_size = static_cast<size_t>(status.st_size);
  void* data = ::mmap(nullptr, m_size, PROT_READ, MAP_PRIVATE, file.fd, 0);
  if (data == MAP_FAILED) throw FileError(path, "cannot be read: " + systemReason());
  ::madvise(data, m_size, MADV_SEQUENTIAL);
  m_data = static_cast<char const*>(data);
}

FileBytes::~FileBytes() {
  if (m_data) ::munmap(const_cast<char*>(m_data), m_size);
}

void FileBytes::passed(size_t offset) const {
  m_progress.tell(offset, m_size);
  size_t const page = static_cast<size_t>(::sysconf(_SC_PAGESIZE));
  size_t const whole = offset / page * page;
  if (whole) ::madvise(const_cast<char*>(m_data), whole, MADV_DONTNEED);
}

void writeFileAtomically(std::string const& path, std::function<void(std::ostream&)> const& write) {
  try {
    replaceFile(path, write);
  } catch (std::system_error const& error) {
    throw FileError(path, "cannot be written: " + error.code().message());
  }
}

}  // namespace talix
