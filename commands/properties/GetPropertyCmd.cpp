#include "commands/properties/PropertyReading.h"

namespace {

class GetPropertyCmd final : public ScriptCommand<GetPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getProperty",
      .displayName = "Get Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a property of a module as a number, as getFloatProperty does.",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .options = {{"c"}, {"d"}},
      .returns = Variable::Float,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool GetPropertyCmd::execute(Given const& given, Args const& args, Variable& result) {
  return readNumber(args, kNoModuleAt, isByDefault<GetPropertyCmd>(given), result);
}

}  // namespace

Command* newGetPropertyCmd() { return new (std::nothrow) GetPropertyCmd; }
