#include "commands/PendingCommand.h"

namespace {

class RemoveMarkerConnectionCmd final : public PendingCommand<RemoveMarkerConnectionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "removeMarkerConnection",
      .displayName = "Remove Marker Connecting Line",
      .category = "Data Editing",
      .purpose = "Removes the lines between a marker and others, or all of its lines.",
      .args =
          {"\"sourceNode\" [\"targetNode1\" \"targetNode2\"...]", 1, ArgsInfo::kAny, {}, Variable::String},
      .solo = Solo::no};
};

}  // namespace

Command* newRemoveMarkerConnectionCmd() { return new (std::nothrow) RemoveMarkerConnectionCmd; }
