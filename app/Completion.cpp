#include "app/Completion.h"

namespace talix {

namespace {

constexpr char const* kFunctions = R"(
# A line of a script that stands in one word, open quote included: its command, then the options of that.
_talix_line() {
  local quote= line=$1 last
  case $line in [\"\']*) quote=${line:0:1} line=${line:1} ;; esac
  last=${line##* }
  if [[ $line != *' '* ]]; then
    COMPREPLY=($(compgen -W "${!_talix_commands[*]}" -- "$line"))
  elif [[ $last == -* ]]; then
    local option
    for option in ${_talix_commands[${line%% *}]}; do
      [[ $option == "$last"* ]] && COMPREPLY+=("${line% *} $option")
    done
  fi
}

_talix() {
  local current=${COMP_WORDS[COMP_CWORD]} previous=${COMP_WORDS[COMP_CWORD-1]} sub=${COMP_WORDS[1]}
  COMPREPLY=()
  if ((COMP_CWORD == 1)); then
    COMPREPLY=($(compgen -W "${!_talix_subcommands[*]} --help --version" -- "$current"))
  elif [[ $previous == -c && $sub == run ]]; then
    _talix_line "$current"
  elif [[ $current == -* ]]; then
    COMPREPLY=($(compgen -W "${_talix_subcommands[$sub]}" -- "$current"))
  elif [[ $sub == commands && $previous != --plugin ]]; then
    COMPREPLY=($(compgen -W "${!_talix_commands[*]}" -- "$current"))
  else
    COMPREPLY=($(compgen -f -- "$current"))
  fi
}
complete -o filenames -F _talix talix
)";

}  // namespace

std::string bashCompletion(Subcommands const& subcommands, CommandRegistry const& commands) {
  std::string script =
      "# Completion of talix for bash, written by the program.\ndeclare -A _talix_subcommands=(\n";
  for (auto const& [name, options] : subcommands) {
    script += "  [" + name + "]=\"";
    for (std::string const& option : options) script += option + " ";
    script += "\"\n";
  }
  script += ")\ndeclare -A _talix_commands=(\n";
  for (auto const& [command, source] : commands.entries()) {
    script += "  [" + command->getName().GetString() + "]=\"";
    for (int i = 0; i < command->getNumOptions(); ++i)
      if (CommandOption const& option = command->getOption(i); !option.isHidden())
        script += "-" + option.getName().GetString() + " ";
    script += "\"\n";
  }
  return script + ")\n" + kFunctions;
}

}  // namespace talix
