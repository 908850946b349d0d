#include "session/JsonForms.h"

#include <boost/json.hpp>
#include <cmath>

namespace talix {

namespace json = boost::json;

namespace {

json::value numberJson(double value) {
  return std::isfinite(value) ? json::value(value) : json::value(nullptr);
}

json::value textJson(std::string_view text) { return json::value(mendedUtf8(text)); }

json::value elementJson(Variable const& value, Variable::VarType type, int i) {
  switch (type) {
    case Variable::Int:
      return value.getIntValue(i);
    case Variable::Float:
      return numberJson(value.getFloatValue(i));
    case Variable::String:
      return textJson(value.getStringValue(i));
    case Variable::Bool: {
      Variable::BoolType const boolean = value.getBoolValue(i);
      if (boolean == Variable::Toggle) return "toggle";
      return boolean != Variable::False;
    }
    case Variable::Vector: {
      Vec3 const& vector = value.getVecValue(i);
      return json::array{numberJson(vector.x), numberJson(vector.y), numberJson(vector.z)};
    }
    default:
      return nullptr;
  }
}

// How many bytes of `text` are one UTF-8 character; 0 when it begins with none.
size_t characterLength(std::string_view text) {
  auto const byte = [&](size_t i) { return static_cast<unsigned char>(text[i]); };
  unsigned const lead = byte(0);
  if (lead < 0x80) return 1;
  size_t const length = lead >= 0xc2 && lead < 0xe0   ? 2
                        : lead >= 0xe0 && lead < 0xf0 ? 3
                        : lead >= 0xf0 && lead < 0xf5 ? 4
                                                      : 0;
  if (length == 0 || text.size() < length) return 0;
  for (size_t i = 1; i < length; ++i)
    if ((byte(i) & 0xc0) != 0x80) return 0;
  // Overlong forms, halves of UTF-16 pairs, numbers beyond U+10FFFF.
  unsigned const second = byte(1);
  if ((lead == 0xe0 && second < 0xa0) || (lead == 0xed && second > 0x9f)) return 0;
  if ((lead == 0xf0 && second < 0x90) || (lead == 0xf4 && second > 0x8f)) return 0;
  return length;
}

json::object optionJson(CommandOption const& option, HString const& text) {
  return {{"name", textJson(option.getName().GetString())},
          {"text", textJson(text.GetString())},
          {"args", option.getArgCount()},
          {"type", static_cast<int>(option.getType())},
          {"mask", option.getMask()},
          {"hidden", option.isHidden()}};
}

}  // namespace

std::string mendedUtf8(std::string_view text) {
  std::string mended;
  mended.reserve(text.size());
  while (!text.empty()) {
    size_t const length = characterLength(text);
    mended += length > 0 ? text.substr(0, length) : "\xef\xbf\xbd";
    text.remove_prefix(std::max<size_t>(length, 1));
  }
  return mended;
}

json::value toJson(Variable const& value) {
  Variable::VarType const type = value.getType();
  if (!value.isArray()) return elementJson(value, type, -1);
  json::array items;
  items.reserve(static_cast<size_t>(value.getNumItems()));
  for (int i = 0; i < value.getNumItems(); ++i)
    items.push_back(elementJson(value, static_cast<Variable::VarType>(type - Variable::kArray), i));
  return items;
}

json::object toJson(LineResult const& result) {
  json::array log;
  for (LogLine const& line : result.log)
    log.push_back({{"level", getLogLevelName(line.level)}, {"text", textJson(line.text)}});
  return {{"command", textJson(result.command)},
          {"ok", !result.failed()},
          {"result", toJson(result.value)},
          {"log", std::move(log)}};
}

json::object toJson(CommandRegistry::Entry const& entry) {
  Command& command = *entry.command;
  json::array options;
  for (int i = 0; i < command.getNumOptions(); ++i)
    options.push_back(optionJson(command.getOption(i), command.getOptionText(i)));
  std::string const syntax = argSyntax(command);
  return {{"name", textJson(command.getName().GetString())},
          {"displayName", textJson(command.getDisplayName().GetString())},
          {"category", textJson(command.getCategory().GetString())},
          {"subCategory", textJson(command.getSubCategory().GetString())},
          {"purpose", textJson(command.getPurpose().GetString())},
          {"argsText", textJson(command.getArgsText().GetString())},
          {"example", textJson(command.getExample().GetString())},
          {"syntax", syntax.empty() ? json::value(nullptr) : textJson(syntax)},
          {"options", std::move(options)},
          {"returns", static_cast<int>(command.getReturnType())},
          {"solo", command.canExecuteSolo()},
          {"source", textJson(entry.source)}};
}

json::array toJson(CommandRegistry const& commands) {
  json::array all;
  for (auto const& entry : commands.entries()) all.push_back(toJson(entry));
  return all;
}

}  // namespace talix
