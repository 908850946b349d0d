#include "io/bvh/BvhHierarchy.h"

#include <algorithm>
#include <cmath>

namespace talix {

namespace {

class HierarchyReader {
 public:
  explicit HierarchyReader(TextScanner& scanner) : m_scanner(scanner) {}

  BvhHierarchy read() {
    if (!equalsIgnoringCase(m_scanner.takeWord(), "hierarchy"))
      m_scanner.fail("HIERARCHY expected at the start of a BVH file");
    while (readStatement()) {
    }
    return std::move(m_result);
  }

 private:
  // A joint or end site whose closing brace has not come yet.
  struct Open {
    int joint;
    int64 line;
    bool hasOffset = false;
    bool hasChannels = false;
    int endSites = 0;
  };

  // False once MOTION is read.
  bool readStatement() {
    std::string_view const word = m_scanner.takeWord();
    if (m_open.empty()) return readTopLevel(word);
    bool const inEndSite = joint(m_open.back()).endSite;
    if (equalsIgnoringCase(word, "offset")) {
      readOffset();
    } else if (equalsIgnoringCase(word, "channels") && !inEndSite) {
      readChannels();
    } else if (equalsIgnoringCase(word, "joint") && !inEndSite) {
      openJoint(m_open.back().joint);
    } else if (equalsIgnoringCase(word, "end") && !inEndSite) {
      openEndSite();
    } else if (word == "}") {
      close();
    } else {
      failInside(word, inEndSite);
    }
    return true;
  }

  bool readTopLevel(std::string_view word) {
    if (equalsIgnoringCase(word, "root")) {
      openJoint(-1);
      return true;
    }
    if (!equalsIgnoringCase(word, "motion"))
      m_scanner.fail((m_result.joints.empty() ? "ROOT expected, not " : "ROOT or MOTION expected, not ") +
                     found(word));
    if (m_result.joints.empty()) m_scanner.fail("ROOT expected before MOTION");
    return false;
  }

  [[noreturn]] void failInside(std::string_view word, bool inEndSite) {
    Open const& open = m_open.back();
    std::string const expected = inEndSite ? "OFFSET or \"}\"" : "OFFSET, CHANNELS, JOINT, End Site or \"}\"";
    m_scanner.fail(expected + " expected, not " + found(word) + "; " + shown(joint(open).name) + " of line " +
                   std::to_string(open.line) + " is still open");
  }

  void openJoint(int parent) {
    int64 const line = m_scanner.line();
    TakeJoint added;
    added.name = m_scanner.takeRestOfLine();
    if (added.name.empty()) m_scanner.failAt(line, "a joint name expected");
    added.parent = parent;
    open(std::move(added), line);
  }

  void openEndSite() {
    Open& parent = m_open.back();
    int64 const line = m_scanner.line();
    m_scanner.takeRestOfLine();  // "Site"
    TakeJoint added;
    added.name = joint(parent).name + "_end";
    if (++parent.endSites > 1) added.name += std::to_string(parent.endSites);
    added.parent = parent.joint;
    added.endSite = true;
    open(std::move(added), line);
  }

  void open(TakeJoint added, int64 line) {
    if (auto const word = m_scanner.takeWord(); word != "{")
      m_scanner.fail("\"{\" expected after " + shown(added.name) + ", not " + found(word));
    if (m_open.size() == kDeepestBvhNesting)
      m_scanner.failAt(line, "joints nested deeper than " + std::to_string(kDeepestBvhNesting));
    m_open.push_back({.joint = static_cast<int>(m_result.joints.size()), .line = line});
    m_result.joints.push_back(std::move(added));
    m_result.channels.emplace_back();
  }

  void close() {
    Open const& closed = m_open.back();
    if (!closed.hasOffset)
      m_result.notes.push_back({TakeNote::Level::Warning, "line " + std::to_string(closed.line) + ": " +
                                                              shown(joint(closed).name) +
                                                              " has no OFFSET; 0 0 0 assumed"});
    m_open.pop_back();
  }

  void readOffset() {
    if (std::exchange(m_open.back().hasOffset, true)) m_scanner.fail("a second OFFSET for one joint");
    Vec3& offset = joint(m_open.back()).offset;
    for (int axis = 0; axis < 3; ++axis) offset[axis] = m_scanner.takeNumber("an OFFSET of three numbers");
  }

  void readChannels() {
    if (std::exchange(m_open.back().hasChannels, true))
      m_scanner.fail("CHANNELS a second time for one joint");
    double const count = m_scanner.takeNumber("the number of channels");
    if (count < 0 || count != std::floor(count))
      m_scanner.fail("the number of channels expected after CHANNELS");
    auto& channels = m_result.channels[static_cast<size_t>(m_open.back().joint)];
    for (double i = 0; i < count; ++i) channels.push_back(takeChannel(channels));
    m_result.channelCount += channels.size();
    TakeJoint& of = joint(m_open.back());
    for (BvhChannel const& channel : channels) of.channels.push_back(bvhChannelName(channel));
    of.rotationOrder = rotationOrderOf(rotationAxes(channels));
  }

  BvhChannel takeChannel(std::vector<BvhChannel> const& before) {
    std::string_view const name = m_scanner.takeWord();
    auto const channel = bvhChannel(name);
    if (!channel)
      m_scanner.fail(
          "a channel expected (Xposition, Yposition, Zposition, Xrotation, Yrotation, Zrotation), not " +
          found(name));
    // Axes may turn twice, but a place along an axis cannot be two numbers.
    if (!channel->isRotation && std::find(before.begin(), before.end(), *channel) != before.end())
      m_scanner.fail(bvhChannelName(*channel) + " is given twice for one joint");
    return *channel;
  }

  TakeJoint& joint(Open const& open) { return m_result.joints[static_cast<size_t>(open.joint)]; }

  TextScanner& m_scanner;
  BvhHierarchy m_result;
  std::vector<Open> m_open;
};

}  // namespace

BvhHierarchy readBvhHierarchy(TextScanner& scanner) { return HierarchyReader(scanner).read(); }

}  // namespace talix
