#include "commands/objects/SceneQueries.h"
#include "host/command/Results.h"

namespace {

class GetParentCmd final : public ScriptCommand<GetParentCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getParent",
      .displayName = "Get Parent",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The path of the parent of a module; nothing when it has none.",
      .example = "getParent Knee -nameOnly",
      .args = {"module", 1, 1, {Variable::String}},
      .argsText = "module is a path.",
      .options = {{"fullPath", "path from the root; default the shortest that is unique", 0, Variable::None,
                   2},
                  {"nameOnly", "name without a path", 0, Variable::None, 1}},
      .returns = Variable::String,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool GetParentCmd::execute(Given const& given, Args const& args, Variable& result) {
  Module const* module = moduleAt(args[0].getStringValue(-1));
  if (!module) return false;
  Module const* parent = module->getParent();
  return !parent || answer(result, parent->getPath(pathType<GetParentCmd>(given)));
}

}  // namespace

Command* newGetParentCmd() { return new (std::nothrow) GetParentCmd; }
