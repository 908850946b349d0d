#include "host/command/CommandOption.h"

CommandOption::CommandOption(HString const& name, int argCount, Variable::VarType type, bool)
    : m_name(name), m_argCount(argCount), m_type(type) {}

CommandOption::~CommandOption() = default;

CommandOption* CommandOption::createInstance(HString const& name, int argCount, Variable::VarType type,
                                             bool listed) {
  return new CommandOption(name, argCount, type, listed);
}

Variable const& CommandOption::getArg(int i) const {
  static Variable const nothing;
  return i >= 0 && i < m_args.getCount() ? m_args[i] : nothing;
}

bool CommandOption::setArg(int i, Variable const& value) {
  if (i < 0 || i >= m_argCount) return false;
  while (m_args.getCount() <= i) m_args.add(Variable());
  m_args[i] = value;
  return true;
}
