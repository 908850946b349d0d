#include <algorithm>
#include <cmath>
#include <map>

#include "host/time/Ticks.h"
#include "io/FileBytes.h"
#include "io/FileError.h"
#include "io/FileProgress.h"
#include "io/TakeFormats.h"
#include "io/c3d/C3DBytes.h"
#include "io/c3d/C3DDataWriter.h"
#include "io/c3d/C3DEvents.h"
#include "io/c3d/C3DParameterWriter.h"

namespace talix {

namespace {

using Type = C3DParameter::Type;

constexpr int64 kMostInWord = 65535;
constexpr int64 kMostFrameNumber = 4294967295;

std::string fullLabel(std::string const& subject, std::string const& label) {
  return subject.empty() ? label : subject + ":" + label;
}

double asReal(double value) { return static_cast<float>(value); }

class Writer {
 public:
  Writer(TakeSource const& take, std::string const& path, std::vector<TakeNote>& notes)
      : m_take(take), m_path(path), m_notes(notes) {}

  void write() {
    check();
    planFrames();
    planAnalog();
    planScale();
    tellLeftOvers();
    makePoints();
    makeAnalog();
    makeTrial();
    makeSubjects();
    addC3DEvents(m_take.events, m_parameters, m_notes);
    std::string const head = headAndParameters();
    C3DDataLosses losses;
    FileProgress progress("Saving", m_path);
    writeFileAtomically(m_path, [&](std::ostream& out) {
      out << head;
      losses = writeC3DData(m_take, m_plan, out, [&](int64 frame) {
        progress.tell(static_cast<uint64>(frame), static_cast<uint64>(m_take.frameCount));
      });
    });
    tellLosses(losses);
  }

 private:
  void note(TakeNote::Level level, std::string const& text) { m_notes.push_back({level, text}); }
  void warn(std::string const& text) { note(TakeNote::Level::Warning, text); }
  size_t pointCount() const { return m_take.points.size() + m_take.outputs.size(); }
  size_t channelCount() const { return m_plan.withAnalog ? m_take.analog.size() : 0; }

  void check() const {
    if (pointCount() > kMostInWord || m_take.analog.size() > kMostInWord)
      throw FileError(m_path,
                      "a C3D file holds at most 65535 points and 65535 analog channels, the take has " +
                          std::to_string(pointCount()) + " and " + std::to_string(m_take.analog.size()));
    if (!(m_take.rate > 0) || !std::isfinite(asReal(m_take.rate)))
      throw FileError(m_path,
                      "a C3D file needs a frame rate above 0, the take has " + std::to_string(m_take.rate));
    if (m_take.frameCount < 0 || m_take.firstFrame > kMostFrameNumber - m_take.frameCount)
      throw FileError(m_path, "a C3D file holds frames 0 to 4294967295, the take starts at " +
                                  std::to_string(m_take.firstFrame) + " and has " +
                                  std::to_string(m_take.frameCount));
  }

  void planFrames() {
    m_plan.frames = m_take.frameTimes();
    m_first = m_take.firstFrame;
    if (m_first >= 0) return;
    m_first = 1;
    warn("C3D cannot hold frames below 0: frame " + std::to_string(m_take.firstFrame) +
         " is written as frame 1");
  }

  void planAnalog() {
    if (m_take.analog.empty()) return;
    double const ratio = m_take.analogRate / m_take.rate;
    bool const whole =
        ratio > 0.5 && ratio <= kMostInWord && std::abs(ratio - std::round(ratio)) < 1e-6 * ratio;
    if (!whole) {
      warn("C3D cannot hold an analog rate that is no multiple of the frame rate: " +
           std::to_string(m_take.analog.size()) + " analog channels are not written");
      return;
    }
    m_plan.withAnalog = true;
    m_plan.samplesPerFrame = std::llround(ratio);
    m_plan.samples = {m_plan.frames[0], ticksPerFrameAt(m_take.analogRate),
                      m_take.frameCount * m_plan.samplesPerFrame};
  }

  void planScale() {
    double const unit = millimetresPerUnit(m_take.fileUnit);
    m_unitName = unit > 0 ? m_take.fileUnit : "mm";
    m_plan.unit = unit > 0 ? unit : 1;
    bool exact = true;
    m_plan.residualStep = c3dResidualStep(m_take, m_plan.frames, exact);
    if (!exact)
      note(TakeNote::Level::Info,
           "residuals are written in steps of " + std::to_string(m_plan.residualStep) + " mm");
  }

  void tellLeftOvers() {
    if (!m_take.joints.empty())
      warn("C3D cannot hold skeletons: " + std::to_string(m_take.joints.size()) + " joints are not written");
    for (size_t i = 0; i < m_take.points.size(); ++i) {
      tellLeftOut(m_take.points[i].positions, m_plan.frames, "keys of " + labelOf(i));
      tellLeftOut(m_take.points[i].residuals, m_plan.frames, "residuals of " + labelOf(i));
    }
    for (ModelOutputSource const& output : m_take.outputs)
      tellLeftOut(output.values, m_plan.frames, "keys of " + output.name);
    if (!m_plan.withAnalog) return;
    for (AnalogSource const& channel : m_take.analog)
      tellLeftOut(channel.samples, m_plan.samples, "samples of " + channel.name);
  }

  void tellLeftOut(SampleSourcePtr const& source, SampleTimes const& times, std::string const& what) {
    if (!source) return;
    SampleSource::LeftOut const left = source->leftOut(times);
    auto const tell = [&](int64 count, char const* why) {
      if (count) warn(std::to_string(count) + " " + what + " " + why + " and are not written");
    };
    tell(left.between, "lie between frames");
    tell(left.outside, "lie outside the take's frames");
    tell(left.partial, "have no value on some axes");
  }

  void tellLosses(C3DDataLosses const& losses) {
    if (losses.positions)
      warn(std::to_string(losses.positions) +
           " positions are no numbers that C3D can hold; written as not seen");
    for (size_t const point : losses.camerasOf)
      warn("C3D holds seven cameras: the eighth of " + labelOf(point) + " is not written");
    if (losses.samples) warn(std::to_string(losses.samples) + " analog samples are missing; written as 0");
  }

  // An unlabelled point gets a label that is read back as none.
  std::string labelOf(size_t point) const {
    PointSource const& p = m_take.points[point];
    return p.label.empty() ? "*" + std::to_string(point + 1) : fullLabel(p.subject, p.label);
  }

  void makePoints() {
    std::vector<std::string> labels, descriptions;
    for (size_t i = 0; i < m_take.points.size(); ++i) {
      labels.push_back(labelOf(i));
      descriptions.push_back(m_take.points[i].description);
    }
    for (ModelOutputSource const& output : m_take.outputs) {
      labels.push_back(output.name);
      descriptions.emplace_back();
    }
    C3DGroupWriter group(m_parameters, "POINT", "3-D points", m_notes);
    group.number("USED", Type::Integer, static_cast<double>(pointCount()));
    group.number("SCALE", Type::Real, -m_plan.residualStep / m_plan.unit);
    group.number("RATE", Type::Real, m_take.rate);
    // Filled in when the length of the section is known.
    group.number("DATA_START", Type::Integer, 0);
    // Too long a take for an integer has its count as a real, here and exactly in TRIAL.
    group.number("FRAMES", m_take.frameCount <= kMostInWord ? Type::Integer : Type::Real,
                 static_cast<double>(m_take.frameCount));
    group.text("UNITS", m_unitName);
    static std::map<Axis, std::pair<char const*, char const*>> const kScreens = {
        {Axis::X, {"+Y", "+X"}}, {Axis::Y, {"+X", "+Y"}}, {Axis::Z, {"+X", "+Z"}}};
    group.text("X_SCREEN", kScreens.at(m_take.up).first);
    group.text("Y_SCREEN", kScreens.at(m_take.up).second);
    group.texts("LABELS", labels);
    group.texts("DESCRIPTIONS", descriptions);
    addOutputs(group);
  }

  void addOutputs(C3DGroupWriter& group) {
    std::map<std::string, std::vector<std::string>> labels;
    std::map<std::string, std::string> units;
    for (ModelOutputSource const& output : m_take.outputs) {
      std::string const kind = output.kind.empty() ? "SCALARS" : output.kind;
      labels[kind].push_back(output.name);
      auto const [unit, first] = units.emplace(kind, output.unit);
      if (!first && unit->second != output.unit)
        warn("C3D holds one unit for all " + kind + ": that of " + output.name + ", " + output.unit +
             ", is not written");
    }
    std::vector<std::string> pairs;
    for (auto const& [kind, names] : labels) {
      std::string const singular = kind.ends_with('S') ? kind.substr(0, kind.size() - 1) : kind;
      group.texts(kind, names);
      group.text(singular + "_UNITS", units[kind]);
      pairs.insert(pairs.end(), {kind, singular});
    }
    if (!pairs.empty()) group.pairs("TYPE_GROUPS", pairs);
  }

  void makeAnalog() {
    C3DGroupWriter group(m_parameters, "ANALOG", "Analog channels", m_notes);
    group.number("USED", Type::Integer, static_cast<double>(channelCount()));
    group.number("GEN_SCALE", Type::Real, 1);
    group.number("RATE", Type::Real, m_take.rate * static_cast<double>(m_plan.samplesPerFrame));
    if (channelCount() == 0) return;
    std::vector<std::string> names, units, descriptions;
    for (AnalogSource const& channel : m_take.analog) {
      names.push_back(channel.name);
      units.push_back(channel.unit);
      descriptions.push_back(channel.description);
    }
    group.texts("LABELS", names);
    group.texts("UNITS", units);
    group.texts("DESCRIPTIONS", descriptions);
    group.numbers("SCALE", Type::Real, std::vector<double>(names.size(), 1));
    group.numbers("OFFSET", Type::Integer, std::vector<double>(names.size(), 0));
    group.text("FORMAT", "SIGNED");
  }

  void makeTrial() {
    if (m_take.frameCount == 0) return;
    C3DGroupWriter group(m_parameters, "TRIAL", "First and last frame", m_notes);
    auto const words = [](int64 frame) {
      return std::vector<double>{static_cast<double>(frame & kMostInWord), static_cast<double>(frame >> 16)};
    };
    group.numbers("ACTUAL_START_FIELD", Type::Integer, words(m_first));
    group.numbers("ACTUAL_END_FIELD", Type::Integer, words(m_first + m_take.frameCount - 1));
  }

  void makeSubjects() {
    std::vector<std::string> names, prefixes;
    for (PointSource const& point : m_take.points)
      if (!point.subject.empty() && std::find(names.begin(), names.end(), point.subject) == names.end()) {
        names.push_back(point.subject);
        prefixes.push_back(point.subject + ":");
      }
    if (names.empty()) return;
    C3DGroupWriter group(m_parameters, "SUBJECTS", "Whose the points are", m_notes);
    group.number("USED", Type::Integer, static_cast<double>(names.size()));
    group.texts("NAMES", names);
    group.texts("LABEL_PREFIXES", prefixes);
    group.numbers("USES_PREFIXES", Type::Integer, std::vector<double>(names.size(), 1));
  }

  std::string headAndParameters() {
    size_t const dataBlock = 2 + c3dParameterSection(m_parameters).size() / kC3DBlock;
    if (dataBlock > kMostInWord)
      throw FileError(m_path, "the labels and descriptions take more room than a C3D file has for them");
    if (dataBlock > 255 + 2)
      note(TakeNote::Level::Info,
           "the parameters take more than 255 blocks; some programs may not read them all");
    for (C3DParameter& parameter : m_parameters.groups[0].parameters)
      if (parameter.name == "DATA_START") parameter.numbers[0] = static_cast<double>(dataBlock);
    return header(dataBlock) + c3dParameterSection(m_parameters);
  }

  static unsigned word(int64 value) { return static_cast<unsigned>(std::min(value, kMostInWord)); }

  std::string header(size_t dataBlock) const {
    int64 const first = m_take.frameCount ? m_first : 1;
    std::string bytes = "\x02\x50";
    appendC3DWord(bytes, word(static_cast<int64>(pointCount())));
    appendC3DWord(bytes, word(static_cast<int64>(channelCount()) * m_plan.samplesPerFrame));
    appendC3DWord(bytes, word(first));
    appendC3DWord(bytes, word(first + m_take.frameCount - 1));
    appendC3DWord(bytes, 0);  // longest gap that was filled
    appendC3DReal(bytes, -m_plan.residualStep / m_plan.unit);
    appendC3DWord(bytes, static_cast<unsigned>(dataBlock));
    appendC3DWord(bytes, word(m_plan.samplesPerFrame));
    appendC3DReal(bytes, m_take.rate);
    bytes.resize(kC3DBlock, '\0');
    return bytes;
  }

  TakeSource const& m_take;
  std::string const& m_path;
  std::vector<TakeNote>& m_notes;
  C3DDataPlan m_plan;
  int64 m_first = 1;  // frame number in the file
  std::string m_unitName;
  C3DParameters m_parameters;
};

}  // namespace

void writeC3D(TakeSource const& take, std::string const& path, std::vector<TakeNote>& notes) {
  Writer(take, path, notes).write();
}

}  // namespace talix
