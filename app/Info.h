// "talix info": what is in take files, without a scene.
#pragma once

#include <string>
#include <vector>

namespace talix {

// Describes the files on standard output, one after the other, for a person or (json) as an array with one
// object per file. A file that cannot be read is an error line on standard error, in the array an object with
// "file" and "error"; the others are described all the same. Returns the exit status: 0, or 3 when a file
// could not be read.
int runInfo(std::vector<std::string> const& files, bool json);

}  // namespace talix
