#include "commands/objects/SceneQueries.h"
#include "host/command/Results.h"

namespace {

class GetModuleCmd final : public ScriptCommand<GetModuleCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getModule",
      .displayName = "Get Scene Module",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The path of the primary selected module.",
      .example = "getModule -fullPath",
      .argsText = "Fails when no module is primary.",
      .options = {{"fullPath", "path from the root; default the shortest that is unique", 0, Variable::None,
                   2},
                  {"nameOnly", "name without a path", 0, Variable::None, 1}},
      .returns = Variable::String};

  bool execute(Given const& given, Args const&, Variable& result) override;
};

bool GetModuleCmd::execute(Given const& given, Args const&, Variable& result) {
  Module const* module = primaryModule("No module is selected.");
  return module && answer(result, module->getPath(pathType<GetModuleCmd>(given)));
}

}  // namespace

Command* newGetModuleCmd() { return new (std::nothrow) GetModuleCmd; }
