// Writing a file so that its place holds the old content or the new one, never half of it.
#pragma once

#include <functional>
#include <ostream>
#include <string>

// Writes a file under a temporary name in the same folder and renames it once `write` has returned and all is
// on disk. Throws std::system_error, and what `write` throws; then no temporary file is left and what stood
// at `path` is untouched.
void replaceFile(const std::string& path, const std::function<void(std::ostream&)>& write);
