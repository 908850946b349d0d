// One line of a script, read against the commands that there are: a command's name, then options and values
// in any order.
//
//   # comment, where a token could start        12  -3        integer of 32 bits
//   "it's" 'say ""no""'  word  \Subject\Hips    1.5  1e3      float
//   <1 2 3>  <1, 2, 3>                          true false on off toggle
//   [a b c]  []    one type of element; an empty one holds strings
//
// In a string the backslash is ordinary and a doubled quote stands for one. An option is "-" and a letter and
// takes as many of the values after it as it declares; these are converted where nothing is lost.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "host/command/ScriptCommand.h"
#include "session/CommandRegistry.h"

namespace talix {

// Reading reuses the buffers of the line before, so keep one object for many lines.
class ScriptLine {
 public:
  enum class Outcome { Blank, Command, Refused };

  // Blank lines and comments name no command. What a refused line lacks is said by problem().
  Outcome read(std::string_view line, CommandRegistry const& commands);

  std::string const& name() const { return m_name; }
  Command* command() const { return m_command; }
  Args const& args() const { return m_args; }
  Given const& options() const { return m_options; }
  std::string const& problem() const { return m_problem; }

 private:
  bool atEnd() const { return m_at == m_line.size(); }
  // Whether a token starts here; comments and the end of the line start none.
  bool skipToToken();
  bool startsOption() const;
  std::string_view takeWord(bool inArray);

  bool readOption();
  bool readOptionValue(CommandOption const& option, Variable& out);
  bool readValue(Variable& out, bool inArray);
  bool readWordValue(Variable& out, bool inArray);
  bool readString(Variable& out, bool inArray);
  bool readVector(Variable& out, bool inArray);
  bool readComponent(double& out);
  bool readArray(Variable& out);
  bool endValue(bool inArray);

  void setText(Variable& out, std::string_view text);
  bool refuse(size_t at, std::string const& what);
  bool refuseWord(size_t at, std::string_view word, char const* why);
  bool refuseOptionValue(CommandOption const& option);

  std::string_view m_line;
  size_t m_at = 0;
  Command* m_command = nullptr;
  std::string m_name, m_problem, m_text;
  Args m_args;
  Given m_options;
  std::vector<Variable> m_elements;
};

}  // namespace talix
