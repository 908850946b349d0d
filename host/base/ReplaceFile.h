// Writing a file so that its place holds the old content or the new one, never half of it.
#pragma once

#include <functional>
#include <ostream>
#include <string>

// Writes a nameless file in the same folder and gives it the name once `write` has returned and all is on
// disk: whatever ends the program meanwhile leaves nothing behind. A symbolic link is followed, the rights of
// an existing file are kept; one that may not be written is refused. Throws std::system_error, and what
// `write` throws; then what stood at `path` is untouched. The stream only goes forward.
void replaceFile(std::string const& path, std::function<void(std::ostream&)> const& write);

// The same for who writes to a descriptor, at any place of the file; `write` leaves it open.
void replaceFileThrough(std::string const& path, std::function<void(int)> const& write);
