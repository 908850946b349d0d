#include <chrono>
#include <thread>

#include "host/command/ScriptCommand.h"

namespace {

class WaitCmd final : public ScriptCommand<WaitCmd> {
 public:
  static constexpr CommandInfo info = {.name = "wait",
                                       .displayName = "Wait",
                                       .category = "Interface",
                                       .purpose = "Pauses for so many milliseconds.",
                                       .example = "wait 10",
                                       .args = {"milliseconds", 1, 1, {Variable::Int}},
                                       .argsText = "0 or more; the scene does not change."};

  bool execute(Given const&, Args const& args, Variable&) override {
    int const milliseconds = args[0].getIntValue(-1);
    if (milliseconds < 0) {
      logError("Cannot wait a negative amount of time.");
      return false;
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(milliseconds));
    return true;
  }
};

}  // namespace

Command* newWaitCmd() { return new (std::nothrow) WaitCmd; }
