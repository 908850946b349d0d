#include "commands/transforms/TransformReading.h"
#include "host/command/Results.h"

namespace {

class GetRotationAngleAxisCmd final : public ScriptCommand<GetRotationAngleAxisCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getRotationAngleAxis",
      .displayName = "Get Node Rotation",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The rotation of a node as a vector along its axis, as long as the angle in radians.",
      .example = "getRotationAngleAxis Hips -ws",
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .argsText =
          "moduleName is the path of a node. Without an option the channel's own value at the current time.",
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

bool GetRotationAngleAxisCmd::execute(Given const& given, Args const& args, Variable& result) {
  TransformQuery query;
  if (!readQuery(given, args, kOptions, kRotationTexts, query)) return false;
  Vec3 vector;
  rotationFor(query).getAsVector(vector);
  return answer(result, vector);
}

}  // namespace

Command* newGetRotationAngleAxisCmd() { return new (std::nothrow) GetRotationAngleAxisCmd; }
