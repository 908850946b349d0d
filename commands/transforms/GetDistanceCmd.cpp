#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/command/Targets.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/motion/DistanceUtils.h"

namespace {

class GetDistanceCmd final : public ScriptCommand<GetDistanceCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getDistance",
      .displayName = "GetDistance Command",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "The distance of two nodes in millimetres, now or as a statistic over time.",
      .example = "getDistance LFHD RFHD -max",
      .args = {"node1 node2", 0, ArgsInfo::kAny, {}, Variable::String},
      .argsText =
          "Paths of two nodes, measured in the world; without them the first two selected nodes. Without a "
          "statistic at the current time. Of several statistics the last counts; over nothing they are 0.",
      .options = {{"avg", "the mean over the frames of the play range", 0, Variable::None, 1},
                  {"min", "the least distance over the play range", 0, Variable::None, 2},
                  {"max", "the greatest distance over the play range", 0, Variable::None, 4},
                  {"range", "the greatest less the least distance over the play range", 0, Variable::None, 8},
                  {"sd", "the standard deviation over the play range", 0, Variable::None, 16},
                  {"rangesOnly", "over the selected time ranges instead of the play range; needs a statistic",
                   0, Variable::None, 32},
                  {"mustHaveKeys",
                   "only at frames where both nodes have a key, in any layer; needs a statistic", 0,
                   Variable::None, 64}},
      .returns = Variable::Float,
      .solo = Solo::no};
  static constexpr int kRangesOnly = info.option("rangesOnly"), kMustHaveKeys = info.option("mustHaveKeys");

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

// The index of the option of the last statistic given; -1: none.
int lastStatistic(Given const& given) {
  int last = -1;
  for (CommandOption const& option : given)
    if (option.getIndex() < GetDistanceCmd::kRangesOnly) last = option.getIndex();
  return last;
}

struct Pair {
  Node* first = nullptr;
  Node* second = nullptr;
};

bool readPair(Args const& args, Pair& pair) {
  if (args.getCount() == 0) {
    if (g_db->getNumSelectedNodes() < 2) {
      Command::logWarning("Please select 2 nodes.");  // kept: a warning, and yet it fails
      return false;
    }
    pair = {g_db->getSelectedNode(0), g_db->getSelectedNode(1)};
    return true;
  }
  if (args.getCount() != 2) {
    Command::logError("Please specify or select two nodes.");
    return false;
  }
  constexpr char const* bad = "%s  is not a valid path to a node in the scene.";  // kept: two spaces
  pair.first = moduleAt<Node>(args[0].getStringValue(-1), bad);
  pair.second = pair.first ? moduleAt<Node>(args[1].getStringValue(-1), bad) : nullptr;
  return pair.second != nullptr;
}

// Over one range or a list of ranges.
template <class Ranges>
double statistic(int which, Pair const& pair, Ranges const& ranges, bool mustHaveKeys) {
  auto const& [a, b] = pair;
  int64 const step = HTimeManager::getInstance()->getTicksPerFrame();
  switch (which) {
    case GetDistanceCmd::info.option("avg"):
      return DistanceUtils::getAvgDistance(a, b, ranges, mustHaveKeys, step);
    case GetDistanceCmd::info.option("min"):
      return DistanceUtils::getMinDistance(a, b, ranges, mustHaveKeys, step);
    case GetDistanceCmd::info.option("max"):
      return DistanceUtils::getMaxDistance(a, b, ranges, mustHaveKeys, step);
    case GetDistanceCmd::info.option("range"):
      return DistanceUtils::getDistanceRange(a, b, ranges, mustHaveKeys, step);
    default:
      return DistanceUtils::getDistanceSD(a, b, ranges, mustHaveKeys);
  }
}

bool GetDistanceCmd::execute(Given const& given, Args const& args, Variable& result) {
  GivenOptions const options(given);
  int const which = lastStatistic(given);
  bool const rangesOnly = options.has(kRangesOnly), mustHaveKeys = options.has(kMustHaveKeys);
  // Kept: the texts name three of the five statistics, and call the first option "-ranges".
  if (rangesOnly && which < 0) {
    g_db->logError("getDistance command option -ranges requires -avg, -min, or -max flag.");
    return false;
  }
  if (mustHaveKeys && which < 0) {
    g_db->logError("getDistance command option -mustHaveKeys requires -avg, -min, or -max flag.");
    return false;
  }
  Pair pair;
  if (!readPair(args, pair)) return false;

  HTimeManager const& times = *HTimeManager::getInstance();
  if (which < 0) return answer(result, DistanceUtils::getDistance(pair.first, pair.second, times.getTime()));
  if (!rangesOnly) return answer(result, statistic(which, pair, times.getPlayRange(), mustHaveKeys));
  TSimpleArray<HTimeRange> ranges;
  for (int i = 0; i < times.getNumSelectedRanges(); ++i) ranges.add(times.getSelectedTimeRange(i));
  return answer(result, statistic(which, pair, ranges, mustHaveKeys));
}

}  // namespace

Command* newGetDistanceCmd() { return new (std::nothrow) GetDistanceCmd; }
