#include "commands/PendingCommand.h"

namespace {

class UnparentCmd final : public PendingCommand<UnparentCmd> {
 public:
  static constexpr CommandInfo info = {.name = "unparent",
                                       .displayName = "Unparent Nodes",
                                       .category = "Data Editing",
                                       .subCategory = "Data Manipulators",
                                       .purpose = "Takes the selected modules out from under their parents.",
                                       .options = {{"adjust", 0, Variable::None, 8},
                                                   {"showProgress"},
                                                   {"ranges"},
                                                   {"adjustOnly", 0, Variable::None, 1}}};
};

}  // namespace

Command* newUnparentCmd() { return new (std::nothrow) UnparentCmd; }
