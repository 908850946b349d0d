// Base class of every script command.
//
// The host checks the arguments first (checkArgSyntax); execute runs only when they are accepted. It returns
// true on success and false on failure, after at least one error line; `result` stays unset on failure.
// Commands are reference-counted and keep no state between runs. Everything happens on the thread that
// holds the scene (SceneScope.h).
#pragma once

#include <memory>
#include <vector>

#include "host/base/HObject.h"
#include "host/base/ItemAt.h"
#include "host/base/TArray.h"
#include "host/command/CommandOption.h"

class Command : public HObject {
  // Every command returns this record: commands declare none of their own.
  H_DECLARE_CLASS(Command, HObject)

 public:
  // The third text is unused; it is part of the host's interface. A new command holds one reference.
  Command(HString const& scriptName, HString const& displayName, HString const& unused);
  ~Command() override;
  void deleteThis() override { unref(); }

  virtual bool execute(TArray<CommandOption> const& givenOptions, TArray<Variable> const& args,
                       Variable& result) = 0;
  // The text for the arguments, as help shows it. The host's default is no text.
  virtual void getArgSyntaxString(HString& out) const;
  // Whether these arguments are accepted. The host's default accepts none.
  virtual bool checkArgSyntax(TArray<Variable> const& args, TArray<CommandOption> const& options) const;
  // Whether the command makes sense without arguments and options: for interfaces. The host's default is
  // true.
  virtual bool canExecuteSolo() const;
  // The host's default is Variable::None.
  virtual Variable::VarType getReturnType();
  // The index of the option of that name (without "-"), its argument count and type; -1 when there is none.
  virtual int getOptionSyntax(char const* name, int& argCount, Variable::VarType& type) const;
  // Whether running it is a step of undo. The host's default is true.
  virtual bool isUndoable() const;

  HString const& getName() const { return m_name; }
  HString const& getDisplayName() const { return m_displayName; }
  HString const& getCategory() const { return m_category; }
  HString const& getSubCategory() const { return m_subCategory; }
  // What it is for, in one line.
  HString const& getPurpose() const { return m_purpose; }
  // What the arguments are and what the command works on, in a few lines.
  HString const& getArgsText() const { return m_argsText; }
  // A script line.
  HString const& getExample() const { return m_example; }

  int getNumOptions() const { return static_cast<int>(m_options.size()); }
  // One without a name beyond them.
  CommandOption const& getOption(int i) const {
    CommandOption const* option = itemAt(m_options, i);
    return option ? *option : noOption();
  }
  // What it does, in one line; empty beyond them.
  HString const& getOptionText(int i) const;

  void ref() { ++m_references; }
  // Lets go of one reference; with the last the command is destroyed, and the result is true.
  bool unref();

  // One line to the log; printf-style.
  static void logError(char const* format, ...) TALIX_PRINTF(1, 2);
  static void logWarning(char const* format, ...) TALIX_PRINTF(1, 2);
  static void logInfo(char const* format, ...) TALIX_PRINTF(1, 2);

 protected:
  void setCommandCategory(HString category, HString subCategory);
  void setPurpose(HString const& purpose) { m_purpose = purpose; }
  void setArgsText(HString const& text) { m_argsText = text; }
  void setExample(HString const& line) { m_example = line; }
  // Of the option that was declared last; nothing happens before the first.
  void setOptionText(HString const& text);
  // Declares the next option, which the command owns from then on. mask: bits, by index, of the options it
  // excludes. hidden: accepted, but not shown in help.
  CommandOption* addOption(CommandOption* option, uint64 mask, bool hidden);

 private:
  static CommandOption const& noOption();

  HString m_name, m_displayName, m_category, m_subCategory, m_purpose, m_argsText, m_example;
  std::vector<std::unique_ptr<CommandOption>> m_options;
  std::vector<HString> m_optionTexts;  // by index
  int m_references = 1;
};
