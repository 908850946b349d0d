#include "commands/names/Namespaces.h"
#include "host/command/Results.h"

namespace {

class GetNamespaceCmd final : public ScriptCommand<GetNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getNamespace",
      .displayName = "Get Namespace",
      .category = "Namespace",
      .purpose = "The whole namespace of a module.",
      .example = "getNamespace -onMod LFHD",
      .argsText = "The parts are joined by \":\"; empty when it has none.",
      .options = {{"onMod", "path of the module; else the primary selected one", 1, Variable::String}},
      .returns = Variable::String,
      .solo = Solo::no};
  static constexpr int kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const&, Variable& result) override {
    Module const* module = moduleToRead(given, kOnMod);
    if (!module) return false;
    HString name;
    module->getNamespace(name);
    return answer(result, name.GetStr());
  }
};

}  // namespace

Command* newGetNamespaceCmd() { return new (std::nothrow) GetNamespaceCmd; }
