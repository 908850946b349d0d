// Reads TRC: marker positions by frame in rows of text.
#include <algorithm>
#include <cmath>
#include <filesystem>

#include "io/FileBytes.h"
#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "io/TextScanner.h"
#include "io/trc/TrcHeader.h"

namespace talix {

namespace {

constexpr double kLastFrame = 2147483647;

// Not-a-number as the usual programs print it, which is more than parseNumber knows.
bool isNaNText(std::string_view cell) {
  if (!cell.empty() && (cell[0] == '-' || cell[0] == '+')) cell.remove_prefix(1);
  for (char const* spelling : {"nan", "1.#qnan", "1.#snan", "1.#ind", "1.#nan"})
    if (startsIgnoringCase(cell, spelling)) return true;
  return false;
}

// A marker's positions of successive frames, gathered before they go to its key track.
class MarkerRun {
 public:
  void add(TakePoint& point, int64 frame, Vec3 const& place, int64 ticksPerFrame) {
    constexpr size_t kLongestRun = 256;
    size_t const length = m_values.size() / 3;
    if (length == kLongestRun || frame != m_first + static_cast<int64>(length)) flush(point, ticksPerFrame);
    if (m_values.empty()) m_first = frame;
    m_values.insert(m_values.end(), {place.x, place.y, place.z});
  }

  void flush(TakePoint& point, int64 ticksPerFrame) {
    if (!m_values.empty())
      point.positions.append(m_first * ticksPerFrame, ticksPerFrame, m_values.data(),
                             static_cast<int64>(m_values.size() / 3));
    m_values.clear();
  }

 private:
  int64 m_first = 0;
  std::vector<double> m_values;
};

class RowReader {
 public:
  RowReader(FileBytes const& bytes, TextScanner& scanner, TrcHeader const& header, Take& take)
      : m_bytes(bytes),
        m_scanner(scanner),
        m_header(header),
        m_take(take),
        m_ticks(ticksPerFrameAt(take.rate)) {
    m_runs.resize(take.points.size());
    m_lastFrame = std::min(kLastFrame, static_cast<double>(kForever / m_ticks));
  }

  void read() {
    constexpr int64 kRowsInBlock = 1024;
    std::string_view row;
    while (takeFilledLine(m_scanner, row, m_line)) {
      if (m_rows == 0 && takeCoordinateNames(row)) continue;
      if (m_rows == 0) alignWith(row);
      readRow(row);
      if (++m_rows % kRowsInBlock == 0) m_bytes.passed(m_scanner.offset());
    }
    if (m_rows == 0) m_scanner.fail("a row of data expected; the file ends after its header");
    for (size_t i = 0; i < m_runs.size(); ++i) m_runs[i].flush(m_take.points[i], m_ticks);
    m_take.firstFrame = m_firstFrame;
    m_take.frameCount = m_frame - m_firstFrame + 1;
    addNotes();
  }

 private:
  // "X1 Y1 Z1 X2 ..."
  bool takeCoordinateNames(std::string_view row) {
    std::string_view cell;
    size_t column = 0;
    for (TrcCells cells(row); cells.next(cell) && cell.empty();) ++column;
    if (!startsIgnoringCase(cell, "x")) return false;
    m_coordinateColumn = std::max(column, kFirstColumn);
    return true;
  }

  // Positions begin after Frame# and Time, even under a header that has a column more; unless the rows have
  // it too: then it is empty, and the row too long without it.
  void alignWith(std::string_view row) {
    if (m_coordinateColumn == kFirstColumn) return;
    size_t column = 0, firstFilled = 0, columns = 0;
    std::string_view cell;
    for (TrcCells cells(row); cells.next(cell); ++column) {
      if (column < kFirstColumn || cell.empty()) continue;
      if (firstFilled == 0) firstFilled = column;
      columns = column + 1;
    }
    if (firstFilled >= m_coordinateColumn && columns > kFirstColumn + 3 * m_header.names.size())
      m_firstColumn = m_coordinateColumn;
  }

  void readRow(std::string_view row) {
    TrcCells cells(row);
    std::string_view cell;
    cells.next(cell);
    readFrame(cell);
    m_column = 1;
    if (!takeCell(cells, cell)) return;
    readTime(cell);
    while (m_column < m_firstColumn) takeCell(cells, cell);
    for (size_t marker = 0; readPosition(cells, marker);) ++marker;
  }

  bool takeCell(TrcCells& cells, std::string_view& cell) {
    ++m_column;
    return cells.next(cell);
  }

  void readFrame(std::string_view cell) {
    int64 const before = m_frame;
    if (cell.empty()) {
      m_frame = m_rows == 0 ? 1 : m_frame + 1;
    } else {
      auto const number = parseNumber(cell);
      if (!number || *number != std::floor(*number))
        m_scanner.failAt(m_line, "a whole frame number expected, not " + shown(cell));
      if (!(std::abs(*number) <= m_lastFrame))
        m_scanner.failAt(
            m_line, "a frame number up to " + shortNumber(m_lastFrame) + " expected, not " + shown(cell));
      m_frame = static_cast<int64>(*number);
    }
    if (m_rows == 0) m_firstFrame = m_frame;
    if (m_rows > 0 && m_frame <= before)
      m_scanner.failAt(m_line,
                       "a frame number after " + std::to_string(before) + " expected, not " + shown(cell));
    if (static_cast<double>(m_frame) > m_lastFrame)
      m_scanner.failAt(m_line, "the frame numbers run too high");
  }

  void readTime(std::string_view cell) {
    if (cell.empty()) return;
    auto const seconds = parseNumber(cell);
    if (!seconds) m_scanner.failAt(m_line, "a time in seconds expected, not " + shown(cell));
    if (!m_timed) m_firstTime = {m_frame, *seconds};
    m_timed = true;
    m_lastTime = {m_frame, *seconds};
  }

  // False at the end of the row.
  bool readPosition(TrcCells& cells, size_t marker) {
    Vec3 place;
    int filled = 0;
    std::string_view cell;
    for (int axis = 0; axis < 3; ++axis) {
      if (!takeCell(cells, cell)) {
        m_partial += filled > 0;
        return false;
      }
      filled += readCoordinate(cell, place[axis]);
    }
    if (filled == 3) addPosition(marker, place);
    m_partial += filled == 1 || filled == 2;
    return true;
  }

  // False for a gap.
  bool readCoordinate(std::string_view cell, double& coordinate) {
    if (cell.empty()) return false;
    auto const number = parseNumber(cell);
    if (number ? std::isnan(*number) : isNaNText(cell)) return false;
    double const millimetres = number.value_or(INFINITY) * m_take.unitInMillimetres;
    if (!std::isfinite(millimetres))
      m_scanner.failAt(m_line,
                       "a number expected in column " + std::to_string(m_column) + ", not " + shown(cell));
    coordinate = millimetres;
    return true;
  }

  void addPosition(size_t marker, Vec3 const& place) {
    while (marker >= m_take.points.size()) {
      m_take.points.emplace_back();
      m_runs.emplace_back();
    }
    m_runs[marker].add(m_take.points[marker], m_frame, place, m_ticks);
    ++m_positions;
    m_origins += place == Vec3();
  }

  void note(TakeNote::Level level, std::string const& text) { m_take.notes.push_back({level, text}); }
  void warn(std::string const& text) { note(TakeNote::Level::Warning, text); }

  void addNotes() {
    noteAlignment();
    noteCounts();
    noteTimes();
    if (m_partial)
      warn(std::to_string(m_partial) + " positions lack one or two coordinates and were taken as gaps");
    if (m_origins * 100 > m_positions)
      warn(std::to_string(m_origins) + " of " + std::to_string(m_positions) +
           " positions are 0,0,0, which may stand for markers not seen; they were kept");
  }

  void noteAlignment() {
    std::string const extra = std::to_string(m_coordinateColumn - kFirstColumn);
    if (m_firstColumn != kFirstColumn)
      warn("header and rows have " + extra + " empty column before the first marker, which was left out");
    else if (m_coordinateColumn != kFirstColumn)
      warn("the header has " + extra + " column more than the rows; the markers were named in order");
    else if (m_header.namesOutOfPlace)
      warn("the marker names do not stand above every third column; the markers were named in order");
  }

  void noteCounts() {
    auto const rows = static_cast<double>(m_rows), markers = static_cast<double>(m_take.points.size());
    if (m_header.frameCount && *m_header.frameCount != rows)
      warn("the header announces " + shortNumber(*m_header.frameCount) + " frames, the file has " +
           shortNumber(rows) + " rows; the rows were taken");
    if (m_header.markerCount && *m_header.markerCount != markers)
      warn("the header announces " + shortNumber(*m_header.markerCount) + " markers, the file has " +
           shortNumber(markers));
    if (m_take.points.size() > m_header.names.size())
      warn(std::to_string(m_take.points.size() - m_header.names.size()) + " points have no name");
    if (m_take.frameCount != m_rows)
      note(TakeNote::Level::Info,
           std::to_string(m_take.frameCount - m_rows) + " frames between the first and the last have no row");
  }

  // Recordings count their first frame as 1 or 0 at time 0, and parts of one keep both frame and time.
  void noteTimes() {
    if (!m_timed) return;
    auto const secondsAt = [&](int64 frame) { return static_cast<double>(frame) / m_take.rate; };
    double const from0 = m_firstTime.seconds - secondsAt(m_firstTime.frame);
    double const from1 = m_firstTime.seconds - secondsAt(m_firstTime.frame - 1);
    double const halfFrame = 0.5 / m_take.rate;
    if (!(std::min(std::abs(from0), std::abs(from1)) <= halfFrame))
      note(TakeNote::Level::Info, "the Time column starts with " + shortNumber(m_firstTime.seconds) +
                                      " s at frame " + std::to_string(m_firstTime.frame) +
                                      "; the frame numbers were taken");
    double const lasts = m_lastTime.seconds - m_firstTime.seconds;
    double const framesLast = secondsAt(m_lastTime.frame - m_firstTime.frame);
    if (!(std::abs(lasts - framesLast) <= 2 * halfFrame))
      warn("the Time column lasts " + shortNumber(lasts) + " s, the frames at the file's rate " +
           shortNumber(framesLast) + " s; frame numbers and rate were taken");
  }

  struct Timed {
    int64 frame;
    double seconds;
  };
  static constexpr size_t kFirstColumn = 2;  // after Frame# and Time

  FileBytes const& m_bytes;
  TextScanner& m_scanner;
  TrcHeader const& m_header;
  Take& m_take;
  int64 m_ticks;
  double m_lastFrame = 0;
  std::vector<MarkerRun> m_runs;  // by point
  size_t m_coordinateColumn = kFirstColumn, m_firstColumn = kFirstColumn;

  int64 m_line = 0;
  size_t m_column = 0;  // from 1, of the cell read last
  int64 m_rows = 0, m_frame = 0, m_firstFrame = 0;
  bool m_timed = false;
  Timed m_firstTime{}, m_lastTime{};
  int64 m_positions = 0, m_origins = 0, m_partial = 0;
};

void setUnit(Take& take, std::string const& path, std::string const& given, std::string const& wanted) {
  std::string const& unit = wanted.empty() ? given : wanted;
  take.fileUnit = unit.empty() ? "mm" : unit;
  take.unitInMillimetres = millimetresPerUnit(take.fileUnit);
  if (take.unitInMillimetres > 0 && !unit.empty()) return;
  if (!wanted.empty()) throw FileError(path, "the unit " + shown(wanted) + " is not known");
  take.unitInMillimetres = 1;
  take.unitAssumed = true;
  take.notes.push_back({TakeNote::Level::Warning,
                        unit.empty()
                            ? "the file names no length unit; millimetres were assumed"
                            : "the length unit " + shown(unit) + " is not known; millimetres were assumed"});
}

void setUpAxis(Take& take) {
  constexpr double kMetre = 1000;
  take.up = take.unitInMillimetres == kMetre ? Axis::Y : Axis::Z;
  take.upAssumed = true;
  take.notes.push_back(
      {TakeNote::Level::Info,
       std::string("the file names no up axis; ") +
           (take.up == Axis::Y ? "y was assumed, as files in metres have it" : "z was assumed")});
}

// "Subject:Name"; a star stands before the numbers of points that nobody has named.
TakePoint namedPoint(std::string const& name) {
  TakePoint point;
  size_t const colon = name.find(':');
  bool const hasSubject = colon != std::string::npos && colon > 0 && colon + 1 < name.size();
  if (hasSubject) point.subject = name.substr(0, colon);
  point.label = hasSubject ? name.substr(colon + 1) : name;
  return point.label.starts_with('*') ? TakePoint() : point;
}

}  // namespace

Take readTRC(std::string const& path, ReadOptions const& options) {
  FileBytes const bytes(path);
  TextScanner scanner(bytes);
  TrcHeader const header = readTrcHeader(scanner);

  Take take;
  take.format = "TRC";
  take.name = std::filesystem::path(path).stem().string();
  take.rate = header.rate;
  setUnit(take, path, header.unit, options.unit);
  setUpAxis(take);
  for (std::string const& name : header.names) take.points.push_back(namedPoint(name));
  RowReader(bytes, scanner, header, take).read();
  return take;
}

}  // namespace talix
