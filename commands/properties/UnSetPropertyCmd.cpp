#include "commands/properties/EachAttribute.h"

namespace {

class UnSetPropertyCmd final : public ScriptCommand<UnSetPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "unsetProperty",
      .displayName = "Unset Property",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Returns an attribute of modules to its default value.",
      .example = "unsetProperty Color -onMod LFHD",
      .args = {"propertyName", 1, 1, {Variable::String}},
      .argsText =
          "propertyName is an attribute in exact case, not a channel. On all selected modules that have it.",
      .options = {{"all", "every module of the scene that has the attribute, selected or not"},
                  {"onMod", "path of the one module to change", 1, Variable::String, 4},
                  {"type", "class name: of those modules only the ones of exactly this class", 1,
                   Variable::String, 2}},
      .solo = Solo::no};
  static constexpr Candidates::Options kCandidates = {info.option("all"), info.option("onMod"),
                                                      info.option("type")};

  bool execute(Given const& given, Args const& args, Variable&) override;
};

bool unset(Attribute& attribute) {
  if (attribute.canBeUnset()) {
    attribute.unset(true, false, true);
    return true;
  }
  g_db->logError("Attribute %s doesn't support the concept of being set or not set.",
                 attribute.getName().GetStr());
  return false;
}

bool UnSetPropertyCmd::execute(Given const& given, Args const& args, Variable&) {
  Candidates candidates;
  if (!candidates.read(given, kCandidates)) return false;
  HString const name = args[0].getStringValue(-1);
  if (Controller::mapToPropertyType(name) != DataSource::NoProperty) {
    g_db->logError("Only attributes can be unset.");
    return false;
  }
  return eachAttribute(candidates, name,
                       {.noModules = "No modules to unset property on",
                        .noSelection = "No selected modules to unset property on.",
                        .failed = "Failed to unset attribute %s on module %s"},
                       unset);
}

}  // namespace

Command* newUnSetPropertyCmd() { return new (std::nothrow) UnSetPropertyCmd; }
