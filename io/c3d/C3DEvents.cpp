#include "io/c3d/C3DEvents.h"

#include <algorithm>
#include <cmath>

#include "io/c3d/C3DParameterWriter.h"

namespace talix {

namespace {

// The header's table: a key word, the count, times, switches (not read) and labels of four characters.
constexpr unsigned kTableKey = 12345;
constexpr size_t kKeyOffset = 298, kCountOffset = 300, kTimesOffset = 304, kLabelsOffset = 396;
constexpr size_t kMostInHeader = 18, kHeaderLabel = 4;

std::string textOr(std::vector<std::string> const& texts, size_t index) {
  return index < texts.size() ? texts[index] : std::string();
}

std::vector<TakeEvent> groupEvents(C3DParameters const& parameters, std::vector<TakeNote>& notes) {
  auto const warn = [&](std::string const& text) { notes.push_back({TakeNote::Level::Warning, text}); };
  C3DParameter const* first = parameters.find("EVENT", "TIMES");
  if (!first) return {};
  if (first->dimensions.empty() || first->dimensions[0] != 2) {
    warn("EVENT:TIMES does not hold minutes and seconds by event; its events are left out");
    return {};
  }
  std::vector<double> const times = parameters.numbers("EVENT", "TIMES");
  auto const labels = parameters.texts("EVENT", "LABELS"), contexts = parameters.texts("EVENT", "CONTEXTS"),
             subjects = parameters.texts("EVENT", "SUBJECTS"),
             descriptions = parameters.texts("EVENT", "DESCRIPTIONS");
  double const used = c3dUnsigned(parameters.number("EVENT", "USED", static_cast<double>(times.size() / 2)));
  if (used > static_cast<double>(times.size() / 2))
    warn("EVENT:USED says " + std::to_string(used) + " events, EVENT:TIMES holds " +
         std::to_string(times.size() / 2));
  std::vector<TakeEvent> events;
  for (size_t i = 0; i < times.size() / 2 && static_cast<double>(i) < used; ++i) {
    double const seconds = 60 * times[2 * i] + times[2 * i + 1];
    if (std::isfinite(seconds))
      events.push_back(
          {textOr(labels, i), textOr(contexts, i), textOr(subjects, i), textOr(descriptions, i), seconds});
    else
      warn("event " + std::to_string(i + 1) + " has no usable time and is left out");
  }
  return events;
}

std::vector<TakeEvent> headerEvents(C3DBytes const& bytes) {
  char const* what = "the header's events";
  if (bytes.word(kKeyOffset, what) != kTableKey) return {};
  size_t const count = std::min<size_t>(bytes.word(kCountOffset, what), kMostInHeader);
  std::vector<TakeEvent> events;
  for (size_t i = 0; i < count; ++i) {
    TakeEvent event;
    event.seconds = bytes.real(kTimesOffset + 4 * i, what);
    std::string_view label = bytes.text(kLabelsOffset + kHeaderLabel * i, kHeaderLabel, what);
    label = label.substr(0, label.find('\0'));
    while (!label.empty() && label.back() == ' ') label.remove_suffix(1);
    event.label = label;
    if (std::isfinite(event.seconds)) events.push_back(event);
  }
  return events;
}

bool sameEvent(TakeEvent const& a, TakeEvent const& b) {
  return std::abs(a.seconds - b.seconds) < 1e-4 &&
         a.label.substr(0, kHeaderLabel) == b.label.substr(0, kHeaderLabel);
}

}  // namespace

std::vector<TakeEvent> readC3DEvents(C3DBytes const& bytes, C3DParameters const& parameters,
                                     std::vector<TakeNote>& notes) {
  std::vector<TakeEvent> events = groupEvents(parameters, notes);
  size_t const inGroup = events.size();
  for (TakeEvent const& event : headerEvents(bytes))
    if (std::none_of(events.begin(), events.begin() + static_cast<std::ptrdiff_t>(inGroup),
                     [&](TakeEvent const& other) { return sameEvent(event, other); }))
      events.push_back(event);
  return events;
}

void addC3DEvents(std::vector<TakeEvent> const& events, C3DParameters& parameters,
                  std::vector<TakeNote>& notes) {
  if (events.empty()) return;
  std::vector<std::string> labels, contexts, subjects, descriptions;
  std::vector<double> times;
  for (TakeEvent const& event : events) {
    labels.push_back(event.label);
    contexts.push_back(event.context);
    subjects.push_back(event.subject);
    descriptions.push_back(event.description);
    double const minutes = std::floor(event.seconds / 60);
    times.insert(times.end(), {minutes, event.seconds - 60 * minutes});
  }
  C3DGroupWriter group(parameters, "EVENT", "Events of the take", notes);
  group.number("USED", C3DParameter::Type::Integer, static_cast<double>(events.size()));
  group.texts("LABELS", labels);
  group.texts("CONTEXTS", contexts);
  group.texts("SUBJECTS", subjects);
  group.texts("DESCRIPTIONS", descriptions);
  group.numbers("TIMES", C3DParameter::Type::Real, times, 2);
}

}  // namespace talix
