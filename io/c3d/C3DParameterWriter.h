// Fills and writes the parameter section of a C3D file (Intel numbers).
#pragma once

#include <string>
#include <vector>

#include "io/Take.h"
#include "io/c3d/C3DParameters.h"

namespace talix {

// Adds parameters to a new group. Lists that are longer than a parameter can be go on in NAME2, NAME3, ...
// A text that is too long is cut, with a warning.
class C3DGroupWriter {
 public:
  C3DGroupWriter(C3DParameters& parameters, std::string const& name, std::string const& description,
                 std::vector<TakeNote>& notes);

  void text(std::string const& name, std::string const& value);
  void texts(std::string const& name, std::vector<std::string> const& values);
  // A list of pairs of texts, as one parameter.
  void pairs(std::string const& name, std::vector<std::string> const& values);
  void number(std::string const& name, C3DParameter::Type type, double value);
  // `width` numbers belong together, as a first dimension of their own when there are several.
  void numbers(std::string const& name, C3DParameter::Type type, std::vector<double> const& values,
               size_t width = 1);

 private:
  C3DGroup& group() { return m_parameters.groups[m_group]; }
  size_t longest(std::string const& name, std::vector<std::string> const& values);

  C3DParameters& m_parameters;
  size_t m_group;
  std::vector<TakeNote>& m_notes;
};

// The section's bytes: whole blocks, its header first.
std::string c3dParameterSection(C3DParameters const& parameters);

// Numbers as Intel processors store them.
void appendC3DWord(std::string& bytes, unsigned value);
void appendC3DReal(std::string& bytes, double value);

}  // namespace talix
