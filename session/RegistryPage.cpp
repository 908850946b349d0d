#include "session/RegistryPage.h"

#include <algorithm>

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

std::string optionText(Command const& command, CommandOption const& option) {
  std::string text = "`" + optionSyntax(option) + "`";
  if (option.getMask()) text += maskText(command, option.getMask());
  return text + (option.isHidden() ? " (hidden)" : "");
}

void addCommand(CommandRegistry::Entry const& entry, bool forDevelopers, std::string& page) {
  Command& command = *entry.command;
  std::string const name = command.getName().GetString(), syntax = argSyntax(command);
  page += "\n\n### " + name + (forDevelopers ? " (for developers)" : "");
  page += "\n\n" + command.getDisplayName().GetString() + ". " + command.getPurpose().GetString();
  page += "\n\n    " + name + (syntax.empty() ? "" : " " + syntax) + "\n";
  page += "\n- Category: " + command.getCategory().GetString();
  if (!command.getSubCategory().IsEmpty()) page += " / " + command.getSubCategory().GetString();
  page += "\n- Arguments: " + acceptedArguments(command);
  for (int i = 0; i < command.getNumOptions(); ++i)
    page += (i ? ", " : "\n- Options: ") + optionText(command, command.getOption(i));
  page += "\n- Returns: " + typeName(command.getReturnType());
  page += std::string("\n- Makes sense alone: ") + (command.canExecuteSolo() ? "yes" : "no");
}

}  // namespace

std::string registryPage(CommandRegistry const& commands,
                         std::function<bool(std::string const& name)> const& isForDevelopers) {
  std::string page =
      "# Commands\n\n"
      "Written by the program (`tests/registry/check build/release/bin/talix --update`): not to be edited.\n"
      "Options are in the order of their indices; a mask has the bits of the options that one excludes, and\n"
      "two exclude each other where each names the other.";
  std::string source;
  for (auto const& entry : commands.entries()) {
    if (entry.source != source) {
      source = entry.source;
      auto const count = std::count_if(commands.entries().begin(), commands.entries().end(),
                                       [&](auto const& other) { return other.source == source; });
      page += "\n\n## " + source + ": " + std::to_string(count) + " commands";
    }
    addCommand(entry, isForDevelopers(entry.command->getName().GetString()), page);
  }
  return page;
}

}  // namespace talix
