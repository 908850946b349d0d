#include "commands/properties/PropertyReading.h"
#include "host/command/Results.h"

namespace {

class GetStringPropertyCmd final : public ScriptCommand<GetStringPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getStringProperty",
      .displayName = "Get HString Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads an attribute of a module as text.",
      .example = "getStringProperty LFHD Name",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "moduleName is a path, propertyName an attribute in exact case: a text, an enumeration, a time or "
          "a module.",
      .options = {{"fullPath", "of a module the path from the root; default the shortest that is unique"}},
      .returns = Variable::String,
      .solo = Solo::no};
  static constexpr int kFullPath = info.option("fullPath");

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

HString pathOf(Module const* module, bool fullPath) {
  if (!module) return {};
  return fullPath ? module->getFullPathString() : module->getMinimumPathString(false);
}

bool GetStringPropertyCmd::execute(Given const& given, Args const& args, Variable& result) {
  Attribute const* attribute = attributeAt(args);
  if (!attribute) return false;
  switch (attribute->getType()) {
    case Attribute::Enumeration:
      return answer(result, static_cast<EnumAttribute const*>(attribute)->getEnumValue());
    case Attribute::String:
      return answer(result, static_cast<StringAttribute const*>(attribute)->getValue());
    case Attribute::MultiString:
      return answer(result, static_cast<MultiStringAttribute const*>(attribute)->getValue());
    case Attribute::Time:
      return answer(result, static_cast<TimeAttribute const*>(attribute)->getStringValue());
    case Attribute::ModuleReference:
      return answer(result, pathOf(static_cast<ModAttribute const*>(attribute)->getValue(),
                                   GivenOptions(given).has(kFullPath)));
    default:
      return redirect(Getter::String, *attribute);
  }
}

}  // namespace

Command* newGetStringPropertyCmd() { return new (std::nothrow) GetStringPropertyCmd; }
