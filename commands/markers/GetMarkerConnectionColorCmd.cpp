#include "commands/markers/MarkerConnections.h"

namespace {

class GetMarkerConnectionColorCmd final : public ScriptCommand<GetMarkerConnectionColorCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getMarkerConnectionColor",
      .displayName = "Get Marker Connection Color",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The colour of the line between two markers as red, green and blue, 0 to 255.",
      .example = "getMarkerConnectionColor LFHD RFHD",
      .args = {"\"sourceMarker\" \"targetMarker\"", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "Paths of two markers, in either order; without a line between them a warning and no result.",
      .returns = Variable::IntArray,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override {
    Marker *source, *target;
    if (!readMarkers(args, kNoMarkerAt, source, target)) return true;
    MarkerConnection const* line = source->getConnectionTo(target);
    if (!line) line = target->getConnectionTo(source);
    if (line) return answerColor(result, line->getConnectingColor());
    logWarning("%s and %s are not connected", args[0].getStringValue(-1), args[1].getStringValue(-1));
    return true;
  }
};

}  // namespace

Command* newGetMarkerConnectionColorCmd() { return new (std::nothrow) GetMarkerConnectionColorCmd; }
