#include "commands/names/Namespaces.h"

namespace {

class RemoveNamespaceCmd final : public ScriptCommand<RemoveNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {.name = "removeNamespace",
                                       .displayName = "Remove Namespace",
                                       .category = "Namespace",
                                       .purpose = "Takes a namespace off the names of modules.",
                                       .args = {"namespace", 1, 1, {Variable::String}},
                                       .options = {{"onMod", 1, Variable::String}},
                                       .solo = Solo::no};
  static constexpr int kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const& args, Variable&) override {
    HString const name = args[0].getStringValue(-1);
    return changeNamespaces(given, kOnMod, [&](Module& module) { return module.removeNamespace(name); });
  }
};

}  // namespace

Command* newRemoveNamespaceCmd() { return new (std::nothrow) RemoveNamespaceCmd; }
