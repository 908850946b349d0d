#include "host/command/Targets.h"
#include "host/scene/PropertyTable.h"
#include "session/hostcommands/AttributeValues.h"
#include "session/hostcommands/NewProperty.h"

namespace talix {

namespace {

class AddAttributeCmd final : public ScriptCommand<AddAttributeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "addAttribute",
      .displayName = "Add Attribute",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose =
          "Adds an attribute of any kind to a module. The values are its "
          "first and default ones; those of enum "
          "and bitField are the labels.",
      .example = "addAttribute LFHD Height float 2.5",
      .args = {"PATH NAME KIND [VALUE...]",
               3,
               ArgsInfo::kAny,
               {Variable::String, Variable::String, Variable::String}},
      .argsText =
          "KIND is int, enum, float, string, multiString, bool, vector, bitField, rotation (degrees), time "
          "(frames), color (0 to 255), event, module, none, matrix, multiModule or temperature. NAME must be "
          "new on the module."};

  bool execute(Given const&, Args const& args, Variable&) override {
    Module* module = moduleAt(args[0].getStringValue(-1));
    if (!module) return false;
    HString const name = args[1].getStringValue(-1), kindText = args[2].getStringValue(-1);
    AttributeKind const* kind = findAttributeKind(kindText);
    if (!kind) {
      logError("%s is not a kind of attribute: %s.", kindText.GetStr(), attributeKindNames().c_str());
      return false;
    }
    if (!isNewProperty(*module, name, "an attribute", PropertyTable::getInstance().obstacleToAttribute(name)))
      return false;
    std::unique_ptr<Attribute> attribute = makeAttribute(*kind, name, args, 3, *module);
    if (!attribute) return false;
    Attribute* added = module->addCustomAttribute(std::move(attribute));
    // Every attribute joins its module as "not set"; one that was given a value is set.
    if (args.getCount() > 3 && !kind->takesLabels()) added->store(added->getRawValue(), true, false);
    return true;
  }
};

}  // namespace

Command* newAddAttributeCmd() { return new AddAttributeCmd; }

}  // namespace talix
