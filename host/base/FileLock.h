// One program at a time changes a file.
#pragma once

#include <string>

// Waits for whoever else holds it, in this process or another. The lock is on the file's folder, so that it
// holds while the file is replaced and leaves nothing behind; other files there wait as well. Where the file
// system knows no locks, or the folder is not there yet, it does nothing.
class FileLock {
 public:
  explicit FileLock(std::string const& path);
  ~FileLock();
  FileLock(FileLock const&) = delete;
  FileLock& operator=(FileLock const&) = delete;

 private:
  int m_folder;  // -1: none
};
