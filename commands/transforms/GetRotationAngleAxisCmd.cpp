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
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .options = {{"ws", 0, Variable::None, 2},
                  {"inSpaceOf", 1, Variable::String, 1},
                  {"preRot", 0, Variable::None, 8},
                  {"def", 0, Variable::None, 4}},
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
