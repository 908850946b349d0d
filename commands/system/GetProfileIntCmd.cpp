#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/services/HInterface.h"

namespace {

class GetProfileIntCmd final : public ScriptCommand<GetProfileIntCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getProfileInt",
      .displayName = "Get Int Value From Profile",
      .category = "System",
      .purpose = "Reads a whole number from a settings file.",
      .example = "getProfileInt Undo MemoryMB 1024",
      .args = {"\"sectionHeader\" \"entry\" defaultValue",
               3,
               3,
               {Variable::String, Variable::String, Variable::Int}},
      .argsText = "Section and entry, in exact case, and the value to return where there is no such entry.",
      .options = {{"file", "the settings file to read; else the program's own", 1, Variable::String}},
      .returns = Variable::Int,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override {
    HString const file = GivenOptions(given).textOr(info.option("file"), "");
    return answer(result, g_interface->getProfileInt(args[0].getStringValue(-1), args[1].getStringValue(-1),
                                                     args[2].getIntValue(-1), file));
  }
};

}  // namespace

Command* newGetProfileIntCmd() { return new (std::nothrow) GetProfileIntCmd; }
