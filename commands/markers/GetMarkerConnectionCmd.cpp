#include "commands/PendingCommand.h"

namespace {

class GetMarkerConnectionCmd final : public PendingCommand<GetMarkerConnectionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getMarkerConnection",
      .displayName = "Get Marker Connection",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Tells whether a line connects two markers.",
      .args = {"\"sourceMarker\" \"targetMarker\"", 2, 2, {Variable::String, Variable::String}},
      .returns = Variable::Bool,
      .solo = Solo::no};
};

}  // namespace

Command* newGetMarkerConnectionCmd() { return new (std::nothrow) GetMarkerConnectionCmd; }
