#include "host/command/Arguments.h"
#include "host/command/Results.h"
#include "host/command/Targets.h"
#include "host/scene/HTimeManager.h"

namespace {

class GetModuleRangeCmd final : public ScriptCommand<GetModuleRangeCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getModuleRange",
      .displayName = "Get Module(s) Data Range",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The first and last frame of the keys of one or several modules.",
      .example = "getModuleRange [LFHD RFHD] -i",
      .args = {"module or moduleArray"},
      .argsText =
          "A path, or an array of paths whose ranges are joined. Counts all channels, in the active clip. "
          "Frames are cut to whole ones; [1 -1] means no keys.",
      .options = {{"i", "with an array: the range that all of them share"}},
      .returns = Variable::IntArray,
      .solo = Solo::no};

  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 1 && areTexts(args);
  }

  bool execute(Given const& given, Args const& args, Variable& result) override {
    bool intersect = false;
    for (CommandOption const& option : given) intersect |= option.getName() == "i";
    HTimeRange range;
    if (!(args[0].isArray() ? rangeOfAll(args[0], intersect, range) : rangeOfOne(args[0], intersect, range)))
      return false;
    Variable frames(Variable::IntArray, 2);
    int64 const frame = HTimeManager::getInstance()->getTicksPerFrame();
    frames.setValue(range.isEmpty() ? 1 : static_cast<int>(range.getStart() / frame), 0);
    frames.setValue(range.isEmpty() ? -1 : static_cast<int>(range.getEnd() / frame), 1);
    return answer(result, frames);
  }

 private:
  static bool rangeOfOne(Variable const& path, bool intersect, HTimeRange& range) {
    if (intersect) logWarning("option -i only valid when argument is a Module array. Ignoring");
    Module const* module = moduleAt(path.getStringValue(-1),
                                    "%s  is not a valid unique path to a Module in the scene.");  // kept
    if (module) range = module->getDataRange();
    return module != nullptr;
  }

  static bool rangeOfAll(Variable const& paths, bool intersect, HTimeRange& range) {
    if (intersect) range.setEnds(-kForever, kForever);
    for (int i = 0; i < paths.getNumItems(); ++i) {
      Module const* module = g_db->getModuleWithPath(paths.getStringValue(i), nullptr, false);
      if (!module) {
        logError(kNoModuleAt, textOf(paths).c_str());
        return false;
      }
      intersect ? range.intersect(module->getDataRange()) : range.include(module->getDataRange());
    }
    if (range == HTimeRange::forever()) range = HTimeRange();
    return true;
  }

  static std::string textOf(Variable const& paths) {
    std::string text;
    for (int i = 0; i < paths.getNumItems(); ++i)
      text += (i ? " " : "") + std::string(paths.getStringValue(i));
    return "[" + text + "]";
  }
};

}  // namespace

Command* newGetModuleRangeCmd() { return new (std::nothrow) GetModuleRangeCmd; }
