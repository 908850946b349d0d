// Writes a take's joints as BVH.
#include <algorithm>
#include <charconv>
#include <cmath>

#include "host/math/Degrees.h"
#include "io/FileBytes.h"
#include "io/FileError.h"
#include "io/FileProgress.h"
#include "io/TakeFormats.h"
#include "io/TextScanner.h"
#include "io/bvh/BvhChannels.h"
#include "io/bvh/EulerFilter.h"

namespace talix {

namespace {

// Nine decimals hold a position in metres to a millionth of a millimetre; more would print rounding errors.
void appendNumber(std::string& text, double value) {
  constexpr int kDecimals = 9;
  constexpr double kLargestFixed = 1e15;
  char digits[64];
  char* end = std::abs(value) < kLargestFixed
                  ? std::to_chars(digits, std::end(digits), value, std::chars_format::fixed, kDecimals).ptr
                  : std::to_chars(digits, std::end(digits), value).ptr;
  if (std::abs(value) < kLargestFixed) {
    while (end[-1] == '0') --end;
    if (end[-1] == '.') --end;
  }
  std::string_view const written(digits, static_cast<size_t>(end - digits));
  text += written == "-0" ? "0" : written;
}

// Names stand on one line before a brace.
std::string fileName(std::string const& name) {
  std::string result(trimmed(name));
  for (char& c : result)
    if (c == '{' || c == '}' || c == '\n' || c == '\r') c = '_';
  return result.empty() ? "joint" : result;
}

std::vector<BvhChannel> usualChannels(JointSource const& joint) {
  std::vector<BvhChannel> channels;
  if (joint.parent < 0 || joint.translations)
    for (int axis = 0; axis < 3; ++axis) channels.push_back({false, axis});
  for (int turn = 2; turn >= 0; --turn) channels.push_back({true, kOrderAxes[joint.rotationOrder][turn]});
  return channels;
}

// The channels that the joint names; empty when it names none, or some that cannot be written.
std::vector<BvhChannel> namedChannels(JointSource const& joint) {
  std::vector<BvhChannel> channels;
  for (std::string const& name : joint.channels) {
    auto const channel = bvhChannel(name);
    // Angles about an axis that turns twice would not be unique.
    if (!channel || std::find(channels.begin(), channels.end(), *channel) != channels.end()) return {};
    channels.push_back(*channel);
  }
  return channels;
}

// One joint of the file: its channels and where its values come from.
class JointWriter {
 public:
  JointWriter(JointSource const& joint, std::vector<BvhChannel> channels, double millimetres)
      : m_joint(joint),
        m_channels(std::move(channels)),
        m_millimetres(millimetres),
        m_places(joint.translations.get(), 3),
        m_turns(joint.rotations.get(), 4),
        m_unroller(rotationOrderOf(rotationAxes(m_channels)), rotationAxes(m_channels).size() == 3) {
    for (BvhChannel const& channel : m_channels)
      (channel.isRotation ? m_written[channel.axis] : m_moves) = true;
  }

  JointSource const& joint() const { return m_joint; }
  std::vector<BvhChannel> const& channels() const { return m_channels; }
  bool moves() const { return m_moves; }
  bool turns() const { return m_written[0] || m_written[1] || m_written[2]; }
  // The largest angle, in radians, about an axis that has no channel.
  double lostTurn() const { return m_lostTurn; }

  void read(SampleTimes const& times) {
    if (m_moves) m_places.read(times);
    m_turns.read(times);
  }

  // By its index in the block that was read.
  void appendFrame(std::string& row, int64 i) {
    constexpr double kUnturned[] = {0, 0, 0, 1};
    double const *place = m_moves ? m_places.at(i) : nullptr, *turn = m_turns.at(i);
    Vec3 const angles = turns() ? m_unroller.next(turn ? turn : kUnturned) : Vec3();
    for (int axis = 0; axis < 3; ++axis)
      if (!m_written[axis]) m_lostTurn = std::max(m_lostTurn, std::abs(angles[axis]));
    for (BvhChannel const& channel : m_channels) {
      if (!row.empty()) row += ' ';
      appendNumber(row, channel.isRotation
                            ? angles[channel.axis] * kDegreesPerRadian
                            : (place ? place : &m_joint.offset.x)[channel.axis] / m_millimetres);
    }
  }

 private:
  JointSource const& m_joint;
  std::vector<BvhChannel> m_channels;
  double m_millimetres;
  bool m_written[3] = {};  // rotation channels, by axis
  bool m_moves = false;
  double m_lostTurn = 0;
  SampleBlock m_places, m_turns;
  EulerFilter m_unroller;
};

class BvhWriter {
 public:
  BvhWriter(TakeSource const& take, std::string const& path, std::vector<TakeNote>& notes)
      : m_take(take), m_path(path), m_notes(notes) {
    if (take.joints.empty()) throw FileError(path, "BVH holds joints only, and the take has none");
    if (!(take.rate > 0) || !(take.unitInMillimetres > 0))
      throw FileError(path, "the take has no rate or no unit");
    m_children.resize(take.joints.size());
    for (size_t i = 0; i < take.joints.size(); ++i) {
      int const parent = take.joints[i].parent;
      if (parent >= static_cast<int>(i))
        throw FileError(path, "joint " + shown(take.joints[i].name) + " comes before its parent");
      if (parent >= 0) m_children[static_cast<size_t>(parent)].push_back(i);
    }
  }

  void write() {
    writeHierarchyText();
    warnOfWhatIsLeftOut();
    writeFileAtomically(m_path, [&](std::ostream& out) { writeTo(out); });
    warnOfLostTurns();
  }

 private:
  bool isEndSite(size_t i) const {
    JointSource const& joint = m_take.joints[i];
    return joint.endSite && joint.parent >= 0 && m_children[i].empty() && !joint.translations &&
           !joint.rotations;
  }

  // Depth first without recursion: a joint's closing brace waits on the stack below its children.
  void writeHierarchyText() {
    struct Step {
      size_t joint;
      size_t depth;
      bool closing;
    };
    m_hierarchy = "HIERARCHY\n";
    std::vector<Step> steps;
    for (size_t i = m_take.joints.size(); i-- > 0;)
      if (m_take.joints[i].parent < 0) steps.push_back({i, 0, false});
    while (!steps.empty()) {
      Step const step = steps.back();
      steps.pop_back();
      std::string const indent(step.depth, '\t');
      if (step.closing) {
        m_hierarchy += indent + "}\n";
        continue;
      }
      openJoint(step.joint, indent);
      steps.push_back({step.joint, step.depth, true});
      auto const& children = m_children[step.joint];
      for (auto child = children.rbegin(); child != children.rend(); ++child)
        steps.push_back({*child, step.depth + 1, false});
    }
  }

  void openJoint(size_t index, std::string const& indent) {
    JointSource const& joint = m_take.joints[index];
    bool const endSite = isEndSite(index);
    std::string const name = fileName(joint.name);
    if (!endSite && name != joint.name)
      warn("the name " + shown(joint.name) + " was written as " + shown(name));
    if (endSite && joint.name.rfind(m_take.joints[static_cast<size_t>(joint.parent)].name + "_end", 0) != 0)
      ++m_endSiteNames;
    m_hierarchy += indent + (endSite ? "End Site" : (joint.parent < 0 ? "ROOT " : "JOINT ") + name) + "\n" +
                   indent + "{\n";
    m_hierarchy += indent + "\tOFFSET";
    for (int axis = 0; axis < 3; ++axis) {
      m_hierarchy += ' ';
      appendNumber(m_hierarchy, joint.offset[axis] / m_take.unitInMillimetres);
    }
    m_hierarchy += '\n';
    if (endSite) return;
    auto const channels = channelsOf(joint);
    m_hierarchy += indent + "\tCHANNELS " + std::to_string(channels.size());
    for (BvhChannel const& channel : channels) m_hierarchy += ' ' + bvhChannelName(channel);
    m_hierarchy += '\n';
    m_joints.emplace_back(joint, channels, m_take.unitInMillimetres);
  }

  std::vector<BvhChannel> channelsOf(JointSource const& joint) {
    auto channels = namedChannels(joint);
    if (!channels.empty()) return channels;
    if (!joint.channels.empty())
      warn("the channels of " + shown(joint.name) + " were replaced by the usual ones");
    return usualChannels(joint);
  }

  void writeTo(std::ostream& out) {
    std::string row = std::to_string(m_take.frameCount);
    out << m_hierarchy << "MOTION\nFrames: " << row << "\nFrame Time: ";
    char digits[32];
    out.write(digits, std::to_chars(digits, std::end(digits), 1 / m_take.rate).ptr - digits) << '\n';
    FileProgress progress("Saving", m_path);
    SampleTimes const frames = m_take.frameTimes();
    int64 const length = SampleBlock::lengthFor(7 * m_joints.size());
    for (int64 first = 0; first < frames.count(); first += length) {
      progress.tell(static_cast<uint64>(first), static_cast<uint64>(frames.count()));
      int64 const count = std::min(length, frames.count() - first);
      for (JointWriter& joint : m_joints) joint.read(frames.part(first, count));
      for (int64 i = 0; i < count; ++i) {
        row.clear();
        for (JointWriter& joint : m_joints) joint.appendFrame(row, i);
        out << row << '\n';
      }
    }
  }

  void warn(std::string const& text) { m_notes.push_back({TakeNote::Level::Warning, text}); }
  void warnOfCount(size_t count, char const* what) {
    if (count) warn("BVH holds no " + std::string(what) + "; " + std::to_string(count) + " left out");
  }

  void warnOfWhatIsLeftOut() {
    constexpr double kCentimetre = 10;  // what readers assume
    warnOfCount(m_take.points.size(), "points");
    warnOfCount(m_take.outputs.size(), "computed outputs");
    warnOfCount(m_take.analog.size(), "analog channels");
    warnOfCount(m_take.events.size(), "events");
    warnOfCount(m_endSiteNames, "names of end sites");
    if (m_take.firstFrame != 0)
      warn("BVH frames count from 0; the first frame was " + std::to_string(m_take.firstFrame));
    if (m_take.unitInMillimetres != kCentimetre)
      warn("BVH names no length unit; the lengths are in " + m_take.fileUnit);
    if (m_take.up != Axis::Y)
      warn(std::string("BVH names no up axis; up is ") + (m_take.up == Axis::Z ? "z" : "x"));
    int64 leftOut = 0;
    size_t tracks = 0;
    for (JointWriter const& joint : m_joints) {
      leftOut += keysOffFrames(joint.joint().translations) + keysOffFrames(joint.joint().rotations);
      tracks += !joint.moves() && joint.joint().translations;
    }
    if (leftOut)
      warn("BVH holds whole frames only; " + std::to_string(leftOut) +
           " keys between or outside the frames were left out");
    if (tracks)
      warn(std::to_string(tracks) +
           " joints move but have no position channels; their translations were left out");
  }

  int64 keysOffFrames(SampleSourcePtr const& source) const {
    return source ? source->leftOut(m_take.frameTimes()).off() : 0;
  }

  void warnOfLostTurns() {
    constexpr double kVisible = 1e-6;
    for (JointWriter const& joint : m_joints)
      if ((joint.turns() && joint.lostTurn() > kVisible) || (!joint.turns() && joint.joint().rotations))
        warn(shown(joint.joint().name) + " turns about an axis that has no channel; that turn was left out");
  }

  TakeSource const& m_take;
  std::string const& m_path;
  std::vector<TakeNote>& m_notes;
  std::vector<std::vector<size_t>> m_children;  // by joint
  std::string m_hierarchy;
  std::vector<JointWriter> m_joints;  // in the order of the file
  size_t m_endSiteNames = 0;
};

}  // namespace

void writeBVH(TakeSource const& take, std::string const& path, std::vector<TakeNote>& notes) {
  BvhWriter(take, path, notes).write();
}

}  // namespace talix
