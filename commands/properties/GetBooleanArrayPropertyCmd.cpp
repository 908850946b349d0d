#include "commands/properties/PropertyReading.h"
#include "host/command/Results.h"

namespace {

class GetBooleanArrayPropertyCmd final : public ScriptCommand<GetBooleanArrayPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getBooleanArrayProperty",
      .displayName = "Get Array of Boolean Properties",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a bit field of a module: true or false for each of its labels.",
      .example = "getBooleanArrayProperty LFHD Sides",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .argsText = "moduleName is a path, propertyName a bit field in exact case.",
      .returns = Variable::BoolArray,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override;
};

bool GetBooleanArrayPropertyCmd::execute(Given const&, Args const& args, Variable& result) {
  Attribute const* attribute = attributeAt(args);
  if (!attribute) return false;
  BitFieldAttribute const* bits = objectAs<BitFieldAttribute>(attribute);
  if (!bits) return redirect(Getter::BooleanArray, *attribute);
  Variable fields(Variable::BoolArray, bits->getNumFields());
  for (int i = 0; i < bits->getNumFields(); ++i)
    fields.setValue(bits->getField(i) ? Variable::True : Variable::False, i);
  return answer(result, fields);
}

}  // namespace

Command* newGetBooleanArrayPropertyCmd() { return new (std::nothrow) GetBooleanArrayPropertyCmd; }
