#include "host/command/Command.h"

#include <cstdarg>

#include "host/base/Log.h"
#include "host/base/Text.h"

H_DEFINE_ABSTRACT_CLASS(Command);

namespace {

void log(LogLevel level, char const* format, va_list args) { writeLog(level, formatted(format, args)); }

}  // namespace

Command::Command(HString const& scriptName, HString const& displayName, HString const&)
    : m_name(scriptName), m_displayName(displayName) {}

Command::~Command() = default;

void Command::getArgSyntaxString(HString& out) const { out = ""; }

bool Command::checkArgSyntax(TArray<Variable> const& args, TArray<CommandOption> const&) const {
  return args.getCount() == 0;
}

bool Command::canExecuteSolo() const { return true; }

Variable::VarType Command::getReturnType() { return Variable::None; }

int Command::getOptionSyntax(char const* name, int& argCount, Variable::VarType& type) const {
  for (auto const& option : m_options) {
    if (option->getName() != name) continue;
    argCount = option->getArgCount();
    type = option->getType();
    return option->getIndex();
  }
  return -1;
}

bool Command::isUndoable() const { return true; }

CommandOption const& Command::noOption() {
  static CommandOption const& nothing = *CommandOption::createInstance("", 0, Variable::None, false);
  return nothing;
}

HString const& Command::getOptionText(int i) const {
  static HString const nothing;
  return i >= 0 && i < getNumOptions() ? m_optionTexts[static_cast<size_t>(i)] : nothing;
}

bool Command::unref() {
  if (--m_references > 0) return false;
  delete this;
  return true;
}

void Command::logError(char const* format, ...) {
  va_list args;
  va_start(args, format);
  log(LogLevel::Error, format, args);
  va_end(args);
}

void Command::logWarning(char const* format, ...) {
  va_list args;
  va_start(args, format);
  log(LogLevel::Warning, format, args);
  va_end(args);
}

void Command::logInfo(char const* format, ...) {
  va_list args;
  va_start(args, format);
  log(LogLevel::Info, format, args);
  va_end(args);
}

void Command::setCommandCategory(HString category, HString subCategory) {
  m_category = std::move(category);
  m_subCategory = std::move(subCategory);
}

CommandOption* Command::addOption(CommandOption* option, uint64 mask, bool hidden) {
  option->m_index = getNumOptions();
  option->m_mask = mask;
  option->m_hidden = hidden;
  m_options.emplace_back(option);
  m_optionTexts.emplace_back();
  return option;
}

void Command::setOptionText(HString const& text) {
  if (!m_optionTexts.empty()) m_optionTexts.back() = text;
}
