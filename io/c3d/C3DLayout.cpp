#include "io/c3d/C3DLayout.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <optional>

#include "host/time/Ticks.h"
#include "io/FileError.h"
#include "io/FrameRates.h"
#include "io/TextScanner.h"

namespace talix {

namespace {

// A number that the file holds with 32 bits, in as few digits as tell it.
std::string floatText(double value) {
  char text[32];
  return {text, std::to_chars(text, text + sizeof text, static_cast<float>(value)).ptr};
}

constexpr unsigned kMark = 0x50;
constexpr int64 kMostInWord = 65535;

// What one place in the file says about the frames.
struct FrameClaim {
  char const* source;
  int64 count;
  std::optional<int64> first;
  bool wordOnly = false;  // held in 16 bits, so it may be cut or wrapped
};

// One way to lay out the data.
struct Fit {
  size_t dataStart = 0;
  int64 samplesPerFrame = 0;
  FrameClaim const* claim = nullptr;
};

class LayoutFinder {
 public:
  LayoutFinder(C3DBytes const& bytes, C3DHeader const& header, C3DParameterSection const& section,
               std::vector<TakeNote>& notes)
      : m_bytes(bytes),
        m_header(header),
        m_parameters(section.parameters),
        m_end(section.end),
        m_notes(notes) {}

  C3DLayout find() {
    findCounts();
    findScale();
    findRate();
    collectSamplesPerFrame();
    collectDataStarts();
    collectClaims();
    place();
    checkTime();
    return m_layout;
  }

 private:
  void note(TakeNote::Level level, std::string const& text) { m_notes.push_back({level, text}); }
  void warn(std::string const& text) { note(TakeNote::Level::Warning, text); }

  // A count from a parameter, else the header's; says so when both are there and differ.
  int64 count(char const* group, char const* name, int64 fromHeader, char const* what) {
    double const value = c3dUnsigned(m_parameters.number(group, name, static_cast<double>(fromHeader)));
    if (!(value >= 0 && value <= kMostInWord)) return fromHeader;
    auto const whole = static_cast<int64>(value);
    if (whole != fromHeader)
      warn("the header counts " + std::to_string(fromHeader) + " " + what + ", " + group + ":" + name + " " +
           std::to_string(whole) + ", which is taken");
    return whole;
  }

  void findCounts() {
    m_layout.pointCount = count("POINT", "USED", m_header.pointCount, "points");
    bool const ratioGiven = m_header.samplesPerFrame > 0;
    int64 const headerChannels = ratioGiven ? m_header.analogPerFrame / m_header.samplesPerFrame : 0;
    m_layout.channelCount = count("ANALOG", "USED", headerChannels, "analog channels");
  }

  static bool usableScale(double scale) { return std::isfinite(scale) && scale != 0; }

  void findScale() {
    double const fromParameters = m_parameters.number("POINT", "SCALE", m_header.scale);
    double scale = usableScale(fromParameters) ? fromParameters : m_header.scale;
    if (!usableScale(scale)) {
      warn("the scale of the coordinates is missing; 1 is assumed");
      scale = 1;
    } else if (std::abs(scale - m_header.scale) > 1e-6 * std::abs(scale)) {
      note(TakeNote::Level::Info, "the header's scale " + floatText(m_header.scale) +
                                      " differs from POINT:SCALE " + floatText(scale) + ", which is taken");
    }
    m_layout.real = scale < 0;
    m_layout.scale = std::abs(scale);
  }

  void findRate() {
    double const fromParameters = m_parameters.number("POINT", "RATE", m_header.rate);
    m_layout.rate = isFrameRate(fromParameters) ? fromParameters : m_header.rate;
    if (!isFrameRate(m_layout.rate)) {
      m_layout.rate = Take().rate;
      warn("the file gives no usable frame rate; " + std::to_string(m_layout.rate) + " Hz is assumed");
    } else if (std::abs(m_layout.rate - m_header.rate) > 1e-6 * m_layout.rate) {
      note(TakeNote::Level::Info, "the header's frame rate " + std::to_string(m_header.rate) +
                                      " Hz differs from POINT:RATE " + std::to_string(m_layout.rate) +
                                      " Hz, which is taken");
    }
  }

  void collectSamplesPerFrame() {
    if (m_layout.channelCount == 0) {
      m_samples = {0};
      return;
    }
    double const ratio = m_parameters.number("ANALOG", "RATE", 0) / m_layout.rate;
    if (ratio >= 0.5 && ratio <= kMostInWord) m_samples.push_back(std::llround(ratio));
    for (int64 const other : {m_header.samplesPerFrame, m_header.analogPerFrame / m_layout.channelCount})
      if (other > 0 && std::find(m_samples.begin(), m_samples.end(), other) == m_samples.end())
        m_samples.push_back(other);
    if (m_samples.empty()) m_samples.push_back(1);
  }

  void collectDataStarts() {
    double const parameterBlock = c3dUnsigned(m_parameters.number("POINT", "DATA_START", 0));
    for (double const block : {parameterBlock, static_cast<double>(m_header.dataBlock)}) {
      if (!(block >= 1 && block <= kMostInWord)) continue;
      size_t const start = (static_cast<size_t>(block) - 1) * kC3DBlock;
      if (start < m_end || start > m_bytes.size()) continue;
      if (m_starts.empty() || m_starts[0] != start) m_starts.push_back(start);
    }
    if (m_starts.empty())
      m_bytes.fail(16, "the data section is said to start at block " + std::to_string(m_header.dataBlock) +
                           ", which is not between the parameters' end (offset " + std::to_string(m_end) +
                           ") and the end of the file (" + std::to_string(m_bytes.size()) + ")");
  }

  std::optional<int64> fieldNumber(char const* name) const {
    std::vector<double> const words = m_parameters.numbers("TRIAL", name);
    if (words.empty()) return {};
    double const low = c3dUnsigned(words[0]), high = words.size() > 1 ? c3dUnsigned(words[1]) : 0;
    double const value = low + high * (kMostInWord + 1);
    if (!(value >= 0 && value <= 4294967295.0)) return {};
    return static_cast<int64>(value);
  }

  void claimFrames(char const* name) {
    C3DParameter const* parameter = m_parameters.find("POINT", name);
    double const value = c3dUnsigned(m_parameters.number("POINT", name, -1));
    if (!parameter || !(value >= 0 && value <= 4294967295.0)) return;
    m_claims.push_back({name, static_cast<int64>(value), {}, parameter->type != C3DParameter::Type::Real});
  }

  // From the most to the least able to hold large numbers.
  void collectClaims() {
    auto const first = fieldNumber("ACTUAL_START_FIELD"), last = fieldNumber("ACTUAL_END_FIELD");
    if (first && last && *last >= *first) m_claims.push_back({"TRIAL", *last - *first + 1, first});
    claimFrames("LONG_FRAMES");
    claimFrames("FRAMES");
    if (m_header.lastFrame >= m_header.firstFrame - 1)
      m_claims.push_back({"header", m_header.lastFrame - m_header.firstFrame + 1, m_header.firstFrame, true});
    std::vector<FrameClaim> const all = m_claims;
    std::erase_if(m_claims, [&](FrameClaim const& claim) {
      return std::any_of(all.begin(), all.end(),
                         [&](FrameClaim const& other) { return isCutOrWrapped(claim, other.count); });
    });
    if (m_claims.empty())
      throw FileError(m_bytes.path(), "neither header nor parameters say how many frames there are");
  }

  // Whether a 16-bit claim is what became of a larger count.
  bool isCutOrWrapped(FrameClaim const& claim, int64 larger) const {
    if (!claim.wordOnly || larger <= claim.count) return false;
    bool const cut = claim.count == kMostInWord || (claim.first && m_header.lastFrame == kMostInWord);
    return cut || (larger - claim.count) % (kMostInWord + 1) == 0;
  }

  // Bytes left in the file after the data of this fit; below 0: it does not fit.
  int64 excess(Fit const& fit) const {
    C3DLayout layout = m_layout;
    layout.samplesPerFrame = fit.samplesPerFrame;
    size_t const room = m_bytes.size() - fit.dataStart, frame = layout.frameBytes();
    if (frame != 0 && static_cast<size_t>(fit.claim->count) > room / frame) return -1;
    return static_cast<int64>(room - frame * static_cast<size_t>(fit.claim->count));
  }

  // The first fit that uses up the file's last block, else the first that the file holds.
  std::optional<Fit> bestFit() const {
    std::optional<Fit> held;
    for (FrameClaim const& claim : m_claims)
      for (size_t const start : m_starts)
        for (int64 const samples : m_samples) {
          Fit const fit{start, samples, &claim};
          int64 const left = excess(fit);
          if (left >= 0 && left < static_cast<int64>(kC3DBlock)) return fit;
          if (left >= 0 && !held) held = fit;
        }
    return held;
  }

  void place() {
    std::optional<Fit> const fit = bestFit();
    m_layout.samplesPerFrame = fit ? fit->samplesPerFrame : m_samples[0];
    m_layout.dataStart = fit ? fit->dataStart : m_starts[0];
    if (!fit) failTruncated();
    m_layout.frameCount = fit->claim->count;
    m_layout.firstFrame = firstFrame(*fit->claim);
    tellDisagreements(*fit);
    if (fit->claim->wordOnly && fit->claim->count == kMostInWord) takeAllFrames(excess(*fit));
  }

  // A count that stopped at what 16 bits hold says less than the size of the data, whose last block may be
  // filled up with zeros.
  void takeAllFrames(int64 left) {
    if (m_layout.frameBytes() == 0) return;
    auto const frame = static_cast<int64>(m_layout.frameBytes()), block = static_cast<int64>(kC3DBlock);
    if (left < std::max(frame, block)) return;
    size_t end = m_bytes.size() - static_cast<size_t>(left % frame);
    for (; left >= frame && m_bytes.size() - end < kC3DBlock && isZero(end - m_layout.frameBytes());
         left -= frame)
      end -= m_layout.frameBytes();
    m_layout.frameCount += left / frame;
    warn("the frame count ends at 65535; the size of the data gives " + std::to_string(m_layout.frameCount));
  }

  bool isZero(size_t frameStart) const {
    std::string_view const frame = m_bytes.text(frameStart, m_layout.frameBytes(), "the last frames");
    return frame.find_first_not_of('\0') == std::string_view::npos;
  }

  [[noreturn]] void failTruncated() const {
    size_t const frames = (m_bytes.size() - m_layout.dataStart) / m_layout.frameBytes();
    m_bytes.fail(m_bytes.size(), "the data section ends at frame " + std::to_string(frames) + " of " +
                                     std::to_string(m_claims[0].count) + " (it starts at offset " +
                                     std::to_string(m_layout.dataStart) + ", a frame takes " +
                                     std::to_string(m_layout.frameBytes()) + " bytes)");
  }

  // The number comes from the place that counts right, else from the header.
  int64 firstFrame(FrameClaim const& chosen) const {
    if (chosen.first) return *chosen.first;
    for (FrameClaim const& claim : m_claims)
      if (claim.first && claim.count == chosen.count) return *claim.first;
    return m_header.firstFrame;
  }

  void tellDisagreements(Fit const& fit) {
    for (FrameClaim const& claim : m_claims)
      if (claim.count != fit.claim->count)
        warn(std::string("frame counts differ: ") + claim.source + " says " + std::to_string(claim.count) +
             ", " + fit.claim->source + " " + std::to_string(fit.claim->count) +
             ", which fits the data and is taken");
    if (m_starts.size() > 1)
      warn("POINT:DATA_START and the header's data start differ; the data is read from offset " +
           std::to_string(fit.dataStart));
    if (fit.samplesPerFrame != m_samples[0])
      warn("the analog rate does not agree with the data, which hold " + std::to_string(fit.samplesPerFrame) +
           " samples per frame");
    int64 const left = excess(fit);
    if (left >= static_cast<int64>(kC3DBlock) && m_layout.frameBytes() != 0 &&
        fit.claim->count != kMostInWord)
      warn(std::to_string(left) + " bytes after the last frame are left out");
  }

  void checkTime() const {
    double const end = static_cast<double>(m_layout.firstFrame + m_layout.frameCount);
    if (end * static_cast<double>(ticksPerFrameAt(m_layout.rate)) > static_cast<double>(kForever) / 2)
      throw FileError(m_bytes.path(), "frame " + std::to_string(m_layout.firstFrame + m_layout.frameCount) +
                                          " at " + std::to_string(m_layout.rate) +
                                          " Hz lies beyond the end of time");
  }

  C3DBytes const& m_bytes;
  C3DHeader const& m_header;
  C3DParameters const& m_parameters;
  size_t const m_end;
  std::vector<TakeNote>& m_notes;
  C3DLayout m_layout;
  std::vector<int64> m_samples;
  std::vector<size_t> m_starts;
  std::vector<FrameClaim> m_claims;
};

}  // namespace

C3DHeader readC3DHeader(C3DBytes& bytes, std::vector<TakeNote>& notes) {
  if (bytes.size() < kC3DBlock || bytes.byte(1, "the header") != kMark)
    throw FileError(
        bytes.path(),
        "is not a C3D file: it does not start with a header of 512 bytes whose second byte is 0x50");
  if (bytes.byte(0, "the header") < 2)
    bytes.fail(0, "is not a C3D file: the parameters are said to be in block " +
                      std::to_string(bytes.byte(0, "the header")) + ", expected 2 or a later one");
  C3DHeader header;
  header.parameterStart = (bytes.byte(0, "the header") - 1) * kC3DBlock;
  unsigned const blocks = bytes.byte(header.parameterStart + 2, "the parameter section's header");
  unsigned const processor = bytes.byte(header.parameterStart + 3, "the parameter section's header");
  if (processor < 84 || processor > 86)
    bytes.fail(header.parameterStart + 3, "is not a C3D file: the processor type is " +
                                              std::to_string(processor) +
                                              ", expected 84 (Intel), 85 (DEC) or 86 (MIPS)");
  bytes.setProcessor(static_cast<C3DProcessor>(processor));
  if (bytes.byte(header.parameterStart + 1, "the parameter section's header") != kMark)
    notes.push_back({TakeNote::Level::Info, "the parameter section does not start with its mark"});

  auto const word = [&](size_t number) { return int64{bytes.word(2 * (number - 1), "the header")}; };
  auto const real = [&](size_t number) { return bytes.real(2 * (number - 1), "the header"); };
  header.pointCount = word(2);
  header.analogPerFrame = word(3);
  header.firstFrame = word(4);
  header.lastFrame = word(5);
  header.scale = real(7);
  header.dataBlock = word(9);
  header.samplesPerFrame = word(10);
  header.rate = real(11);
  // The section's own count of blocks ends at 255; where the data starts later, the section may go on until
  // there.
  size_t const data = static_cast<size_t>(std::max<int64>(header.dataBlock - 1, 0)) * kC3DBlock;
  if (blocks > 0) header.declaredEnd = std::max(header.parameterStart + blocks * kC3DBlock, data);
  return header;
}

C3DLayout findC3DLayout(C3DBytes const& bytes, C3DHeader const& header, C3DParameterSection const& section,
                        std::vector<TakeNote>& notes) {
  return LayoutFinder(bytes, header, section, notes).find();
}

}  // namespace talix
