#include "commands/names/Namespaces.h"
#include "host/command/Results.h"

namespace {

class GetNamespacesCmd final : public ScriptCommand<GetNamespacesCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getNamespaces",
      .displayName = "Get Namespace",
      .category = "Namespace",
      .purpose = "Lists the namespaces of a module, the outermost first.",
      .example = "getNamespaces -onMod LFHD",
      .argsText = "The parts are those between \":\"; none when it has no namespace.",
      .options = {{"onMod", "path of the module; else the primary selected one", 1, Variable::String}},
      .returns = Variable::StringArray,
      .solo = Solo::no};
  static constexpr int kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const&, Variable& result) override {
    Module const* module = moduleToRead(given, kOnMod);
    if (!module) return false;
    TArray<HString> names;
    module->getNamespaces(names);
    Variable list(Variable::StringArray, names.getCount());
    for (int i = 0; i < names.getCount(); ++i) list.setValue(names[i].GetStr(), i);
    return answer(result, list);
  }
};

}  // namespace

Command* newGetNamespacesCmd() { return new (std::nothrow) GetNamespacesCmd; }
