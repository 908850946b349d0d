#include "commands/names/Namespaces.h"

namespace {

class AddNamespaceCmd final : public ScriptCommand<AddNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "addNamespace",
      .displayName = "Add Namespace",
      .category = "Namespace",
      .purpose = "Puts a namespace in front of the names of modules.",
      .example = "addNamespace take1",
      .args = {"namespace", 1, 1, {Variable::String}},
      .argsText =
          "One name, or several joined by \":\". On all selected modules: LFHD becomes namespace:LFHD. A "
          "name that cannot take it ends the line as failed; modules before it stay changed.",
      .options = {{"onMod", "only checks that this path names a module; nothing is changed then", 1,
                   Variable::String}},
      .solo = Solo::no};
  static constexpr int kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const& args, Variable&) override {
    HString const name = args[0].getStringValue(-1);
    return changeNamespaces(given, kOnMod, [&](Module& module) { return module.addNamespace(name); });
  }
};

}  // namespace

Command* newAddNamespaceCmd() { return new (std::nothrow) AddNamespaceCmd; }
