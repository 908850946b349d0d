#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/services/HInterface.h"

namespace {

class WriteProfileIntCmd final : public ScriptCommand<WriteProfileIntCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "writeProfileInt",
      .displayName = "Write Int Value To Profile",
      .category = "System",
      .purpose = "Writes a whole number to a settings file.",
      .example = "writeProfileInt Undo MemoryMB 1024",
      .args = {"\"sectionHeader\" \"entry\" value",
               3,
               3,
               {Variable::String, Variable::String, Variable::Int}},
      .argsText = "Section, entry and value. Returns whether it could be written.",
      .options = {{"file", "the settings file to write; else the program's own", 1, Variable::String}},
      .returns = Variable::Bool,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override {
    HString const file = GivenOptions(given).textOr(info.option("file"), "");
    return answer(result, g_interface->writeProfileInt(args[0].getStringValue(-1), args[1].getStringValue(-1),
                                                       args[2].getIntValue(-1), file));
  }
};

}  // namespace

Command* newWriteProfileIntCmd() { return new (std::nothrow) WriteProfileIntCmd; }
