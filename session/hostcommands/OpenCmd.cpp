#include <algorithm>
#include <iterator>

#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"
#include "io/TakeFormats.h"
#include "io/TakeScene.h"
#include "session/hostcommands/TakeNotes.h"

namespace talix {

namespace {

class OpenCmd final : public ScriptCommand<OpenCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "open",
      .displayName = "Open Take",
      .category = "System",
      .purpose = "Adds a take (C3D, BVH, TRC) to the scene as a new clip.",
      .example = "open walk.c3d",
      .args = {"FILE", 1, 1, {Variable::String}},
      .argsText =
          "The clip becomes active. A subject, marker or bone that is there under its name gets the motion "
          "instead of a double. The first take sets the rate, the ranges and the up axis; others are turned "
          "to fit.",
      .options = {{"up", "x, y or z: sets the scene's up axis, to which the take is turned; default as it is",
                   1, Variable::String},
                  {"units", "mm, cm, m, in or ft: the file's length unit, over what the file says", 1,
                   Variable::String}}};
  static constexpr int kUp = info.option("up"), kUnits = info.option("units");

  // Throws FileError: the runner makes it the error line, and a failure of the file rather than of the
  // command.
  bool execute(Given const& given, Args const& args, Variable&) override {
    GivenOptions const options(given);
    HString const up = options.textOr(kUp, ""), units = options.textOr(kUnits, "");
    int const axis = axisNamed(up);
    if (options.has(kUp) && axis < 0) {
      logError("%s is not an axis: x, y or z.", up.GetStr());
      return false;
    }
    if (options.has(kUnits) && !isUnit(units)) {
      logError("%s is not a unit: mm, cm, m, in or ft.", units.GetStr());
      return false;
    }
    std::string const path = args[0].getStringValue(-1);
    std::vector<TakeNote> notes;
    importTake(readTake(path, {.unit = units.GetString()}), path, axis, *g_db, notes);
    logNotes(notes);
    return true;
  }

 private:
  static int axisNamed(HString const& name) {
    return name == "x" ? 0 : name == "y" ? 1 : name == "z" ? 2 : -1;
  }
  static bool isUnit(HString const& name) {
    static constexpr char const* units[] = {"mm", "cm", "m", "in", "ft"};
    return std::any_of(std::begin(units), std::end(units), [&](char const* unit) { return name == unit; });
  }
};

}  // namespace

Command* newOpenCmd() { return new OpenCmd; }

}  // namespace talix
