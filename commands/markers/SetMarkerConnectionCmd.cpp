#include "commands/Events.h"
#include "commands/markers/MarkerConnections.h"
#include "host/scene/Database.h"

namespace {

class SetMarkerConnectionCmd final : public ScriptCommand<SetMarkerConnectionCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setMarkerConnection",
      .displayName = "Set Marker Connecting Line",
      .category = "Data Editing",
      .purpose = "Draws a connecting line between two markers.",
      .example = "setMarkerConnection LFHD RFHD -color 255 0 0",
      .args = {"\"sourceNode\" \"targetNode\"", 2, 2, {Variable::String, Variable::String}},
      .argsText = "Paths of two markers. A line between them, in either direction, is replaced.",
      .options = {{"color", "red, green and blue, 0 to 255; default that of \"getColor markerLines\"", 3,
                   Variable::Int},
                  {"priorityOnly", "only when both are below the priority module; else nothing happens"}},
      .solo = Solo::no};

  static constexpr int kColor = info.option("color"), kPriorityOnly = info.option("priorityOnly");

  bool execute(Given const& given, Args const& args, Variable&) override {
    GivenOptions const options(given);
    Vec3 color = MarkerConnection::getDefaultColor();
    if (CommandOption const* option = options.find(kColor))
      for (int i = 0; i < 3; ++i) color[i] = option->getArg(i).getIntValue(-1);
    Module const* priority = options.has(kPriorityOnly) ? g_db->getPriorityModule() : nullptr;
    Marker *source, *target;
    if (!readMarkers(args, "%s is not a valid path to a Marker in the scene.", source, target)) return true;
    if (priority && !(source->isDescendedFrom(priority) && target->isDescendedFrom(priority))) return true;
    disconnect(*source, *target);
    MarkerConnection line(target);
    line.setConnectingColor(color);
    source->addConnectingLine(line);
    g_eventManager->submitImmediate(HConnectionLinesChangedEvent());
    return true;
  }
};

}  // namespace

Command* newSetMarkerConnectionCmd() { return new (std::nothrow) SetMarkerConnectionCmd; }
