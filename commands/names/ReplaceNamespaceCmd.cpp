#include "commands/names/Namespaces.h"

namespace {

class ReplaceNamespaceCmd final : public ScriptCommand<ReplaceNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "replaceNamespace",
      .displayName = "Replace Namespace",
      .category = "Namespace",
      .purpose = "Puts one namespace in the place of another in the names of modules.",
      .example = "replaceNamespace take1 take2",
      .args = {"oldNamespace newNamespace", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "On all selected modules. A name without the old one ends the line as failed; modules before it "
          "stay changed.",
      .options = {{"onMod", "only checks that this path names a module; nothing is changed then", 1,
                   Variable::String}},
      .solo = Solo::no};
  static constexpr int kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const& args, Variable&) override {
    HString const former = args[0].getStringValue(-1), name = args[1].getStringValue(-1);
    return changeNamespaces(given, kOnMod,
                            [&](Module& module) { return module.replaceNamespace(former, name); });
  }
};

}  // namespace

Command* newReplaceNamespaceCmd() { return new (std::nothrow) ReplaceNamespaceCmd; }
