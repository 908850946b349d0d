// The take file formats. The reader is chosen by content where the format has a mark, else by the file's
// suffix.
//
// Readers throw FileError with one clear text; they check every count and offset from a file against the
// file's size before trusting it. Writers write to a temporary name and rename; what a format cannot hold is
// added to `notes` as a warning, never dropped silently.
#pragma once

#include <string>
#include <vector>

#include "io/TakeSource.h"

namespace talix {

struct ReadOptions {
  std::string unit;  // "mm", "cm", "m", "in" or "ft": the file's length unit, over what the file says; empty:
                     // as it says
};

Take readC3D(std::string const& path, ReadOptions const& = {});
Take readBVH(std::string const& path, ReadOptions const& = {});
Take readTRC(std::string const& path, ReadOptions const& = {});

void writeC3D(TakeSource const&, std::string const& path, std::vector<TakeNote>& notes);
void writeBVH(TakeSource const&, std::string const& path, std::vector<TakeNote>& notes);

// By content and suffix. Throws FileError naming the formats when the file is of none.
Take readTake(std::string const& path, ReadOptions const& = {});
// Throws FileError when a take could not be written there whatever it holds: no such folder, or a name whose
// suffix is of no format that is written. For asking before long work.
void checkTakeTarget(std::string const& path);
// By suffix (.c3d, .bvh).
void writeTake(TakeSource const&, std::string const& path, std::vector<TakeNote>& notes);

// How many millimetres a length unit is; accepts the usual spellings ("mm", "Meters", "inch"); 0 when
// unknown.
double millimetresPerUnit(std::string const& unit);

}  // namespace talix
