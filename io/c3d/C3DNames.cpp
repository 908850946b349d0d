#include "io/c3d/C3DNames.h"

#include <array>

namespace talix {

namespace {

constexpr std::array<std::array<char const*, 2>, 5> kOutputKinds = {{{"ANGLES", "ANGLE"},
                                                                     {"FORCES", "FORCE"},
                                                                     {"MOMENTS", "MOMENT"},
                                                                     {"POWERS", "POWER"},
                                                                     {"SCALARS", "SCALAR"}}};

std::string textAt(std::vector<std::string> const& texts, size_t index) {
  return index < texts.size() ? texts[index] : std::string();
}

}  // namespace

C3DNames::C3DNames(C3DParameters const& parameters)
    : m_labels(parameters.texts("POINT", "LABELS")),
      m_descriptions(parameters.texts("POINT", "DESCRIPTIONS")) {
  findSubjects(parameters);
  findOutputs(parameters);
}

std::string C3DNames::fullLabel(size_t point) const { return textAt(m_labels, point); }

std::string C3DNames::description(size_t point) const { return textAt(m_descriptions, point); }

C3DNames::Name C3DNames::name(size_t point) const {
  std::string const full = fullLabel(point);
  if (full.starts_with('*')) return {};
  for (Subject const& subject : m_subjects)
    if (!subject.prefix.empty() && full.starts_with(subject.prefix))
      return {subject.name, full.substr(subject.prefix.size())};
  size_t const colon = full.find(':');
  if (colon != std::string::npos) {
    std::string const label = full.substr(colon + 1);
    return label.starts_with('*') ? Name() : Name{full.substr(0, colon), label};
  }
  bool const oneForAll = m_subjects.size() == 1 && m_subjects[0].prefix.empty();
  return {oneForAll && !full.empty() ? m_subjects[0].name : std::string(), full};
}

C3DOutputKind const* C3DNames::outputKind(size_t point) const {
  auto const found = point < m_labels.size() ? m_outputs.find(m_labels[point]) : m_outputs.end();
  return found == m_outputs.end() || found->first.empty() ? nullptr : &found->second;
}

void C3DNames::findSubjects(C3DParameters const& parameters) {
  auto const names = parameters.texts("SUBJECTS", "NAMES"),
             prefixes = parameters.texts("SUBJECTS", "LABEL_PREFIXES");
  std::vector<double> const uses = parameters.numbers("SUBJECTS", "USES_PREFIXES");
  for (size_t i = 0; i < names.size(); ++i) {
    if (names[i].empty()) continue;
    bool const usesPrefix = uses.empty() ? !prefixes.empty() : uses[i < uses.size() ? i : 0] != 0;
    m_subjects.push_back({names[i], usesPrefix ? textAt(prefixes, i) : std::string()});
  }
}

void C3DNames::findOutputs(C3DParameters const& parameters) {
  for (auto const& [kind, singular] : kOutputKinds) addOutputKind(parameters, kind, singular);
  C3DParameter const* groups = parameters.find("POINT", "TYPE_GROUPS");
  if (!groups) return;
  for (size_t i = 0; i + 1 < groups->textCount(); i += 2)
    addOutputKind(parameters, groups->text(i), groups->text(i + 1));
}

void C3DNames::addOutputKind(C3DParameters const& parameters, std::string const& kind,
                             std::string const& singular) {
  if (kind.empty() || kind == "LABELS") return;
  std::string const unit = parameters.text("POINT", singular + "_UNITS");
  for (std::string const& label : parameters.texts("POINT", kind)) m_outputs[label] = {kind, unit};
}

}  // namespace talix
