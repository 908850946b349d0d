#include "io/c3d/C3DParameterWriter.h"

#include <algorithm>
#include <bit>
#include <cmath>

namespace talix {

namespace {

constexpr size_t kMostInDimension = 255;
constexpr size_t kLongestText = 127;   // with 255 of them a parameter stays below kMostBytes
constexpr size_t kMostBytes = 32'500;  // of values in a record, whose length has to fit 15 bits
constexpr unsigned kMark = 0x50;

std::string continued(std::string const& name, size_t part) {
  return part == 0 ? name : name + std::to_string(part + 1);
}

void appendTexts(std::string& characters, std::vector<std::string> const& values, size_t first, size_t count,
                 size_t length) {
  for (size_t i = first; i < first + count; ++i) {
    std::string const value = values[i].substr(0, length);
    characters += value + std::string(length - value.size(), ' ');
  }
}

void appendValues(std::string& bytes, C3DParameter const& parameter) {
  bytes += parameter.characters;
  for (double const value : parameter.numbers) {
    if (parameter.type == C3DParameter::Type::Real)
      appendC3DReal(bytes, value);
    else if (parameter.type == C3DParameter::Type::Integer)
      appendC3DWord(bytes, static_cast<unsigned>(std::llround(value)));
    else
      bytes += static_cast<char>(std::llround(value));
  }
}

// Number, name, length and content of a record.
void appendRecord(std::string& bytes, int id, std::string const& name, std::string const& content) {
  bytes += static_cast<char>(name.size());
  bytes += static_cast<char>(id);
  bytes += name;
  appendC3DWord(bytes, static_cast<unsigned>(content.size() + 2));
  bytes += content;
}

void appendParameter(std::string& bytes, int id, C3DParameter const& parameter) {
  std::string content;
  content += static_cast<char>(parameter.type);
  content += static_cast<char>(parameter.dimensions.size());
  for (int const dimension : parameter.dimensions) content += static_cast<char>(dimension);
  appendValues(content, parameter);
  content += '\0';  // no description
  appendRecord(bytes, id, parameter.name, content);
}

}  // namespace

void appendC3DWord(std::string& bytes, unsigned value) {
  char const word[] = {static_cast<char>(value & 0xff), static_cast<char>(value >> 8 & 0xff)};
  bytes.append(word, sizeof word);
}

void appendC3DReal(std::string& bytes, double value) {
  auto const bits = std::bit_cast<std::uint32_t>(static_cast<float>(value));
  char const real[] = {static_cast<char>(bits & 0xff), static_cast<char>(bits >> 8 & 0xff),
                       static_cast<char>(bits >> 16 & 0xff), static_cast<char>(bits >> 24)};
  bytes.append(real, sizeof real);
}

C3DGroupWriter::C3DGroupWriter(C3DParameters& parameters, std::string const& name,
                               std::string const& description, std::vector<TakeNote>& notes)
    : m_parameters(parameters), m_group(parameters.groups.size()), m_notes(notes) {
  parameters.groups.push_back({name, description, {}});
}

size_t C3DGroupWriter::longest(std::string const& name, std::vector<std::string> const& values) {
  size_t length = 1;
  for (std::string const& value : values) length = std::max(length, value.size());
  if (length <= kLongestText) return length;
  m_notes.push_back({TakeNote::Level::Warning, group().name + ":" + name + " holds texts of more than " +
                                                   std::to_string(kLongestText) +
                                                   " characters, which are cut"});
  return kLongestText;
}

void C3DGroupWriter::text(std::string const& name, std::string const& value) {
  size_t const length = longest(name, {value});
  C3DParameter parameter{name, C3DParameter::Type::Text, {static_cast<int>(length)}, {}, {}};
  appendTexts(parameter.characters, {value}, 0, 1, length);
  group().parameters.push_back(std::move(parameter));
}

void C3DGroupWriter::texts(std::string const& name, std::vector<std::string> const& values) {
  size_t const length = longest(name, values);
  for (size_t first = 0; first < values.size(); first += kMostInDimension) {
    size_t const count = std::min(kMostInDimension, values.size() - first);
    C3DParameter parameter{continued(name, first / kMostInDimension),
                           C3DParameter::Type::Text,
                           {static_cast<int>(length), static_cast<int>(count)},
                           {},
                           {}};
    appendTexts(parameter.characters, values, first, count, length);
    group().parameters.push_back(std::move(parameter));
  }
}

void C3DGroupWriter::pairs(std::string const& name, std::vector<std::string> const& values) {
  size_t const length = longest(name, values);
  size_t const count = std::min(values.size() / 2, std::min(kMostInDimension, kMostBytes / (2 * length)));
  C3DParameter parameter{
      name, C3DParameter::Type::Text, {static_cast<int>(length), 2, static_cast<int>(count)}, {}, {}};
  appendTexts(parameter.characters, values, 0, 2 * count, length);
  group().parameters.push_back(std::move(parameter));
}

void C3DGroupWriter::number(std::string const& name, C3DParameter::Type type, double value) {
  group().parameters.push_back({name, type, {}, {}, {value}});
}

void C3DGroupWriter::numbers(std::string const& name, C3DParameter::Type type,
                             std::vector<double> const& values, size_t width) {
  size_t const most = kMostInDimension * width;
  for (size_t first = 0; first < values.size(); first += most) {
    size_t const count = std::min(most, values.size() - first);
    C3DParameter parameter{continued(name, first / most), type, {static_cast<int>(count / width)}, {}, {}};
    if (width > 1) parameter.dimensions.insert(parameter.dimensions.begin(), static_cast<int>(width));
    parameter.numbers.assign(values.begin() + static_cast<std::ptrdiff_t>(first),
                             values.begin() + static_cast<std::ptrdiff_t>(first + count));
    group().parameters.push_back(std::move(parameter));
  }
}

std::string c3dParameterSection(C3DParameters const& parameters) {
  std::string bytes(4, '\0');
  int id = 0;
  for (C3DGroup const& group : parameters.groups) {
    ++id;
    std::string const description = group.description.substr(0, kMostInDimension);
    appendRecord(bytes, -id, group.name, static_cast<char>(description.size()) + description);
    for (C3DParameter const& parameter : group.parameters) appendParameter(bytes, id, parameter);
  }
  bytes += std::string(2, '\0');  // end mark
  bytes.resize((bytes.size() + kC3DBlock - 1) / kC3DBlock * kC3DBlock, '\0');
  bytes[0] = 1;
  bytes[1] = static_cast<char>(kMark);
  bytes[2] = static_cast<char>(std::min<size_t>(bytes.size() / kC3DBlock, 255));
  bytes[3] = static_cast<char>(C3DProcessor::Intel);
  return bytes;
}

}  // namespace talix
