#include "commands/transforms/TransformReading.h"
#include "host/command/Results.h"

namespace {

class GetScaleCmd final : public ScriptCommand<GetScaleCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getScale",
      .displayName = "Get Node Scale",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The scale of a node along its three axes.",
      .example = "getScale Hips -ws",
      .args = {"\"moduleName\"", 1, 1, {Variable::String}},
      .argsText =
          "moduleName is the path of a node. Without an option the channel's own value at the current time.",
      .options = {{"ws", "in the world; goes before -inSpaceOf"},
                  {"inSpaceOf", "path of the node in whose space to tell it", 1, Variable::String, 1},
                  {"def", "the default value of the channel instead of that at the current time"}},
      .returns = Variable::Vector,
      .solo = Solo::no};
  static constexpr QueryOptions kOptions = {info.option("ws"), info.option("inSpaceOf"), info.option("def")};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

Vec3 scaleFor(TransformQuery const& query) {
  Node const& node = *query.node;
  if (query.value == TransformQuery::Default)
    return query.local ? node.getConstLocalScale() : node.getConstScaleInSpaceOfNode(query.space);
  return query.local ? node.getLocalScale(query.time) : node.getScaleInSpaceOfNode(query.time, query.space);
}

bool GetScaleCmd::execute(Given const& given, Args const& args, Variable& result) {
  // Kept: two spaces in both.
  constexpr QueryTexts texts = {"%s  is not a valid unique path to a Node in the scene.",
                                "%s  is not a valid unique path to a Node in the scene."};
  TransformQuery query;
  return readQuery(given, args, kOptions, texts, query) && answer(result, scaleFor(query));
}

}  // namespace

Command* newGetScaleCmd() { return new (std::nothrow) GetScaleCmd; }
