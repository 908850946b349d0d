// The first lines of a TRC file: rate, unit, counts and marker names.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "io/TextScanner.h"

namespace talix {

struct TrcHeader {
  double rate = 0;
  std::string unit;                               // empty: not given
  std::optional<double> frameCount, markerCount;  // as announced; the rows decide
  std::vector<std::string> names;  // of the markers, with subject; empty for one without a name
  bool namesOutOfPlace = false;    // not at every third column, so that only their order counts
};

// Reads through the line of marker names. Throws FileError.
TrcHeader readTrcHeader(TextScanner&);

// Cells of one row, one after the other: a tab ends a cell, and so do blanks between two cells. Two tabs with
// nothing but blanks between them enclose an empty cell; empty cells at the end of a row are not told apart
// from none.
class TrcCells {
 public:
  explicit TrcCells(std::string_view row) : m_rest(row) {}
  // False at the end of the row.
  bool next(std::string_view& cell);

 private:
  void skipBlanks();
  std::string_view m_rest;
};

// The next line that holds more than blanks, and its number; false at the end of the file.
bool takeFilledLine(TextScanner&, std::string_view& text, int64& line);

}  // namespace talix
