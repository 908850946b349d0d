// Every accessor by index returns null or nothing beyond the end.
#include <functional>
#include <limits>

#include "host/command/CommandOption.h"
#include "host/scene/Bones.h"
#include "host/scene/ClipboardManager.h"
#include "host/scene/Clips.h"
#include "host/scene/Setups.h"
#include "host/scene/SubjectManager.h"
#include "tests/host/scene/SceneFixture.h"

namespace {

using IndexTest = SceneTest;

TEST_F(IndexTest, BeyondTheEndIsNothing) {
  auto* node = create<Node>("node");
  auto* clip = create<Clip>("clip");
  auto* setup = create<SolvingSetup>("setup");
  auto* keyed = static_cast<FloatController*>(node->addChannel("Speed", DataSource::FloatProperty));
  keyed->setConstValue(7, true);
  keyed->setKey(5, 3, 7);
  auto* bits = static_cast<BitFieldAttribute*>(create<SolvingBone>("bone")->getAttribute("DOFs"));
  auto* sources = create<BlendClip>("blend")->getSources();
  EnumAttribute unlabelled;
  Variable list(Variable::IntArray, 2);
  std::unique_ptr<CommandOption> const option(CommandOption::createInstance("o", 1, Variable::Int, false));
  HTimeManager const* times = HTimeManager::getInstance();

  // Each for a thing with a few entries or none; whether the answer is nothing.
  struct Row {
    char const* accessor;
    int count;
    std::function<bool(int)> isNothing;
  };
  Row const rows[] = {
      {"getChild", node->getNumChildren(), [&](int i) { return !node->getChild(i); }},
      {"getNodeChild", node->getNumNodeChildren(), [&](int i) { return !node->getNodeChild(i); }},
      {"getMarkerChild", node->getNumMarkerChildren(), [&](int i) { return !node->getMarkerChild(i); }},
      {"getAttribute", node->getNumAttributes(), [&](int i) { return !node->getAttribute(i); }},
      {"getChannel", node->getNumChannels(), [&](int i) { return !node->getChannel(i); }},
      {"getConnectingLine", node->getNumConnectingLines(),
       [&](int i) { return !node->getConnectingLine(i).getTarget(); }},
      {"getModule", g_db->getNumModules(), [&](int i) { return !g_db->getModule(i); }},
      {"getNode", g_db->getNumNodes(), [&](int i) { return !g_db->getNode(i); }},
      {"getSelectedModule", g_db->getNumSelectedModules(),
       [&](int i) { return !g_db->getSelectedModule(i); }},
      {"getSelectedNode", g_db->getNumSelectedNodes(), [&](int i) { return !g_db->getSelectedNode(i); }},
      {"getSelectedMarker", g_db->getNumSelectedMarkers(),
       [&](int i) { return !g_db->getSelectedMarker(i); }},
      {"getSelectedLabelingBone", 0, [&](int i) { return !g_db->getSelectedLabelingBone(i); }},
      {"getActiveProperty", g_db->getNumActiveProperties(),
       [&](int i) { return g_db->getActiveProperty(i) == 0; }},
      {"getSubject", 0,
       [&](int i) { return !g_db->getSubjectManager()->getSubject(static_cast<uint64>(i)); }},
      {"getSelectedSubject", 0,
       [&](int i) { return !g_db->getSubjectManager()->getSelectedSubject(static_cast<uint64>(i)); }},
      {"getControllerKey", 0,
       [&](int i) { return g_db->getClipboardManager()->getControllerKey(i).components == 0; }},
      {"getSelectedTimeRange", times->getNumSelectedRanges(),
       [&](int i) { return times->getSelectedTimeRange(i).isEmpty(); }},
      {"isLayerLocked", clip->getNumLayers(), [&](int i) { return !clip->isLayerLocked(i); }},
      {"getParameter", setup->getNumParameters(), [&](int i) { return !setup->getParameter(i); }},
      {"getLabel", bits->getNumFields(), [&](int i) { return bits->getLabel(i).IsEmpty(); }},
      {"getField", bits->getNumFields(), [&](int i) { return !bits->getField(i); }},
      {"setIndex", 0, [&](int i) { return !unlabelled.setIndex(i, true, true, true, true); }},
      {"getModuleValue", sources->getNumModules(), [&](int i) { return !sources->getModuleValue(i); }},
      {"getKeyTime", keyed->getNumKeys(), [&](int i) { return keyed->getKeyTime(i) == 0; }},
      {"getKeyValue", keyed->getNumKeys(), [&](int i) { return keyed->getKeyValue(i) == 7; }},
      {"keyHasComponents", keyed->getNumKeys(), [&](int i) { return !keyed->keyHasComponents(i, 7); }},
      {"setKeyValue", keyed->getNumKeys(),
       [&](int i) { return keyed->setKeyValue(i, 9, 7), keyed->getKeyValue(0) == 3; }},
      {"getSelectedKeyIndex", 0, [&](int i) { return keyed->getSelectedKeyIndex(i) == -1; }},
      {"getSelectedKeyFlags", 0, [&](int i) { return keyed->getSelectedKeyFlags(i) == 0; }},
      {"getInterpTypeName", keyed->getNumInterpTypes(), [&](int i) { return !keyed->getInterpTypeName(i); }},
      {"getArrayValue", 2, [&](int i) { return list.getArrayValue(i).getType() == Variable::None; }},
      {"getArg", 1, [&](int i) { return option->getArg(i).getType() == Variable::None; }},
  };
  for (Row const& row : rows)
    for (int const i :
         {row.count, row.count + 1, std::numeric_limits<int>::max(), -2, std::numeric_limits<int>::min()})
      EXPECT_TRUE(row.isNothing(i)) << row.accessor << " " << i << " of " << row.count;
  for (int i : {-1, 3}) EXPECT_TRUE(!node->getChild(i) && !keyed->keyHasComponents(i, 1));
}

}  // namespace
