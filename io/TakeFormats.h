// The take file formats. The reader is chosen by content where the format has a mark, else by the file's
// suffix.
//
// Readers throw FileError with one clear text; they check every count and offset from a file against the
// file's size before trusting it. Writers write to a temporary name and rename; what a format cannot hold is
// added to `notes` as a warning, never dropped silently.
#pragma once

#include <string>
#include <vector>

#include "io/Take.h"

namespace talix {

struct ReadOptions {
  std::string unit;  // "mm", "cm", "m", "in" or "ft": the file's length unit, over what the file says; empty:
                     // as it says
};

Take readC3D(const std::string& path, const ReadOptions& = {});
Take readBVH(const std::string& path, const ReadOptions& = {});
Take readTRC(const std::string& path, const ReadOptions& = {});

void writeC3D(const Take&, const std::string& path, std::vector<TakeNote>& notes);
void writeBVH(const Take&, const std::string& path, std::vector<TakeNote>& notes);

// By content and suffix. Throws FileError naming the formats when the file is of none.
Take readTake(const std::string& path, const ReadOptions& = {});
// Throws FileError when a take could not be written there whatever it holds: no such folder, or a name whose
// suffix is of no format that is written. For asking before long work.
void checkTakeTarget(const std::string& path);
// By suffix (.c3d, .bvh).
void writeTake(const Take&, const std::string& path, std::vector<TakeNote>& notes);

// How many millimetres a length unit is; accepts the usual spellings ("mm", "Meters", "inch"); 0 when
// unknown.
double millimetresPerUnit(const std::string& unit);

}  // namespace talix
