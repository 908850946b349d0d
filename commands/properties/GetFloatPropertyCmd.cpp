#include "commands/properties/PropertyReading.h"

namespace {

class GetFloatPropertyCmd final : public ScriptCommand<GetFloatPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getFloatProperty",
      .displayName = "Get Float Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a property of a module as a number; with .x, .y or .z one component of a vector.",
      .example = "getFloatProperty LFHD Translation.x",
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

bool GetFloatPropertyCmd::execute(Given const& given, Args const& args, Variable& result) {
  return readNumber(args, "%s  is not a valid unique path to a Module in the scene.",  // two spaces: kept
                    isByDefault<GetFloatPropertyCmd>(given), result);
}

}  // namespace

Command* newGetFloatPropertyCmd() { return new (std::nothrow) GetFloatPropertyCmd; }
