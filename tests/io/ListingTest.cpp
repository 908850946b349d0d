// What the readers make of every take in tests/data, small and malformed ones included, against a listing
// that is checked in. With TALIX_UPDATE=1 in the environment the listing is written anew, to be read before
// it is committed.
#include <cstdlib>
#include <fstream>
#include <gtest/gtest.h>
#include <numeric>
#include <sstream>

#include "io/TakeFormats.h"
#include "tests/io/TakeTesting.h"

namespace talix {
namespace {

namespace fs = std::filesystem;

constexpr int64 kFewKeys = 8;  // listed one by one

std::string shortText(double value) {
  char text[32];
  std::snprintf(text, sizeof text, "%.9g", value + 0.0);
  return text;
}

class Listing {
 public:
  std::string write(Take const& take) {
    m_out << "  " << take.format << " " << take.name << (take.variant.empty() ? "" : ", ") << take.variant
          << ": " << shortText(take.rate) << " Hz, " << take.frameCount << " frames from " << take.firstFrame
          << ", " << take.fileUnit << " of " << shortText(take.unitInMillimetres) << " mm"
          << (take.unitAssumed ? " (assumed)" : "") << ", up "
          << "xyz"[static_cast<int>(take.up)] << (take.upAssumed ? " (assumed)" : "") << "\n";
    for (TakeNote const& note : take.notes)
      m_out << "  " << (note.level == TakeNote::Level::Warning ? "warning: " : "info: ") << note.text << "\n";
    m_period = ticksPerFrameAt(take.rate);
    for (TakePoint const& point : take.points) addPoint(point);
    for (ModelOutput const& output : take.outputs)
      addTrack("output " + output.name + " " + output.kind + " " + output.unit, output.values);
    for (TakeJoint const& joint : take.joints) addJoint(joint);
    for (TakeEvent const& event : take.events)
      m_out << "  event " << event.label << ", " << event.context << ", " << event.subject << ", "
            << event.description << ": " << shortText(event.seconds) << "\n";
    m_period = take.analogRate > 0 ? ticksPerFrameAt(take.analogRate) : 1;
    for (TakeAnalogChannel const& channel : take.analog)
      addTrack("analog " + channel.name + ", " + channel.unit + ", " + channel.description + ", * " +
                   shortText(channel.scale) + " + " + shortText(channel.offset) + " at " +
                   shortText(take.analogRate) + " Hz",
               channel.samples);
    return m_out.str();
  }

 private:
  void addPoint(TakePoint const& point) {
    addTrack("point " + point.subject + ":" + point.label + ", " + point.description, point.positions);
    if (!point.residuals.empty()) addTrack("  residuals", point.residuals);
    if (point.cameras.empty()) return;
    m_out << "    cameras of " << point.cameras.size() << " frames, sum "
          << std::accumulate(point.cameras.begin(), point.cameras.end(), int64{0}) << "\n";
  }

  void addJoint(TakeJoint const& joint) {
    m_out << "  joint " << joint.name << (joint.endSite ? " (end)" : "") << " below " << joint.parent
          << ", order " << joint.rotationOrder << ", at";
    for (int axis = 0; axis < 3; ++axis) m_out << " " << shortText(joint.offset[axis]);
    for (std::string const& channel : joint.channels) m_out << " " << channel;
    m_out << "\n";
    if (!joint.translations.empty()) addTrack("  translations", joint.translations);
    if (!joint.rotations.empty()) addTrack("  rotations", joint.rotations);
  }

  void addTrack(std::string const& what, KeyTrack const& track) {
    EXPECT_STREQ(track.checkInvariants(), "");
    m_out << "  " << what << ": " << track.count() << " keys";
    int64 index = 0, runs = 0, former = 0;
    KeyTrack::Values sum{};
    track.forEach(0, track.count(), [&](KeyTrack::Key const& key) {
      runs += index == 0 || key.time - former != m_period;
      former = key.time;
      for (size_t c = 0; c < sum.size(); ++c) sum[c] += key.values[c];
      if (track.count() <= kFewKeys || index == 0 || index + 1 == track.count())
        add(track, shortText(static_cast<double>(key.time) / static_cast<double>(m_period)) + "=",
            key.values);
      ++index;
    });
    if (track.count() > kFewKeys) {
      for (double& value : sum) value /= static_cast<double>(track.count());
      add(track, "mean ", sum);
      m_out << "; runs: " << runs;
    }
    m_out << "\n";
  }

  void add(KeyTrack const& track, std::string const& what, KeyTrack::Values const& values) {
    m_out << "; " << what;
    for (size_t c = 0; c < static_cast<size_t>(track.width()); ++c)
      m_out << (c ? " " : "") << shortText(values[c]);
  }

  std::ostringstream m_out;
  int64 m_period = 1;
};

TEST(Listing, EveryTakeIsReadAsListed) {
  std::vector<std::string> names;
  for (char const* folder : {"", "small/"})
    for (auto const& entry : fs::directory_iterator(dataFile(folder)))
      if (std::string const suffix = entry.path().extension();
          suffix == ".c3d" || suffix == ".bvh" || suffix == ".trc")
        names.push_back(folder + entry.path().filename().string());
  std::sort(names.begin(), names.end());
  std::string found;
  for (std::string const& name : names) {
    std::string error = errorOf([&] { found += name + "\n" + Listing().write(readTake(dataFile(name))); });
    // The path up to the data is that of this machine.
    if (error.starts_with(dataFile(""))) error.erase(0, dataFile("").size());
    if (!error.empty()) found += name + "\n  error: " + error + "\n";
  }
  std::string const path = dataFile("golden/takes.txt");
  if (std::getenv("TALIX_UPDATE")) std::ofstream(path, std::ios::binary) << found;
  std::string const expected = readText(path);
  std::istringstream was(expected), is(found);
  std::string take, one, other;
  for (int line = 1; std::getline(was, one) && std::getline(is, other); ++line) {
    if (!one.starts_with(" ")) take = one;
    ASSERT_EQ(one, other) << "in " << take << ", line " << line << " of " << path;
  }
  EXPECT_EQ(found.size(), expected.size());
}

}  // namespace
}  // namespace talix
