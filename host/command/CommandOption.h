// One declared option of a script command and, in the list of given options, one option with its arguments.
#pragma once

#include "host/base/HString.h"
#include "host/base/TArray.h"
#include "host/command/Variable.h"

class CommandOption {
 public:
  CommandOption() = default;
  // `listed` is part of the host's interface and unused.
  CommandOption(HString const& name, int argCount, Variable::VarType type, bool listed);
  CommandOption(CommandOption const&) = default;
  CommandOption& operator=(CommandOption const&) = default;
  virtual ~CommandOption();

  static CommandOption* createInstance(HString const& name, int argCount, Variable::VarType type,
                                       bool listed);

  HString const& getName() const { return m_name; }
  int getArgCount() const { return m_argCount; }
  Variable::VarType getType() const { return m_type; }
  // Position among the command's declared options, -1 before it is declared.
  int getIndex() const { return m_index; }
  // A bit for each option, by index, that this one excludes.
  uint64 getMask() const { return m_mask; }
  // Accepted, but not shown in help.
  bool isHidden() const { return m_hidden; }

  // Argument i of a given option; an empty value beyond them.
  Variable const& getArg(int i) const;
  // False when i is no argument of the option.
  bool setArg(int i, Variable const& value);

 private:
  friend class Command;

  HString m_name;
  int m_argCount = 0;
  Variable::VarType m_type = Variable::None;
  int m_index = -1;
  uint64 m_mask = 0;
  bool m_hidden = false;
  TArray<Variable> m_args;
};
