#include "session/RegistryPage.h"

#include <cctype>

#include "session/AcceptedArguments.h"
#include "session/CommandHelp.h"
#include "session/ScriptText.h"

namespace talix {

namespace {

// The options whose bits are in a mask, by name; bits of no option by number.
std::string maskText(Command const& command, uint64 mask) {
  std::string text = " (mask " + std::to_string(mask) + ":";
  for (int bit = 0; bit < 64; ++bit)
    if (mask >> bit & 1)
      text += bit < command.getNumOptions() ? " -" + command.getOption(bit).getName().GetString()
                                            : " " + std::to_string(bit);
  return text + ")";
}

// What reads as the start of a tag in Markdown stands for itself.
std::string escaped(std::string const& text) {
  std::string out;
  for (char const c : text) out += c == '<' ? std::string("\\<") : std::string(1, c);
  return out;
}

std::string optionText(Command const& command, CommandOption const& option) {
  std::string text = "\n  - `" + optionSyntax(option) + "`";
  if (option.getMask()) text += maskText(command, option.getMask());
  if (option.isHidden()) text += " (hidden)";
  HString const& what = command.getOptionText(option.getIndex());
  return what.IsEmpty() ? text : text + ": " + escaped(what.GetString());
}

// "Talix Data Commands, 3 of 94".
std::string placeText(CommandRegistry const& commands, CommandRegistry::Entry const& entry) {
  int place = 0, count = 0;
  for (auto const& other : commands.entries()) {
    if (other.source != entry.source) continue;
    ++count;
    if (&other == &entry) place = count;
  }
  return entry.source + ", " + std::to_string(place) + " of " + std::to_string(count);
}

void addCommand(CommandRegistry const& commands, CommandRegistry::Entry const& entry, bool forDevelopers,
                std::string& page) {
  Command& command = *entry.command;
  std::string const name = command.getName().GetString(), syntax = argSyntax(command);
  page += "\n\n### " + name + "\n\n" + (forDevelopers ? "For developers. " : "");
  page += command.getDisplayName().GetString() + ". " + command.getPurpose().GetString();
  if (!command.getArgsText().IsEmpty()) page += "\n\n" + escaped(command.getArgsText().GetString());
  page += "\n\n    " + name + (syntax.empty() ? "" : " " + syntax) + "\n";
  if (!command.getExample().IsEmpty()) page += "\n- Example: `" + command.getExample().GetString() + "`";
  page += "\n- Arguments: " + acceptedArguments(command);
  if (command.getNumOptions() > 0) page += "\n- Options:";
  for (int i = 0; i < command.getNumOptions(); ++i) page += optionText(command, command.getOption(i));
  page += "\n- Returns: " + typeName(command.getReturnType());
  page += std::string("\n- Makes sense alone: ") + (command.canExecuteSolo() ? "yes" : "no");
  page += "\n- Source: " + placeText(commands, entry);
}

// Headings become anchors in lower case, with "-" for blanks and without other signs.
std::string linkTo(std::string const& heading) {
  std::string anchor;
  for (char const c : heading)
    if (c == ' ' || isLetter(c) || (c >= '0' && c <= '9'))
      anchor += c == ' ' ? '-' : static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return "[" + heading + "](#" + anchor + ")";
}

}  // namespace

std::string registryPage(CommandRegistry const& commands,
                         std::function<bool(std::string const& name)> const& isForDevelopers) {
  std::string page =
      "# Commands\n\n"
      "Written by the program (`tests/registry/check build/release/bin/talix --update`): not to be edited.\n"
      "Options are in the order of their indices; a mask has the bits of the options that one excludes, and\n"
      "two exclude each other where each names the other.\n";
  std::vector<CommandGroup> const groups = groupsOf(commands);
  for (CommandGroup const& group : groups) {
    page += "\n- " + linkTo(group.category) + ":";
    for (auto const* entry : group.entries)
      page +=
          (entry == group.entries.front() ? "\n  " : ",\n  ") + linkTo(entry->command->getName().GetString());
  }
  for (CommandGroup const& group : groups) {
    page += "\n\n## " + group.category;
    for (auto const* entry : group.entries)
      addCommand(commands, *entry, isForDevelopers(entry->command->getName().GetString()), page);
  }
  return page;
}

}  // namespace talix
