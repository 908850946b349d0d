#include "io/trc/TrcHeader.h"

#include <algorithm>
#include <cmath>

#include "io/FrameRates.h"

namespace talix {

namespace {

using Cells = std::vector<std::string_view>;

Cells cellsOf(std::string_view row) {
  Cells cells;
  std::string_view cell;
  for (TrcCells rest(row); rest.next(cell);) cells.push_back(cell);
  return cells;
}

// Only tabs separate, when there are any: names may hold blanks. Without the empty cells at the end.
Cells tabbedCells(std::string_view row) {
  if (row.find('\t') == std::string_view::npos) return cellsOf(row);
  Cells cells;
  for (size_t start = 0; start <= row.size();) {
    size_t const end = std::min(row.find('\t', start), row.size());
    cells.push_back(trimmed(row.substr(start, end - start)));
    start = end + 1;
  }
  while (!cells.empty() && cells.back().empty()) cells.pop_back();
  return cells;
}

// The line of values that belongs to a line of names, looked up by name.
class HeaderValues {
 public:
  HeaderValues(Cells names, std::string_view row) : m_names(std::move(names)), m_values(tabbedCells(row)) {
    // Files padded with blanks and doubled tabs have more cells than names; they leave no value out.
    bool const padded = m_values.size() > m_names.size();
    if (padded) m_values = cellsOf(row);
    if (padded)
      m_values.erase(std::remove(m_values.begin(), m_values.end(), std::string_view()), m_values.end());
  }

  std::string_view text(std::string_view lowerCaseName) const {
    for (size_t i = 0; i < std::min(m_names.size(), m_values.size()); ++i)
      if (equalsIgnoringCase(m_names[i], lowerCaseName)) return m_values[i];
    return {};
  }

  std::optional<double> number(std::string_view lowerCaseName) const {
    auto const value = parseNumber(text(lowerCaseName));
    return value && std::isfinite(*value) ? value : std::nullopt;
  }

 private:
  Cells m_names, m_values;
};

bool hasName(Cells const& names, std::string_view lowerCaseName) {
  return std::any_of(names.begin(), names.end(),
                     [&](std::string_view name) { return equalsIgnoringCase(name, lowerCaseName); });
}

void readValues(TextScanner& scanner, TrcHeader& header) {
  std::string_view row;
  int64 line = 0;
  auto const takeRow = [&](char const* expected) {
    if (!takeFilledLine(scanner, row, line))
      scanner.fail(std::string(expected) + " expected; the file ends inside its header");
  };
  takeRow("the line of header names beginning with DataRate");
  Cells const names = cellsOf(row);
  if (!hasName(names, "datarate"))
    scanner.failAt(line, "the header names, DataRate among them, expected, not " + shown(row));
  takeRow("the line of header values (DataRate ...)");
  HeaderValues const values(names, row);
  header.rate = values.number("datarate").value_or(0);
  if (!isFrameRate(header.rate))
    scanner.failAt(line, "a DataRate that is " + std::string(kFrameRateExpected) + " expected, not " +
                             shown(values.text("datarate")));
  header.unit = values.text("units");
  header.frameCount = values.number("numframes");
  header.markerCount = values.number("nummarkers");
}

void readNames(TextScanner& scanner, TrcHeader& header) {
  constexpr size_t kFirst = 2;  // after Frame# and Time
  std::string_view row;
  int64 line = 0;
  if (!takeFilledLine(scanner, row, line))
    scanner.fail("the line of marker names beginning with Frame# expected; the file ends inside its header");
  Cells const cells = tabbedCells(row);
  if (!startsIgnoringCase(cells[0], "frame") || cells.size() < kFirst ||
      !startsIgnoringCase(cells[1], "time"))
    scanner.failAt(line,
                   "the line of marker names beginning with Frame# and Time expected, not " + shown(row));
  bool const tabbed = row.find('\t') != std::string_view::npos;
  for (size_t i = kFirst; tabbed && i < cells.size(); ++i)
    if (!cells[i].empty() && (i - kFirst) % 3 != 0) header.namesOutOfPlace = true;
  bool const inOrder = !tabbed || header.namesOutOfPlace;
  for (size_t i = kFirst; i < cells.size(); i += inOrder ? 1 : 3)
    if (!inOrder || !cells[i].empty()) header.names.emplace_back(cells[i]);
}

}  // namespace

TrcHeader readTrcHeader(TextScanner& scanner) {
  std::string_view row;
  int64 line = 0;
  if (!takeFilledLine(scanner, row, line) || !startsIgnoringCase(trimmed(row), "pathfiletype"))
    scanner.failAt(std::max<int64>(line, 1), "PathFileType expected at the start of a TRC file");
  TrcHeader header;
  readValues(scanner, header);
  readNames(scanner, header);
  return header;
}

void TrcCells::skipBlanks() {
  while (!m_rest.empty() && (m_rest[0] == ' ' || m_rest[0] == '\v' || m_rest[0] == '\f'))
    m_rest.remove_prefix(1);
}

bool TrcCells::next(std::string_view& cell) {
  skipBlanks();
  if (m_rest.empty()) return false;
  size_t end = 0;
  while (end < m_rest.size() && m_rest[end] != '\t' && m_rest[end] != ' ') ++end;
  cell = m_rest.substr(0, end);
  m_rest.remove_prefix(end);
  skipBlanks();
  if (!m_rest.empty() && m_rest[0] == '\t') m_rest.remove_prefix(1);
  return true;
}

bool takeFilledLine(TextScanner& scanner, std::string_view& text, int64& line) {
  do {
    line = scanner.line();
    if (!scanner.takeLine(text)) return false;
  } while (trimmed(text).empty());
  return true;
}

}  // namespace talix
