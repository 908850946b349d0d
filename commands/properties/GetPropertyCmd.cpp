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
      .example = "getProperty LFHD Translation.y -d",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "moduleName is a path, propertyName a channel, a component of one (Translation.x) or an attribute, "
          "in exact case. A channel is read at the current time: lengths in mm, angles in degrees in the "
          "node's own order.",
      .options = {{"c", "the default value of the channel instead; no effect on attributes"},
                  {"d", "the same as -c"}},
      .returns = Variable::Float,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool GetPropertyCmd::execute(Given const& given, Args const& args, Variable& result) {
  return readNumber(args, kNoModuleAt, isByDefault<GetPropertyCmd>(given), result);
}

}  // namespace

Command* newGetPropertyCmd() { return new (std::nothrow) GetPropertyCmd; }
