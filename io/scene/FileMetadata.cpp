#include "io/scene/FileMetadata.h"

#include <charconv>

namespace talix::fileMetadata {

namespace {

// The module's attribute of a kind; null when it has one of another kind under that name.
template <class T>
T* attributeOf(Module& module, char const* name, Attribute::Type type) {
  Attribute* attribute = module.getAttribute(name);
  if (!attribute) attribute = module.addCustomAttribute(Attribute::create(type, name));
  return objectAs<T>(attribute);
}

template <class T>
T const* findAttribute(Module const& module, char const* name) {
  return objectAs<T const>(const_cast<Attribute const*>(module.getAttribute(name)));
}

void appendField(std::string& line, std::string const& field) {
  for (char const c : field) {
    if (c == '\\')
      line += "\\\\";
    else if (c == '\t')
      line += "\\t";
    else if (c == '\n')
      line += "\\n";
    else
      line += c;
  }
}

Record splitLine(std::string_view line) {
  Record record(1);
  for (size_t i = 0; i < line.size(); ++i) {
    if (line[i] == '\t') {
      record.emplace_back();
    } else if (line[i] == '\\' && i + 1 < line.size()) {
      char const c = line[++i];
      record.back() += c == 't' ? '\t' : c == 'n' ? '\n' : c;
    } else {
      record.back() += line[i];
    }
  }
  return record;
}

}  // namespace

void reserveNames(PropertyTable& table) {
  for (char const* name : {kFileName, kFileFormat, kFileUnit, kFileUnitInMillimetres, kEvents,
                           kAnalogChannels, kOutputs, kDescription, kFileChannels})
    table.addAttribute(name);
}

void setText(Module& module, char const* name, std::string const& text) {
  if (auto* attribute = attributeOf<StringAttribute>(module, name, Attribute::String))
    attribute->setValue(text, true, true, 0, true, true);
}

void setNumber(Module& module, char const* name, double number) {
  if (auto* attribute = attributeOf<FloatAttribute>(module, name, Attribute::Float))
    attribute->setValue(number, true, true, true, true);
}

void setRecords(Module& module, char const* name, std::vector<Record> const& records) {
  std::string lines;
  for (Record const& record : records) {
    if (!lines.empty()) lines += '\n';
    for (size_t i = 0; i < record.size(); ++i) {
      if (i > 0) lines += '\t';
      appendField(lines, record[i]);
    }
  }
  if (auto* attribute = attributeOf<MultiStringAttribute>(module, name, Attribute::MultiString))
    attribute->setValue(lines, true, true, true, true);
}

std::string text(Module const& module, char const* name) {
  auto const* attribute = findAttribute<StringAttribute>(module, name);
  return attribute ? attribute->getValue().GetString() : std::string();
}

double number(Module const& module, char const* name, double byDefault) {
  auto const* attribute = findAttribute<FloatAttribute>(module, name);
  return attribute ? attribute->getValue() : byDefault;
}

std::vector<Record> records(Module const& module, char const* name, size_t fields) {
  std::vector<Record> all;
  auto const* attribute = findAttribute<MultiStringAttribute>(module, name);
  if (!attribute) return all;
  HString const value = attribute->getValue();
  std::string_view rest = value.GetString();
  while (!rest.empty()) {
    size_t const end = std::min(rest.find('\n'), rest.size());
    Record record = splitLine(rest.substr(0, end));
    if (record.size() < fields) record.resize(fields);
    all.push_back(std::move(record));
    rest.remove_prefix(std::min(end + 1, rest.size()));
  }
  return all;
}

std::string numberText(double number) {
  char digits[32];
  return {digits, std::to_chars(digits, std::end(digits), number).ptr};
}

double textNumber(std::string_view text) {
  double number = 0;
  auto const read = std::from_chars(text.data(), text.data() + text.size(), number);
  return read.ec == std::errc() ? number : 0;
}

}  // namespace talix::fileMetadata
