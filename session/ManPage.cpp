#include "session/ManPage.h"

#include "session/CommandHelp.h"

namespace talix {

namespace {

std::string paragraph(HString const& text) { return text.IsEmpty() ? "" : roffText(text.GetString()) + "\n"; }

std::string optionParagraphs(Command const& command) {
  std::string text;
  for (int i = 0; i < command.getNumOptions(); ++i)
    if (CommandOption const& option = command.getOption(i); !option.isHidden())
      text += ".TP\n.B " + roffText(optionSyntax(option)) + "\n" +
              roffText(command.getOptionText(i).GetString()) + "\n";
  return text;
}

}  // namespace

std::string roffText(std::string const& text) {
  std::string out = text.starts_with('.') || text.starts_with('\'') ? "\\&" : "";
  for (char const c : text) {
    if (c == '\\')
      out += "\\e";
    else if (c == '-')
      out += "\\-";
    else if (c == '"')
      out += "\\(dq";
    else
      out += c;
    if (c == '\n') out += "\\&";
  }
  return out;
}

std::string manCommands(CommandRegistry const& commands) {
  std::string page = ".SH SCRIPT COMMANDS\n";
  for (CommandGroup const& group : groupsOf(commands)) {
    page += ".SS " + roffText(group.category) + "\n";
    for (auto const* entry : group.entries) {
      Command& command = *entry->command;
      page += ".PP\n.B " + roffText(usageOf(command)) + "\n.br\n" + paragraph(command.getPurpose()) +
              paragraph(command.getArgsText()) + optionParagraphs(command);
      if (!command.getExample().IsEmpty())
        page += ".PP\nExample:\n.nf\n" + roffText("    " + command.getExample().GetString()) + "\n.fi\n";
    }
  }
  return page;
}

}  // namespace talix
