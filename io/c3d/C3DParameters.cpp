#include "io/c3d/C3DParameters.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <map>

namespace talix {

namespace {

constexpr int kMostDimensions = 7;

std::string upperCase(std::string_view text) {
  std::string upper(text);
  for (char& c : upper) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
  return upper;
}

std::string trimmed(std::string_view text) {
  text = text.substr(0, text.find('\0'));
  while (!text.empty() && std::isspace(static_cast<unsigned char>(text.back()))) text.remove_suffix(1);
  while (!text.empty() && std::isspace(static_cast<unsigned char>(text.front()))) text.remove_prefix(1);
  return std::string(text);
}

// Calls visit(parameter) for NAME, NAME2, NAME3, ...
template <class Visit>
void eachContinued(C3DParameters const& parameters, std::string_view group, std::string_view name,
                   Visit visit) {
  C3DParameter const* parameter = parameters.find(group, name);
  for (int next = 2; parameter; ++next) {
    visit(*parameter);
    parameter = parameters.find(group, std::string(name) + std::to_string(next));
  }
}

// One record of the section: a group's own or one of its parameters.
struct Record {
  size_t offset = 0;  // of the record
  int id = 0;         // below 0: the group's own record; above: a parameter of group -id
  std::string name;
  size_t content = 0;  // offset of what follows name and next-record offset
  size_t end = 0;      // offset of the next record; that of the file's end for the last one
  bool last = false;
};

class SectionReader {
 public:
  SectionReader(C3DBytes const& bytes, std::vector<TakeNote>& notes) : m_bytes(bytes), m_notes(notes) {}

  C3DParameterSection read(size_t start, size_t declaredEnd) {
    size_t offset = start;
    while (true) {
      if (offset + 2 > m_bytes.size() || (declaredEnd && offset >= declaredEnd)) {
        warn("the parameter section has no end mark");
        break;
      }
      if (m_bytes.byte(offset, "a parameter's name length") == 0) break;
      Record const record = readRecord(offset);
      offset = record.id < 0 ? readGroup(record) : readParameter(record);
      if (record.last) break;
      offset = record.end;
    }
    return {collected(), offset};
  }

 private:
  void warn(std::string const& text) { m_notes.push_back({TakeNote::Level::Warning, text}); }

  Record readRecord(size_t offset) const {
    Record record;
    record.offset = offset;
    auto const length = static_cast<signed char>(m_bytes.byte(offset, "a parameter's name length"));
    record.id = static_cast<signed char>(m_bytes.byte(offset + 1, "a group number"));
    size_t const nameLength = static_cast<size_t>(std::abs(int{length}));  // negative marks a locked record
    record.name = upperCase(trimmed(m_bytes.text(offset + 2, nameLength, "a parameter's name")));
    size_t const link = offset + 2 + nameLength;
    size_t const step = m_bytes.word(link, "a parameter's next-record offset");
    record.content = link + 2;
    record.last = step == 0;
    record.end = record.last ? m_bytes.size() : link + step;
    if (!record.last && step <= 2)
      m_bytes.fail(link, "parameter " + record.name + ": the next-record offset " + std::to_string(step) +
                             " does not lead forward");
    if (record.end > m_bytes.size())
      m_bytes.fail(link, "parameter " + record.name + ": the next-record offset " + std::to_string(step) +
                             " leads beyond the end of the file");
    return record;
  }

  // Returns the offset after what it read.
  size_t readGroup(Record const& record) {
    size_t const length = m_bytes.byte(record.content, "a group's description");
    size_t const held = std::min(length, record.end - record.content - 1);
    C3DGroup& group = m_groups[-record.id];
    group.name = record.name;
    group.description = trimmed(m_bytes.text(record.content + 1, held, "a group's description"));
    return record.content + 1 + held;
  }

  size_t readParameter(Record const& record) {
    C3DParameter parameter;
    parameter.name = record.name;
    size_t offset = record.content;
    int const type = static_cast<signed char>(m_bytes.byte(offset, "a parameter's type"));
    int const dimensions = static_cast<int>(m_bytes.byte(offset + 1, "a parameter's dimensions"));
    if (type != -1 && type != 1 && type != 2 && type != 4) {
      warn("parameter " + record.name + " is of no known type (" + std::to_string(type) + ") and left out");
      return offset;
    }
    if (dimensions > kMostDimensions)
      m_bytes.fail(offset + 1, "parameter " + record.name + " has " + std::to_string(dimensions) +
                                   " dimensions, at most 7 are possible");
    parameter.type = static_cast<C3DParameter::Type>(type);
    size_t values = 1;
    offset += 2;
    for (int i = 0; i < dimensions; ++i, ++offset) {
      parameter.dimensions.push_back(static_cast<int>(m_bytes.byte(offset, "a parameter's dimensions")));
      values *= static_cast<size_t>(parameter.dimensions.back());
    }
    offset = readValues(record, offset, values, parameter);
    m_groups[record.id].parameters.push_back(std::move(parameter));
    return offset;
  }

  size_t readValues(Record const& record, size_t offset, size_t values, C3DParameter& parameter) {
    size_t const width = static_cast<size_t>(std::abs(static_cast<int>(parameter.type)));
    size_t const room = (record.end - std::min(offset, record.end)) / width;
    if (values > room) {
      if (record.last)
        m_bytes.fail(offset, "parameter " + record.name + ": its " + std::to_string(values) +
                                 " values reach beyond the end of the file");
      warn("parameter " + record.name + " says to hold " + std::to_string(values) +
           " values, its record has room for " + std::to_string(room));
      values = room;
    }
    if (parameter.type == C3DParameter::Type::Text) {
      parameter.characters = m_bytes.text(offset, values, "a parameter's text");
    } else {
      parameter.numbers.reserve(values);
      for (size_t i = 0; i < values; ++i)
        parameter.numbers.push_back(number(parameter.type, offset + i * width));
    }
    return offset + values * width;
  }

  double number(C3DParameter::Type type, size_t offset) const {
    if (type == C3DParameter::Type::Real) return m_bytes.real(offset, "a parameter's values");
    if (type == C3DParameter::Type::Integer) return m_bytes.integer(offset, "a parameter's values");
    return static_cast<signed char>(m_bytes.byte(offset, "a parameter's values"));
  }

  // Parameters may stand before their group, so the groups are put together at the end.
  C3DParameters collected() {
    C3DParameters parameters;
    for (auto& [id, group] : m_groups) {
      if (group.name.empty())
        warn("parameters of group " + std::to_string(id) + ", which the file does not name, are left out");
      else
        parameters.groups.push_back(std::move(group));
    }
    return parameters;
  }

  C3DBytes const& m_bytes;
  std::vector<TakeNote>& m_notes;
  std::map<int, C3DGroup> m_groups;
};

}  // namespace

size_t C3DParameter::textCount() const {
  size_t const length = dimensions.empty() ? 1 : static_cast<size_t>(dimensions[0]);
  return length ? characters.size() / length : 0;
}

std::string C3DParameter::text(size_t index) const {
  size_t const length = dimensions.empty() ? 1 : static_cast<size_t>(dimensions[0]);
  return trimmed(std::string_view(characters).substr(index * length, length));
}

C3DParameter const* C3DParameters::find(std::string_view group, std::string_view name) const {
  for (C3DGroup const& candidate : groups) {
    if (candidate.name != group) continue;
    for (C3DParameter const& parameter : candidate.parameters)
      if (parameter.name == name) return &parameter;
  }
  return nullptr;
}

std::vector<std::string> C3DParameters::texts(std::string_view group, std::string_view name) const {
  std::vector<std::string> all;
  eachContinued(*this, group, name, [&](C3DParameter const& parameter) {
    for (size_t i = 0; i < parameter.textCount(); ++i) all.push_back(parameter.text(i));
  });
  return all;
}

std::vector<double> C3DParameters::numbers(std::string_view group, std::string_view name) const {
  std::vector<double> all;
  eachContinued(*this, group, name, [&](C3DParameter const& parameter) {
    all.insert(all.end(), parameter.numbers.begin(), parameter.numbers.end());
  });
  return all;
}

double C3DParameters::number(std::string_view group, std::string_view name, double fallback) const {
  C3DParameter const* parameter = find(group, name);
  return parameter && !parameter->numbers.empty() ? parameter->numbers[0] : fallback;
}

std::string C3DParameters::text(std::string_view group, std::string_view name) const {
  C3DParameter const* parameter = find(group, name);
  return parameter && parameter->textCount() ? parameter->text(0) : std::string();
}

C3DParameterSection readC3DParameters(C3DBytes const& bytes, size_t start, size_t declaredEnd,
                                      std::vector<TakeNote>& notes) {
  return SectionReader(bytes, notes).read(start, declaredEnd);
}

}  // namespace talix
