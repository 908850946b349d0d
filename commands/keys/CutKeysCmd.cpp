#include "commands/PendingCommand.h"

namespace {

class CutKeysCmd final : public PendingCommand<CutKeysCmd> {
 public:
  static constexpr CommandInfo info = {.name = "cutKeys",
                                       .displayName = "Cut Keys",
                                       .category = "Data Editing",
                                       .purpose =
                                           "Removes keys from the active channels: the selected ones, those "
                                           "in the selected time ranges, or all.",
                                       .options = {{"all", 0, Variable::None, 2},
                                                   {"ranges", 0, Variable::None, 1},
                                                   {"allLayers"},
                                                   {"onMod", 1, Variable::String}}};
};

}  // namespace

Command* newCutKeysCmd() { return new (std::nothrow) CutKeysCmd; }
