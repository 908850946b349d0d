#include "commands/names/Namespaces.h"

namespace {

class RemoveNamespaceCmd final : public ScriptCommand<RemoveNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "removeNamespace",
      .displayName = "Remove Namespace",
      .category = "Namespace",
      .purpose = "Takes a namespace off the names of modules.",
      .example = "removeNamespace take1",
      .args = {"namespace", 1, 1, {Variable::String}},
      .argsText =
          "One name, or several joined by \":\". On all selected modules: namespace:LFHD becomes LFHD. A "
          "name without it ends the line as failed; modules before it stay changed.",
      .options = {{"onMod", "only checks that this path names a module; nothing is changed then", 1,
                   Variable::String}},
      .solo = Solo::no};
  static constexpr int kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const& args, Variable&) override {
    HString const name = args[0].getStringValue(-1);
    return changeNamespaces(given, kOnMod, [&](Module& module) { return module.removeNamespace(name); });
  }
};

}  // namespace

Command* newRemoveNamespaceCmd() { return new (std::nothrow) RemoveNamespaceCmd; }
