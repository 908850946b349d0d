#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace {

class ExistsCmd final : public ScriptCommand<ExistsCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "exists",
      .displayName = "Exists",
      .category = "Data Editing",
      .purpose = "Tells whether a path names a module, of any type or of a given one.",
      .example = "exists Anna\\LFHD -type Marker",
      .args = {"modPath", 1, 1, {Variable::String}},
      .argsText =
          "modPath is a full path or the end of one; an end that fits several modules counts only below the "
          "priority module.",
      .options = {{"type", "class name; modules of its subclasses count too", 1, Variable::String},
                  {"priorityOnly", "looks only below the priority module; everywhere when there is none"}},
      .returns = Variable::Bool,
      .solo = Solo::no};
  static constexpr int kType = info.option("type"), kPriorityOnly = info.option("priorityOnly");

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool ExistsCmd::execute(Given const& given, Args const& args, Variable& result) {
  GivenOptions const options(given);
  HRuntimeClass const* type = nullptr;
  if (options.has(kType)) {
    HString const name = options.textOr(kType, "");
    type = HRuntimeClass::findClass(name.GetStr());  // kept: any class, though no module has most of them
    if (!type) {
      logError("%s is not a Module type", name.GetStr());
      return false;
    }
  }
  HString const path = args[0].getStringValue(-1);
  return answer(result, g_db->getModuleWithPath(path, type, options.has(kPriorityOnly)) != nullptr);
}

}  // namespace

Command* newExistsCmd() { return new (std::nothrow) ExistsCmd; }
