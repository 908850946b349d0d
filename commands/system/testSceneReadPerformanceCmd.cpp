#include "commands/PendingCommand.h"

namespace {

class testSceneReadPerformanceCmd final : public PendingCommand<testSceneReadPerformanceCmd> {
 public:
  static constexpr CommandInfo info = {.name = "testSceneReadPerformance",
                                       .displayName = "Tests Scene Read Performance",
                                       .category = "Testing",
                                       .purpose = "Measures how fast the scene can be read."};
};

}  // namespace

Command* newtestSceneReadPerformanceCmd() { return new (std::nothrow) testSceneReadPerformanceCmd; }
