#include "commands/PendingCommand.h"

namespace {

class SetMarkerConnectionCmd final : public PendingCommand<SetMarkerConnectionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setMarkerConnection",
      .displayName = "Set Marker Connecting Line",
      .category = "Data Editing",
      .purpose = "Draws a connecting line between two markers.",
      .args = {"\"sourceNode\" \"targetNode\"", 2, 2, {Variable::String, Variable::String}},
      .options = {{"color", 3, Variable::Int}, {"priorityOnly"}},
      .solo = Solo::no};
};

}  // namespace

Command* newSetMarkerConnectionCmd() { return new (std::nothrow) SetMarkerConnectionCmd; }
