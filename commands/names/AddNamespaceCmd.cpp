#include "commands/names/Namespaces.h"

namespace {

class AddNamespaceCmd final : public ScriptCommand<AddNamespaceCmd> {
 public:
  static constexpr CommandInfo info = {.name = "addNamespace",
                                       .displayName = "Add Namespace",
                                       .category = "Namespace",
                                       .purpose = "Puts a namespace in front of the names of modules.",
                                       .args = {"namespace", 1, 1, {Variable::String}},
                                       .options = {{"onMod", 1, Variable::String}},
                                       .solo = Solo::no};
  static constexpr int kOnMod = info.option("onMod");

  bool execute(Given const& given, Args const& args, Variable&) override {
    HString const name = args[0].getStringValue(-1);
    return changeNamespaces(given, kOnMod, [&](Module& module) { return module.addNamespace(name); });
  }
};

}  // namespace

Command* newAddNamespaceCmd() { return new (std::nothrow) AddNamespaceCmd; }
