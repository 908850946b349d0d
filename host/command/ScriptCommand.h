// Commands by declaration. A command's names, options, arguments, result and help are one constant record at
// the top of its file; ScriptCommand turns the record into what the host asks for.
//
//   class GetNumKeysCmd final : public ScriptCommand<GetNumKeysCmd> {
//    public:
//     static constexpr CommandInfo info = {
//         .name = "getNumKeys", .displayName = "Get Number of Keys",
//         .category = "Data Editing", .subCategory = "Data Retrieval",
//         .purpose = "Counts the keys of a channel.",
//         .example = "getNumKeys Translation -s",
//         .args = {"propertyName", 1, 1, {Variable::String}},
//         .argsText = "propertyName is a channel, or a component of one such as tx.",
//         .options = {{"s", "only the selected keys"},
//                     {"onMod", "path of the module; else the primary selected one", 1, Variable::String}},
//         .returns = Variable::Int, .solo = Solo::no};
//     static constexpr int kSelected = info.option("s"), kOnMod = info.option("onMod");
//     bool execute(Given const& given, Args const& args, Variable& result) override;
//   };
#pragma once

#include <cstdint>
#include <string_view>

#include "host/command/Command.h"

struct OptionInfo {
  char const* name = nullptr;
  char const* text = "";  // what it does, in one line
  int argCount = 0;
  Variable::VarType type = Variable::None;
  uint64 mask = 0;      // bits of the options that it excludes, by index
  bool hidden = false;  // accepted, but not shown in help

  constexpr OptionInfo() = default;
  constexpr OptionInfo(char const* itsName, char const* itsText, int count = 0,
                       Variable::VarType itsType = Variable::None, uint64 excluded = 0, bool isHidden = false)
      : name(itsName), text(itsText), argCount(count), type(itsType), mask(excluded), hidden(isHidden) {}
  // Without a text.
  constexpr OptionInfo(char const* itsName, int count = 0, Variable::VarType itsType = Variable::None,
                       uint64 excluded = 0, bool isHidden = false)
      : OptionInfo(itsName, "", count, itsType, excluded, isHidden) {}
};

// The positional arguments: the text for help, how many, and the types of the first ones.
struct ArgsInfo {
  static constexpr int kHostDefault = -1;  // as `least`: the host's own check
  static constexpr int kAny = INT32_MAX;   // as `most`

  char const* syntax = nullptr;  // null: the host's default text
  int least = kHostDefault;
  int most = 0;
  Variable::VarType types[6] = {};            // of the first arguments; None: any type
  Variable::VarType others = Variable::None;  // of those beyond them; None: any type
};

enum class Solo : unsigned char { hostDefault, no, yes };

struct CommandInfo {
  static constexpr int kMaxOptions = 12;
  static constexpr Variable::VarType kHostDefault = Variable::None;

  char const* name;
  char const* displayName;
  char const* category;
  char const* subCategory = "";
  char const* purpose = "";
  char const* example = "";  // a script line
  ArgsInfo args = {};
  char const* argsText = "";                 // what they are and what the command works on, in a few lines
  OptionInfo options[kMaxOptions + 1] = {};  // in declaration order; the first without a name ends them
  Variable::VarType returns = kHostDefault;
  Solo solo = Solo::hostDefault;

  // The index of an option. A name that is not declared does not compile.
  consteval int option(std::string_view wanted) const {
    for (int i = 0; options[i].name; ++i)
      if (options[i].name == wanted) return i;
    throw "no such option";
  }
};

using Given = TArray<CommandOption>;
using Args = TArray<Variable>;

// Whether arguments fit their declaration, by number and type.
inline bool fits(ArgsInfo const& info, Args const& args) {
  int const count = args.getCount();
  if (count < info.least || count > info.most) return false;
  for (int i = 0; i < count; ++i) {
    Variable::VarType const wanted =
        i < static_cast<int>(std::size(info.types)) && info.types[i] != Variable::None ? info.types[i]
                                                                                       : info.others;
    if (wanted != Variable::None && args[i].getType() != wanted) return false;
  }
  return true;
}

template <class Self>
class ScriptCommand : public Command {
 public:
  void getArgSyntaxString(HString& out) const override {
    Self::info.args.syntax ? static_cast<void>(out = Self::info.args.syntax)
                           : Command::getArgSyntaxString(out);
  }
  bool checkArgSyntax(Args const& args, Given const& options) const override {
    if (Self::info.args.least == ArgsInfo::kHostDefault) return Command::checkArgSyntax(args, options);
    return fits(Self::info.args, args);
  }
  bool canExecuteSolo() const override {
    return Self::info.solo == Solo::hostDefault ? Command::canExecuteSolo() : Self::info.solo == Solo::yes;
  }
  Variable::VarType getReturnType() override {
    return Self::info.returns == CommandInfo::kHostDefault ? Command::getReturnType() : Self::info.returns;
  }

 protected:
  ScriptCommand() : Command(Self::info.name, Self::info.displayName, "") {
    setCommandCategory(Self::info.category, Self::info.subCategory);
    setPurpose(Self::info.purpose);
    setArgsText(Self::info.argsText);
    setExample(Self::info.example);
    for (OptionInfo const* o = Self::info.options; o->name; ++o) {
      addOption(CommandOption::createInstance(o->name, o->argCount, o->type, false), o->mask, o->hidden);
      setOptionText(o->text);
    }
  }
};

// The options given on a line, by declaration index. Where one is given several times the last decides.
class GivenOptions {
 public:
  explicit GivenOptions(Given const& given) : m_given(given) {}

  // The last occurrence, null when not given.
  CommandOption const* find(int index) const {
    CommandOption const* last = nullptr;
    for (CommandOption const& option : m_given)
      if (option.getIndex() == index) last = &option;
    return last;
  }
  bool has(int index) const { return find(index) != nullptr; }
  HString textOr(int index, HString const& otherwise) const {
    CommandOption const* option = find(index);
    return option ? HString(option->getArg(0).getStringValue(-1)) : otherwise;
  }

 private:
  Given const& m_given;
};
