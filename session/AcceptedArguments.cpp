#include "session/AcceptedArguments.h"

#include <algorithm>
#include <array>
#include <optional>
#include <vector>

#include "host/command/ScriptCommand.h"
#include "session/ScriptText.h"

namespace talix {

namespace {

constexpr size_t kTypes = 7;
// Commands that take this many arguments take any number.
constexpr size_t kMany = 9;

// What stands at each place of an accepted list.
using Form = std::vector<std::string>;

std::array<Variable, kTypes> const& samples() {
  static std::array<Variable, kTypes> const values = [] {
    std::array<Variable, kTypes> made;
    made[0].setValue(1, -1);
    made[1].setValue(0.5, -1);
    made[2].setValue("a", -1);
    made[3].setValue(Variable::True, -1);
    made[4].setValue(Vec3(), -1);
    made[5] = Variable(Variable::IntArray, 1);
    made[6] = Variable(Variable::StringArray, 1);
    return made;
  }();
  return values;
}

bool accepts(Command const& command, Args const& args) { return command.checkArgSyntax(args, {}); }

Args listOf(size_t count, Variable const& first, Variable const& middle, Variable const& last) {
  Args args;
  for (size_t i = 0; i < count; ++i) args.add(i == 0 ? first : i + 1 < count ? middle : last);
  return args;
}

// An accepted list, with its first and its last of any types and one type between them.
std::optional<Args> acceptedList(Command const& command, size_t count) {
  for (Variable const& middle : samples())
    for (Variable const& last : samples())
      for (Variable const& first : samples()) {
        Args args = listOf(count, first, middle, last);
        if (accepts(command, args)) return args;
      }
  return {};
}

std::string placeText(Command const& command, Args args, size_t place) {
  std::vector<std::string> names;
  for (Variable const& value : samples()) {
    args[static_cast<int>(place)] = value;
    if (accepts(command, args)) names.push_back(typeName(value.getType()));
  }
  if (names.size() == kTypes) return "any";
  std::string text;
  for (std::string const& name : names) text += (text.empty() ? "" : "|") + name;
  return text;
}

std::optional<Form> formOf(Command const& command, size_t count) {
  std::optional<Args> const args = count ? acceptedList(command, count) : Args();
  if (!args || !accepts(command, *args)) return {};
  Form form;
  for (size_t place = 0; place < count; ++place) form.push_back(placeText(command, *args, place));
  return form;
}

// Of forms that each begin as the one before them.
std::string textOf(size_t least, Form form) {
  bool const many = form.size() >= kMany;
  std::string text;
  // The last place that differs from the next, after which "..." stands for the rest.
  size_t shown = form.size();
  while (many && shown > least + 1 && form[shown - 2] == form.back()) --shown;
  for (size_t i = 0; i < shown; ++i) {
    text += i ? " " : "";
    text += (i >= least ? "[" : "") + form[i];
  }
  if (many) text += " ...";
  return text + std::string(shown - std::min(shown, least), ']');
}

}  // namespace

std::string acceptedArguments(Command const& command) {
  std::string text;
  Form longest;
  size_t least = 0;
  bool open = false;
  auto const close = [&] {
    if (open) text += (text.empty() ? "" : " or ") + (longest.empty() ? "none" : textOf(least, longest));
    open = false;
  };
  for (size_t count = 0; count <= kMany; ++count) {
    std::optional<Form> const form = formOf(command, count);
    if (!form || (open && !std::equal(longest.begin(), longest.end(), form->begin()))) close();
    if (!form) continue;
    if (!open) least = count;
    open = true;
    longest = *form;
  }
  close();
  return text.empty() ? "no list that was tried" : text;
}

}  // namespace talix
