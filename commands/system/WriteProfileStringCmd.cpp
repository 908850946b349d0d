#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/services/HInterface.h"

namespace {

class WriteProfileStringCmd final : public ScriptCommand<WriteProfileStringCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "writeProfileString",
      .displayName = "Write HString Value To Profile",
      .category = "System",
      .purpose = "Writes a text to a settings file.",
      .example = "writeProfileString Lab Site \"Motion lab\"",
      .args = {"\"sectionHeader\" \"entry\" \"value\"",
               3,
               3,
               {Variable::String, Variable::String, Variable::String}},
      .argsText = "Section, entry and value. Returns whether it could be written.",
      .options = {{"file", "the settings file to write; else the program's own", 1, Variable::String}},
      .returns = Variable::Bool,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override {
    HString const file = GivenOptions(given).textOr(info.option("file"), "");
    return answer(result,
                  g_interface->writeProfileString(args[0].getStringValue(-1), args[1].getStringValue(-1),
                                                  args[2].getStringValue(-1), file));
  }
};

}  // namespace

Command* newWriteProfileStringCmd() { return new (std::nothrow) WriteProfileStringCmd; }
