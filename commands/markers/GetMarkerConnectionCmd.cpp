#include "commands/markers/MarkerConnections.h"

namespace {

class GetMarkerConnectionCmd final : public ScriptCommand<GetMarkerConnectionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getMarkerConnection",
      .displayName = "Get Marker Connection",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Tells whether a line connects two markers.",
      .example = "getMarkerConnection LFHD RFHD",
      .args = {"\"sourceMarker\" \"targetMarker\"", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "Paths of two markers, in either order; one that is not there is a warning, and there is no "
          "result.",
      .returns = Variable::Bool,
      .solo = Solo::no};

  bool execute(Given const&, Args const& args, Variable& result) override {
    Marker *source, *target;
    if (!readMarkers(args, kNoMarkerAt, source, target)) return true;
    return answer(result, source->isConnectedTo(target) || target->isConnectedTo(source));
  }
};

}  // namespace

Command* newGetMarkerConnectionCmd() { return new (std::nothrow) GetMarkerConnectionCmd; }
