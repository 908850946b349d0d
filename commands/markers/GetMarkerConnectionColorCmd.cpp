#include "commands/PendingCommand.h"

namespace {

class GetMarkerConnectionColorCmd final : public PendingCommand<GetMarkerConnectionColorCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getMarkerConnectionColor",
      .displayName = "Get Marker Connection Color",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The colour of the line between two markers as red, green and blue, 0 to 255.",
      .args = {"\"sourceMarker\" \"targetMarker\"", 2, 2, {Variable::String, Variable::String}},
      .returns = Variable::IntArray,
      .solo = Solo::no};
};

}  // namespace

Command* newGetMarkerConnectionColorCmd() { return new (std::nothrow) GetMarkerConnectionColorCmd; }
