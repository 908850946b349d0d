#include <algorithm>
#include <cctype>
#include <cmath>
#include <filesystem>

#include "io/FileError.h"
#include "io/TakeFormats.h"
#include "io/TextScanner.h"
#include "io/c3d/C3DData.h"
#include "io/c3d/C3DEvents.h"
#include "io/c3d/C3DLayout.h"
#include "io/c3d/C3DNames.h"

namespace talix {

namespace {

constexpr double kFrequentOrigin = 0.01;  // share of the point-frames at 0, 0, 0 that is worth a warning

class Reader {
 public:
  Reader(std::string const& path, ReadOptions const& options)
      : m_file(path),
        m_bytes(m_file),
        m_header(readC3DHeader(m_bytes, m_take.notes)),
        m_section(
            readC3DParameters(m_bytes, m_header.parameterStart + 4, m_header.declaredEnd, m_take.notes)),
        m_layout(findC3DLayout(m_bytes, m_header, m_section, m_take.notes)),
        m_names(m_section.parameters) {
    findUnit(options.unit);
  }

  Take read() {
    m_take.format = "C3D";
    m_take.name = std::filesystem::path(m_file.path()).stem().string();
    m_take.variant =
        std::string(c3dProcessorName(m_bytes.processor())) + (m_layout.real ? ", float" : ", integer");
    m_take.rate = m_layout.rate;
    m_take.firstFrame = m_layout.firstFrame;
    m_take.frameCount = m_layout.frameCount;
    findUpAxis();
    makePoints();
    makeAnalogChannels();
    tellOtherGroups();
    C3DDataCounts const counts = readC3DData(m_file, m_bytes.processor(), m_layout, pointTargets(),
                                             analogTargets(), m_take.analogRate);
    tellCounts(counts);
    m_take.events = readC3DEvents(m_bytes, parameters(), m_take.notes);
    return std::move(m_take);
  }

 private:
  C3DParameters const& parameters() const { return m_section.parameters; }
  void info(std::string const& text) { m_take.notes.push_back({TakeNote::Level::Info, text}); }
  void warn(std::string const& text) { m_take.notes.push_back({TakeNote::Level::Warning, text}); }

  void findUnit(std::string const& asked) {
    std::string const inFile = parameters().text("POINT", "UNITS");
    std::string const unit = asked.empty() ? inFile : asked;
    double const size = millimetresPerUnit(unit);
    if (!asked.empty() && size == 0)
      throw FileError(m_file.path(),
                      "the length unit \"" + asked + "\" is unknown; mm, cm, m, in and ft are known");
    m_take.unitAssumed = size == 0;
    if (size == 0) {
      info(inFile.empty() ? "the file names no length unit; mm is assumed"
                          : "the file's length unit \"" + inFile + "\" is unknown; mm is assumed");
      if (!inFile.empty()) m_take.fileUnit = inFile;
      return;
    }
    m_take.fileUnit = unit;
    m_take.unitInMillimetres = size;
    if (!asked.empty() && millimetresPerUnit(inFile) != size)
      info("lengths are read as " + asked + ", not as the file's " +
           (inFile.empty() ? "unnamed unit" : inFile));
  }

  // The screen's upward axis is the world's.
  void findUpAxis() {
    std::string const screen = parameters().text("POINT", "Y_SCREEN");
    for (char const c : screen) {
      int const axis = std::toupper(static_cast<unsigned char>(c)) - 'X';
      if (axis < 0 || axis > 2) continue;
      m_take.up = static_cast<Axis>(axis);
      return;
    }
    m_take.upAssumed = true;
    info("the file names no up axis; Z is assumed");
  }

  void makePoints() {
    size_t unnamed = 0;
    for (size_t i = 0; i < pointCount(); ++i) {
      if (C3DOutputKind const* kind = m_names.outputKind(i)) {
        m_take.outputs.push_back(
            {m_names.fullLabel(i), kind->unit, kind->kind, KeyTrack(KeyTrack::Shape::Vector)});
        continue;
      }
      C3DNames::Name const name = m_names.name(i);
      TakePoint point;
      point.subject = name.subject;
      point.label = name.label;
      point.description = m_names.description(i);
      if (point.label.empty()) ++unnamed;
      m_take.points.push_back(std::move(point));
    }
    if (unnamed) info(std::to_string(unnamed) + " points have no label");
  }

  // A take has no place for other groups, so a file written from it lacks them.
  void tellOtherGroups() {
    static constexpr std::string_view kRead[] = {"POINT", "ANALOG", "EVENT", "TRIAL", "SUBJECTS"};
    std::string names;
    for (C3DGroup const& group : parameters().groups) {
      if (group.parameters.empty() ||
          std::find(std::begin(kRead), std::end(kRead), group.name) != std::end(kRead))
        continue;
      names += (names.empty() ? "" : ", ") + group.name;
    }
    if (!names.empty()) info("these parameter groups are not kept: " + names);
  }

  size_t pointCount() const { return static_cast<size_t>(m_layout.pointCount); }

  // In the order of the file. The take's lists are complete by now, so their items stay where they are.
  std::vector<C3DPointTarget> pointTargets() {
    double const fileScale = m_layout.real ? 1 : m_layout.scale;
    std::vector<C3DPointTarget> targets;
    size_t point = 0, output = 0;
    for (size_t i = 0; i < pointCount(); ++i) {
      if (m_names.outputKind(i))
        targets.push_back({nullptr, &m_take.outputs[output++], fileScale, 0});
      else
        targets.push_back({&m_take.points[point++], nullptr, fileScale * m_take.unitInMillimetres,
                           m_layout.scale * m_take.unitInMillimetres});
    }
    return targets;
  }

  bool unsignedAnalog() const {
    std::string format = parameters().text("ANALOG", "FORMAT");
    for (char& c : format) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    return format.starts_with("UNSIGNED");
  }

  void makeAnalogChannels() {
    if (m_layout.channelCount == 0 || m_layout.samplesPerFrame == 0) return;
    m_take.analogRate = m_layout.rate * static_cast<double>(m_layout.samplesPerFrame);
    double const rate = parameters().number("ANALOG", "RATE", m_take.analogRate);
    if (std::abs(rate - m_take.analogRate) > 1e-6 * m_take.analogRate)
      info("ANALOG:RATE " + shortNumber(rate) + " Hz is not " + std::to_string(m_layout.samplesPerFrame) +
           " samples per frame; " + shortNumber(m_take.analogRate) + " Hz is taken");
    auto const labels = parameters().texts("ANALOG", "LABELS"), units = parameters().texts("ANALOG", "UNITS"),
               descriptions = parameters().texts("ANALOG", "DESCRIPTIONS");
    auto const scales = parameters().numbers("ANALOG", "SCALE"),
               offsets = parameters().numbers("ANALOG", "OFFSET");
    double const general = finiteOr(parameters().number("ANALOG", "GEN_SCALE", 1), 1);
    auto const textAt = [](std::vector<std::string> const& texts, size_t i) {
      return i < texts.size() ? texts[i] : std::string();
    };
    for (size_t i = 0; i < static_cast<size_t>(m_layout.channelCount); ++i) {
      TakeAnalogChannel channel;
      channel.name = textAt(labels, i);
      channel.unit = textAt(units, i);
      channel.description = textAt(descriptions, i);
      channel.scale = general * (i < scales.size() ? finiteOr(scales[i], 1) : 1);
      channel.offset = i < offsets.size() ? finiteOr(offsets[i], 0) : 0;
      if (unsignedAnalog()) channel.offset = c3dUnsigned(channel.offset);
      m_take.analog.push_back(std::move(channel));
    }
  }

  double finiteOr(double value, double fallback) {
    if (std::isfinite(value)) return value;
    warn("a scale or offset of the analog channels is not a number; " + shortNumber(fallback) + " is taken");
    return fallback;
  }

  std::vector<C3DAnalogTarget> analogTargets() {
    bool const isUnsigned = unsignedAnalog();
    std::vector<C3DAnalogTarget> targets;
    for (TakeAnalogChannel& channel : m_take.analog) targets.push_back({&channel, isUnsigned});
    return targets;
  }

  void tellCounts(C3DDataCounts const& counts) {
    if (counts.notFinite)
      info(std::to_string(counts.notFinite) + " point-frames hold no numbers and are read as not seen");
    if (counts.badSamples)
      warn(std::to_string(counts.badSamples) + " analog samples hold no numbers and are left out");
    if (static_cast<double>(counts.atOrigin) > kFrequentOrigin * static_cast<double>(counts.seen))
      warn(std::to_string(counts.atOrigin) + " of " + std::to_string(counts.seen) +
           " point-frames lie at exactly 0, 0, 0; the file may mean points that were not seen");
  }

  Take m_take;
  FileBytes m_file;
  C3DBytes m_bytes;
  C3DHeader m_header;
  C3DParameterSection m_section;
  C3DLayout m_layout;
  C3DNames m_names;
};

}  // namespace

Take readC3D(std::string const& path, ReadOptions const& options) { return Reader(path, options).read(); }

}  // namespace talix
