#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/services/HInterface.h"

namespace {

class GetProfileStringCmd final : public ScriptCommand<GetProfileStringCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getProfileString",
      .displayName = "Get HString Value From Profile",
      .category = "System",
      .purpose = "Reads a text from a settings file.",
      .example = "getProfileString Lab Site none",
      .args = {"\"sectionHeader\" \"entry\" \"defaultValue\"",
               3,
               3,
               {Variable::String, Variable::String, Variable::String}},
      .argsText = "Section and entry, in exact case, and the text to return where there is no such entry.",
      .options = {{"file", "the settings file to read; else the program's own", 1, Variable::String}},
      .returns = Variable::String,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override {
    HString const file = GivenOptions(given).textOr(info.option("file"), "");
    return answer(result,
                  g_interface->getProfileString(args[0].getStringValue(-1), args[1].getStringValue(-1),
                                                args[2].getStringValue(-1), file));
  }
};

}  // namespace

Command* newGetProfileStringCmd() { return new (std::nothrow) GetProfileStringCmd; }
