#pragma once

#include "host/base/HString.h"

// Copies a file beside itself, "take.mov" as "take_Original.mov", over what has that name; returns the copy's
// path. Whether that went well is seen when the copy is opened.
HString backUpFile(HString const& path);
