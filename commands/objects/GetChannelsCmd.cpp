#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "host/scene/PropertyTable.h"

namespace {

class GetChannelsCmd final : public ScriptCommand<GetChannelsCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getChannels",
      .displayName = "Get Selected Channels",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Lists the active channels, with \".X\", \".Y\" or \".Z\" where one component is active.",
      .example = "getChannels",
      .argsText = "The channels are those of selectChannels, whatever modules are selected.",
      .returns = Variable::StringArray};

  bool execute(Given const&, Args const&, Variable& result) override;
};

// Several components together have no suffix.
char const* componentSuffix(unsigned id) {
  switch (id & ~PropertyTable::kIdMask) {
    case PropertyTable::kX:
      return ".X";
    case PropertyTable::kY:
      return ".Y";
    case PropertyTable::kZ:
      return ".Z";
    default:
      return "";
  }
}

bool GetChannelsCmd::execute(Given const&, Args const&, Variable& result) {
  int const count = g_db->getNumActiveProperties();
  Variable names(Variable::StringArray, count);
  for (int i = 0; i < count; ++i) {
    unsigned const id = g_db->getActiveProperty(i);
    names.setValue((Controller::mapPropertyId(id) + componentSuffix(id)).GetStr(), i);
  }
  return answer(result, names);
}

}  // namespace

Command* newGetChannelsCmd() { return new (std::nothrow) GetChannelsCmd; }
