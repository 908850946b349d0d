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
      .purpose =
          "Adds a take (C3D, BVH, TRC) to the scene as a new clip; -up (x, y, z) and -units (mm, cm, m, in, "
          "ft) "
          "set what the file leaves open.",
      .args = {"FILE", 1, 1, {Variable::String}},
      .options = {{"up", 1, Variable::String}, {"units", 1, Variable::String}}};
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
