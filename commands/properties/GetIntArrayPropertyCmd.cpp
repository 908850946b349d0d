#include "commands/properties/PropertyReading.h"
#include "host/command/Results.h"

namespace {

class GetIntArrayPropertyCmd final : public ScriptCommand<GetIntArrayPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getIntArrayProperty",
      .displayName = "Get Array of Integer Properties",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a colour of a module as red, green and blue, 0 to 255.",
      .example = "getIntArrayProperty LFHD Color",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .argsText = "moduleName is a path, propertyName a colour in exact case. Fractions are cut.",
      .returns = Variable::IntArray,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool GetIntArrayPropertyCmd::execute(Given const&, Args const& args, Variable& result) {
  Attribute const* attribute =
      attributeAt(args, "%s  is not a valid unique path to a Module in the scene.");  // two spaces: kept
  if (!attribute) return false;
  ColorAttribute const* color = objectAs<ColorAttribute>(attribute);
  if (!color) return redirect(Getter::IntArray, *attribute);
  Variable components(Variable::IntArray, 3);
  for (int i = 0; i < 3; ++i) components.setValue(color->getValue()[i], i);  // truncated toward zero
  return answer(result, components);
}

}  // namespace

Command* newGetIntArrayPropertyCmd() { return new (std::nothrow) GetIntArrayPropertyCmd; }
