#include "session/CommandHelp.h"

#include <algorithm>
#include <sstream>

#include "session/ScriptText.h"

namespace talix {

namespace {

std::string categoryOf(Command const& command) {
  std::string category = command.getCategory().GetString();
  if (!command.getSubCategory().IsEmpty()) category += " / " + command.getSubCategory().GetString();
  return category;
}

std::string const& purposeOf(Command const& command) {
  return (command.getPurpose().IsEmpty() ? command.getDisplayName() : command.getPurpose()).GetString();
}

std::string padded(std::string text, size_t width) {
  if (text.size() < width) text.resize(width, ' ');
  return text;
}

std::vector<CommandOption const*> shownOptions(Command const& command) {
  std::vector<CommandOption const*> shown;
  for (int i = 0; i < command.getNumOptions(); ++i)
    if (!command.getOption(i).isHidden()) shown.push_back(&command.getOption(i));
  return shown;
}

std::string optionLines(Command const& command, std::vector<CommandOption const*> const& options) {
  size_t width = 0;
  for (auto const* option : options) width = std::max(width, optionSyntax(*option).size());
  std::string lines;
  for (auto const* option : options) {
    std::string text = command.getOptionText(option->getIndex()).GetString(), excluded;
    for (auto const* other : options)
      if (excludeEachOther(*option, *other))
        excluded += (excluded.empty() ? "excludes -" : ", -") + other->getName().GetString();
    if (!excluded.empty()) text += text.empty() ? excluded : " (" + excluded + ")";
    lines += "\n  ";
    lines += text.empty() ? optionSyntax(*option) : padded(optionSyntax(*option), width + 2) + text;
  }
  return lines;
}

// Indented, in lines of 100 characters where words allow it.
std::string paragraph(std::string const& text) {
  std::string lines;
  size_t column = 0;
  std::istringstream words(text);
  for (std::string word; words >> word; column += word.size() + 1) {
    bool const starts = lines.empty() || column + word.size() > 100;
    if (starts) column = 2;
    lines += (starts ? "\n  " : " ") + word;
  }
  return lines;
}

}  // namespace

std::vector<CommandGroup> groupsOf(CommandRegistry const& commands) {
  std::vector<CommandGroup> groups;
  for (auto const& entry : commands.entries()) {
    std::string const category = categoryOf(*entry.command);
    auto group = std::ranges::find(groups, category, &CommandGroup::category);
    if (group == groups.end()) group = groups.insert(group, {category, {}});
    group->entries.push_back(&entry);
  }
  return groups;
}

std::string optionSyntax(CommandOption const& option) {
  std::string text = "-" + option.getName().GetString();
  for (int i = 0; i < option.getArgCount(); ++i) text += " " + typeName(option.getType());
  return text;
}

bool excludeEachOther(CommandOption const& a, CommandOption const& b) {
  auto const excludes = [](CommandOption const& option, CommandOption const& other) {
    return (option.getMask() >> other.getIndex() & 1) != 0;
  };
  return a.getIndex() != b.getIndex() && excludes(a, b) && excludes(b, a);
}

std::string usageOf(Command const& command) {
  std::string usage = command.getName().GetString();
  if (std::string const syntax = argSyntax(command); !syntax.empty()) usage += " " + syntax;
  for (auto const* option : shownOptions(command)) usage += " [" + optionSyntax(*option) + "]";
  return usage;
}

std::string commandList(CommandRegistry const& commands) {
  size_t width = 0;
  for (auto const& entry : commands.entries())
    width = std::max(width, entry.command->getName().GetString().size());
  std::string text;
  for (CommandGroup const& group : groupsOf(commands)) {
    text += (text.empty() ? "" : "\n\n") + group.category;
    for (auto const* entry : group.entries)
      text += "\n  " + padded(entry->command->getName().GetString(), width + 2) + purposeOf(*entry->command);
  }
  return text;
}

std::string commandPage(CommandRegistry::Entry const& entry) {
  Command& command = *entry.command;
  auto const options = shownOptions(command);

  std::string text = command.getName().GetString() + ": " + command.getDisplayName().GetString();
  if (!command.getPurpose().IsEmpty()) text += "\n" + command.getPurpose().GetString();
  text += "\n\nUsage: " + usageOf(command) + paragraph(command.getArgsText().GetString());
  if (!options.empty()) text += "\n\nOptions:" + optionLines(command, options);
  if (!command.getExample().IsEmpty()) text += "\n\nExample: " + command.getExample().GetString();
  text += "\n\nReturns: " + typeName(command.getReturnType());
  text += "\nCategory: " + categoryOf(command);
  return text += "\nSource: " + entry.source;
}

}  // namespace talix
