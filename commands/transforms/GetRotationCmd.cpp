#include "commands/transforms/TransformReading.h"
#include "host/command/Angles.h"
#include "host/command/Results.h"

namespace {

class GetRotationCmd final : public ScriptCommand<GetRotationCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getRotation",
      .displayName = "Get Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The rotation of a node as three angles in degrees.",
      .example = "getRotation Hips -ws",
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .argsText =
          "moduleName is the path of a node; angles count in its own rotation order. Without an option the "
          "channel's own value at the current time.",
      .options = {{"ws", "in the world; goes before -inSpaceOf", 0, Variable::None, 2},
                  {"inSpaceOf", "path of the node in whose space to tell it", 1, Variable::String, 1},
                  {"preRot", "the pre-rotation: the fixed rotation that comes before the channels", 0,
                   Variable::None, 8},
                  {"def", "the default value of the channel instead of that at the current time", 0,
                   Variable::None, 4}},
      .returns = Variable::Vector,
      .solo = Solo::no};
  static constexpr QueryOptions kOptions = {info.option("ws"), info.option("inSpaceOf"), info.option("def"),
                                            info.option("preRot")};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

bool GetRotationCmd::execute(Given const& given, Args const& args, Variable& result) {
  TransformQuery query;
  return readQuery(given, args, kOptions, kRotationTexts, query) &&
         answer(result, eulerDegrees(rotationFor(query), query.node->getRotationOrder()));
}

}  // namespace

Command* newGetRotationCmd() { return new (std::nothrow) GetRotationCmd; }
