#include "commands/Arguments.h"
#include "commands/PendingCommand.h"

namespace {

class FindPlaneCrossingCmd final : public PendingCommand<FindPlaneCrossingCmd> {
 public:
  static constexpr CommandInfo info = {.name = "findPlaneCrossing",
                                       .displayName = "Find Plane Crossings",
                                       .category = "Data Editing",
                                       .subCategory = "Data Retrieval",
                                       .purpose =
                                           "Selects the keys at which the selected nodes pass behind a "
                                           "plane, given by a point and a direction.",
                                       .args = {"xPoint yPoint zPoint xDirection yDirection zDirection"}};

  // Numbers of any kind will do.
  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 6 && areNumbers(args);
  }
};

}  // namespace

Command* newFindPlaneCrossingCmd() { return new (std::nothrow) FindPlaneCrossingCmd; }
