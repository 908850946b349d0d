#include "session/hostcommands/HostCommands.h"

namespace talix {

// Every host command but help, in the order in which they are listed.
#define TALIX_HOST_COMMANDS(X) \
  X(SelectCmd)                 \
  X(SelectChannelsCmd)         \
  X(SelectKeysCmd)             \
  X(SelectTimeCmd)             \
  X(SetTimeCmd)                \
  X(GetTimeCmd)                \
  X(SetPlayRangeCmd)           \
  X(SetAnimRangeCmd)           \
  X(SetActiveClipCmd)          \
  X(SetActiveLayerCmd)         \
  X(AddLayerCmd)               \
  X(LockChannelCmd)            \
  X(AddAttributeCmd)           \
  X(AddChannelCmd)             \
  X(OpenCmd)                   \
  X(SaveCmd)                   \
  X(NewSceneCmd)               \
  X(UndoCmd)                   \
  X(RedoCmd)

#define TALIX_DECLARE(Name) Command* new##Name();
TALIX_HOST_COMMANDS(TALIX_DECLARE)
#undef TALIX_DECLARE
Command* newHelpCmd(CommandRegistry const& registry);

std::vector<Command*> makeHostCommands(CommandRegistry const& registry) {
#define TALIX_MAKE(Name) new##Name(),
  return {TALIX_HOST_COMMANDS(TALIX_MAKE) newHelpCmd(registry)};
#undef TALIX_MAKE
}

}  // namespace talix
