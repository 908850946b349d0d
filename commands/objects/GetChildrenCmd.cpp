#include "commands/objects/SceneQueries.h"
#include "host/command/Results.h"

namespace {

class GetChildrenCmd final : public ScriptCommand<GetChildrenCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getChildren",
      .displayName = "Get Children",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the paths of the modules right below a module.",
      .example = "getChildren Anna -nameOnly",
      .args = {"parentName", 1, 1, {Variable::String}},
      .argsText = "parentName is the path of a module.",
      .options = {{"nodesOnly", "only children that are nodes, which have a place in space"},
                  {"fullPath", "paths from the root; default the shortest that are unique", 0, Variable::None,
                   4},
                  {"nameOnly", "names without paths", 0, Variable::None, 2}},
      .returns = Variable::StringArray,
      .solo = Solo::no};
  static constexpr int kNodesOnly = info.option("nodesOnly");

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool GetChildrenCmd::execute(Given const& given, Args const& args, Variable& result) {
  Module const* module =
      moduleAt(args[0].getStringValue(-1),
               "%s  is not a valid unique path to a Module in the scene.");  // two spaces: kept
  if (!module) return false;
  bool const nodesOnly = GivenOptions(given).has(kNodesOnly);
  int const count = nodesOnly ? module->getNumNodeChildren() : module->getNumChildren();
  std::vector<Module*> children;
  for (int i = 0; i < count; ++i)
    children.push_back(nodesOnly ? module->getNodeChild(i) : module->getChild(i));
  return answer(result, pathsOf(children, pathType<GetChildrenCmd>(given)));
}

}  // namespace

Command* newGetChildrenCmd() { return new (std::nothrow) GetChildrenCmd; }
