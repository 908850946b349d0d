// What the points of a C3D file are: whose, how called, and which of them are computed outputs, not
// positions.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "io/c3d/C3DParameters.h"

namespace talix {

// A kind of outputs: the POINT parameter that lists their labels, and the unit.
struct C3DOutputKind {
  std::string kind;
  std::string unit;
};

class C3DNames {
 public:
  explicit C3DNames(C3DParameters const& parameters);

  struct Name {
    std::string subject;
    std::string label;
  };
  // As the file has it; empty after the last label.
  std::string fullLabel(size_t point) const;
  std::string description(size_t point) const;
  // The full label parted by the SUBJECTS group, else at its colon; no label for those made up for unnamed
  // points.
  Name name(size_t point) const;
  C3DOutputKind const* outputKind(size_t point) const;  // null: the point is a position

 private:
  struct Subject {
    std::string name;
    std::string prefix;  // empty: its labels have none
  };
  void findSubjects(C3DParameters const& parameters);
  void findOutputs(C3DParameters const& parameters);
  void addOutputKind(C3DParameters const& parameters, std::string const& kind, std::string const& singular);

  std::vector<std::string> m_labels, m_descriptions;
  std::vector<Subject> m_subjects;
  std::map<std::string, C3DOutputKind> m_outputs;  // by full label
};

}  // namespace talix
