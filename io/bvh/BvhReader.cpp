// Reads BVH. The motion is one stream of numbers, since rows may be broken over lines.
#include <algorithm>
#include <cmath>
#include <filesystem>
#include <numbers>

#include "io/FileBytes.h"
#include "io/FileError.h"
#include "io/FrameRates.h"
#include "io/TakeFormats.h"
#include "io/TextScanner.h"
#include "io/bvh/BvhHierarchy.h"

namespace talix {

namespace {

// Frames that are gathered before they go to the key tracks.
constexpr int64 kBlockFrames = 256;

using Quaternion = std::array<double, 4>;  // x y z w

// first * (a turn about an axis): the axis turns before `first`.
Quaternion timesTurn(Quaternion const& first, int axis, double radians) {
  double const s = std::sin(radians / 2), c = std::cos(radians / 2);
  size_t const i = static_cast<size_t>(axis), j = (i + 1) % 3, k = (i + 2) % 3;
  Quaternion result;
  result[i] = first[i] * c + first[3] * s;
  result[j] = first[j] * c + first[k] * s;
  result[k] = first[k] * c - first[j] * s;
  result[3] = first[3] * c - first[i] * s;
  return result;
}

// Turns rows of numbers into one joint's keys.
class JointMotion {
 public:
  JointMotion(TakeJoint& joint, std::vector<BvhChannel> channels, double millimetres)
      : m_joint(joint), m_channels(std::move(channels)), m_millimetres(millimetres) {
    for (BvhChannel const& channel : m_channels) (channel.isRotation ? m_turns : m_moves) = true;
  }

  size_t channelCount() const { return m_channels.size(); }

  void add(double const* values) {
    Vec3 place = m_joint.offset;  // what has no channel stays at the offset
    Quaternion turned{0, 0, 0, 1};
    for (BvhChannel const& channel : m_channels) {
      double const value = *values++;
      if (channel.isRotation)
        turned = timesTurn(turned, channel.axis, value * (std::numbers::pi / 180));
      else
        place[channel.axis] = value * m_millimetres;
    }
    if (m_moves) m_places.insert(m_places.end(), {place.x, place.y, place.z});
    if (m_turns) addTurn(turned);
  }

  void flush(int64 start, int64 period) {
    if (!m_places.empty())
      m_joint.translations.append(start, period, m_places.data(), static_cast<int64>(m_places.size() / 3));
    if (!m_quaternions.empty())
      m_joint.rotations.append(start, period, m_quaternions.data(),
                               static_cast<int64>(m_quaternions.size() / 4));
    m_places.clear();
    m_quaternions.clear();
  }

 private:
  // q and -q are one rotation; the one nearer to the frame before keeps the track smooth by component.
  void addTurn(Quaternion q) {
    double dot = 0;
    for (size_t i = 0; i < 4; ++i) dot += q[i] * m_last[i];
    if (dot < 0)
      for (double& component : q) component = -component;
    m_quaternions.insert(m_quaternions.end(), q.begin(), q.end());
    m_last = q;
  }

  TakeJoint& m_joint;
  std::vector<BvhChannel> m_channels;
  double m_millimetres;
  bool m_turns = false, m_moves = false;
  std::vector<double> m_places, m_quaternions;
  Quaternion m_last{0, 0, 0, 1};
};

class MotionReader {
 public:
  MotionReader(FileBytes const& bytes, TextScanner& scanner, size_t channelCount)
      : m_bytes(bytes), m_scanner(scanner), m_channelCount(channelCount) {}

  // "Frames:" and "Frame Time:"
  void readHead(Take& take) {
    if (!m_scanner.accept("frames")) failExpecting("Frames: after MOTION");
    m_scanner.accept(":");
    double const frames = m_scanner.takeNumber("the number of frames");
    if (frames < 0 || frames != std::floor(frames))
      m_scanner.fail("the number of frames expected after Frames:");
    if (!m_scanner.accept("frame") || !m_scanner.accept("time")) failExpecting("Frame Time: after Frames:");
    m_scanner.accept(":");
    take.rate = takeRate(take.notes);

    // A frame takes at least a digit and a blank for each value, or an empty line.
    double const fewestBytes = frames * static_cast<double>(std::max<size_t>(1, 2 * m_channelCount)) - 1;
    if (fewestBytes > static_cast<double>(m_scanner.remaining()))
      m_scanner.fail(announced(frames) + ", but only " + std::to_string(m_scanner.remaining()) +
                     " bytes follow");
    if (frames > static_cast<double>(kForever / ticksPerFrameAt(take.rate)))
      m_scanner.fail(shortNumber(frames) + " frames reach beyond the end of time");
    take.frameCount = m_frameCount = static_cast<int64>(frames);
  }

  void readFrames(std::vector<JointMotion>& joints, int64 ticksPerFrame, double millimetres) {
    std::vector<double> row(m_channelCount);
    for (int64 first = 0; first < m_frameCount; first += kBlockFrames) {
      int64 const end = std::min(first + kBlockFrames, m_frameCount);
      for (int64 frame = first; frame < end; ++frame) {
        readRow(row, frame, millimetres);
        double const* values = row.data();
        for (JointMotion& joint : joints) {
          joint.add(values);
          values += joint.channelCount();
        }
      }
      for (JointMotion& joint : joints) joint.flush(first * ticksPerFrame, ticksPerFrame);
      m_bytes.passed(m_scanner.offset());
    }
    if (!m_scanner.atEnd())
      failCount("the motion goes on with " + shown(m_scanner.peekWord()) + " after them");
  }

 private:
  void readRow(std::vector<double>& row, int64 frame, double millimetres) {
    int64 firstLine = 0;
    for (double& value : row) {
      std::string_view const word = m_scanner.takeWord();
      if (firstLine == 0) firstLine = m_scanner.line();
      auto const number = parseNumber(word);
      if (!number) {
        if (m_oddLine == 0 && &value != row.data()) m_oddLine = firstLine;
        if (word.empty()) failCount("the motion ends in frame " + std::to_string(frame + 1));
        m_scanner.fail("a number expected, not " + found(word) + ", in frame " + std::to_string(frame + 1));
      }
      if (!std::isfinite(*number * millimetres))
        m_scanner.fail("a finite number expected, not " + shown(word) + ", in frame " +
                       std::to_string(frame + 1));
      value = *number;
    }
    if (m_oddLine == 0 && (firstLine != m_scanner.line() || !m_scanner.atLineEnd())) m_oddLine = firstLine;
  }

  // Where the counts do not agree, the first line that was no whole frame is the likely culprit.
  [[noreturn]] void failCount(std::string const& what) {
    std::string text = announced(static_cast<double>(m_frameCount)) + "; " + what;
    if (m_oddLine)
      text += "; line " + std::to_string(m_oddLine) + " is the first that does not hold one whole frame";
    m_scanner.fail(text);
  }

  std::string announced(double frames) const {
    return std::to_string(m_channelCount) + " values expected for each of " + shortNumber(frames) + " frames";
  }

  double takeRate(std::vector<TakeNote>& notes) {
    std::string const word(m_scanner.takeWord());
    auto const frameTime = parseNumber(word);
    if (!frameTime || !std::isfinite(*frameTime) || *frameTime <= 0)
      m_scanner.fail("a frame time above 0 in seconds expected, not " + found(word));
    double const asPrinted = 1 / *frameTime;
    double const rate = rateFromFrameTime(*frameTime, printedPrecision(word));
    if (!isFrameRate(rate))
      m_scanner.fail("a frame time that makes " + std::string(kFrameRateExpected) + " expected, not " +
                     shown(word));
    if (std::abs(rate - asPrinted) > 1e-9 * rate)
      notes.push_back({TakeNote::Level::Info, "the frame time " + word + " s was taken as " +
                                                  shortNumber(rate) + " frames a second"});
    return rate;
  }

  // How far a printed number may be from what was meant: half its last digit, or the whole of it where the
  // digits are so many that one was more likely cut than rounded. Zeros at the end tell nothing.
  static double printedPrecision(std::string_view word) {
    size_t const exponent = std::min(word.find_first_of("eE"), word.size());
    size_t const point = std::min(word.find('.'), exponent);
    size_t const last = word.substr(0, exponent).find_last_not_of('0');
    int const digits = last == std::string_view::npos || last < point ? 0 : static_cast<int>(last - point);
    double const power = exponent < word.size() ? parseNumber(word.substr(exponent + 1)).value_or(0) : 0;
    return (digits >= 5 ? 1.0 : 0.5) * std::pow(10.0, power - digits);
  }

  [[noreturn]] void failExpecting(std::string const& expected) {
    std::string_view const word = m_scanner.peekWord();
    m_scanner.fail(expected + " expected, not " + found(word));
  }

  FileBytes const& m_bytes;
  TextScanner& m_scanner;
  size_t m_channelCount;
  int64 m_frameCount = 0;
  int64 m_oddLine = 0;
};

// BVH has no place for a unit.
void setUnit(Take& take, std::string const& path, ReadOptions const& options) {
  take.unitAssumed = options.unit.empty();
  take.fileUnit = take.unitAssumed ? "cm" : options.unit;
  take.unitInMillimetres = millimetresPerUnit(take.fileUnit);
  if (!(take.unitInMillimetres > 0))
    throw FileError(path, "the unit " + shown(options.unit) + " is not known");
  if (take.unitAssumed)
    take.notes.push_back({TakeNote::Level::Info, "the file names no length unit; centimetres were assumed"});
}

}  // namespace

Take readBVH(std::string const& path, ReadOptions const& options) {
  FileBytes const bytes(path);
  TextScanner scanner(bytes);
  Take take;
  take.format = "BVH";
  take.name = std::filesystem::path(path).stem().string();
  take.up = Axis::Y;
  take.upAssumed = true;
  take.notes.push_back({TakeNote::Level::Info, "the file names no up axis; y was assumed"});
  setUnit(take, path, options);

  BvhHierarchy hierarchy = readBvhHierarchy(scanner);
  take.joints = std::move(hierarchy.joints);
  take.notes.insert(take.notes.end(), hierarchy.notes.begin(), hierarchy.notes.end());
  for (TakeJoint& joint : take.joints) {
    joint.offset *= take.unitInMillimetres;
    if (!std::isfinite(joint.offset.x) || !std::isfinite(joint.offset.y) || !std::isfinite(joint.offset.z))
      throw FileError(path, "the OFFSET of " + shown(joint.name) + " is too large");
  }

  MotionReader motion(bytes, scanner, hierarchy.channelCount);
  motion.readHead(take);
  std::vector<JointMotion> joints;
  for (size_t i = 0; i < take.joints.size(); ++i)
    if (!hierarchy.channels[i].empty())
      joints.emplace_back(take.joints[i], hierarchy.channels[i], take.unitInMillimetres);
  motion.readFrames(joints, ticksPerFrameAt(take.rate), take.unitInMillimetres);
  return take;
}

}  // namespace talix
