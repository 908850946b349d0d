#include "commands/PendingCommand.h"

namespace {

class PackCmd final : public PendingCommand<PackCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "pack",
      .displayName = "Pack Marker Data",
      .category = "Data Editing",
      .purpose = "Joins pieces of unlabeled markers that can belong to one marker.",
      .options = {{"minGap", 1, Variable::Int},
                  {"minDistance", 1, Variable::Float},
                  {"marker", 1, Variable::String}}};
};

}  // namespace

Command* newPackCmd() { return new (std::nothrow) PackCmd; }
