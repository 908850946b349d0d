#include "io/c3d/C3DNames.h"

#include <array>

namespace talix {

namespace {

constexpr std::array<std::array<const char*, 2>, 5> kOutputKinds = {{{"ANGLES", "ANGLE"},
                                                                     {"FORCES", "FORCE"},
                                                                     {"MOMENTS", "MOMENT"},
                                                                     {"POWERS", "POWER"},
                                                                     {"SCALARS", "SCALAR"}}};

std::string textAt(const std::vector<std::string>& texts, size_t index) {
  return index < texts.size() ? texts[index] : std::string();
}

}  // namespace

C3DNames::C3DNames(const C3DParameters& parameters)
    : m_labels(parameters.texts("POINT", "LABELS")),
      m_descriptions(parameters.texts("POINT", "DESCRIPTIONS")) {
  findSubjects(parameters);
  findOutputs(parameters);
}

std::string C3DNames::fullLabel(size_t point) const { return textAt(m_labels, point); }

std::string C3DNames::description(size_t point) const { return textAt(m_descriptions, point); }

C3DNames::Name C3DNames::name(size_t point) const {
  const std::string full = fullLabel(point);
  if (full.starts_with('*')) return {};
  for (const Subject& subject : m_subjects)
    if (!subject.prefix.empty() && full.starts_with(subject.prefix))
      return {subject.name, full.substr(subject.prefix.size())};
  const size_t colon = full.find(':');
  if (colon != std::string::npos) {
    const std::string label = full.substr(colon + 1);
    return label.starts_with('*') ? Name() : Name{full.substr(0, colon), label};
  }
  const bool oneForAll = m_subjects.size() == 1 && m_subjects[0].prefix.empty();
  return {oneForAll && !full.empty() ? m_subjects[0].name : std::string(), full};
}

const C3DOutputKind* C3DNames::outputKind(size_t point) const {
  const auto found = point < m_labels.size() ? m_outputs.find(m_labels[point]) : m_outputs.end();
  return found == m_outputs.end() || found->first.empty() ? nullptr : &found->second;
}

void C3DNames::findSubjects(const C3DParameters& parameters) {
  const auto names = parameters.texts("SUBJECTS", "NAMES"),
             prefixes = parameters.texts("SUBJECTS", "LABEL_PREFIXES");
  const std::vector<double> uses = parameters.numbers("SUBJECTS", "USES_PREFIXES");
  for (size_t i = 0; i < names.size(); ++i) {
    if (names[i].empty()) continue;
    const bool usesPrefix = uses.empty() ? !prefixes.empty() : uses[i < uses.size() ? i : 0] != 0;
    m_subjects.push_back({names[i], usesPrefix ? textAt(prefixes, i) : std::string()});
  }
}

void C3DNames::findOutputs(const C3DParameters& parameters) {
  for (const auto& [kind, singular] : kOutputKinds) addOutputKind(parameters, kind, singular);
  const C3DParameter* groups = parameters.find("POINT", "TYPE_GROUPS");
  if (!groups) return;
  for (size_t i = 0; i + 1 < groups->textCount(); i += 2)
    addOutputKind(parameters, groups->text(i), groups->text(i + 1));
}

void C3DNames::addOutputKind(const C3DParameters& parameters, const std::string& kind,
                             const std::string& singular) {
  if (kind.empty() || kind == "LABELS") return;
  const std::string unit = parameters.text("POINT", singular + "_UNITS");
  for (const std::string& label : parameters.texts("POINT", kind)) m_outputs[label] = {kind, unit};
}

}  // namespace talix
