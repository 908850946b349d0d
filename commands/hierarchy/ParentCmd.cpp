#include "commands/PendingCommand.h"

namespace {

class ParentCmd final : public PendingCommand<ParentCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "parent",
      .displayName = "Parent Nodes",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Hangs the selected modules under the primary selected one.",
      .options = {{"adjust", 0, Variable::None, 8},
                  {"showProgress"},
                  {"ranges"},
                  {"adjustOnly", 0, Variable::None, 1}}};
};

}  // namespace

Command* newParentCmd() { return new (std::nothrow) ParentCmd; }
