// In a library of its own (libTalixBackup.so), as Qt would be felt at each start.
#pragma once

#include <string>

// Copies a file beside itself, "take.mov" as "take_Original.mov", over what has that name. `copy` is the
// copy's path. Whether that went well is seen when the copy is opened.
using BackUpFile = void(char const* path, std::string& copy);
inline constexpr char const kBackUpFile[] = "talixBackUpFile";
