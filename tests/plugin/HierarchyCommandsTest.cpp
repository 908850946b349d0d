// Hierarchy commands: progress and cancelling, setups, questions, pairs of hierarchies.
#include <gmock/gmock.h>

#include "host/scene/Bones.h"
#include "host/scene/Character.h"
#include "host/scene/Constraints.h"
#include "host/scene/Devices.h"
#include "host/scene/Setups.h"
#include "host/services/HInterface.h"
#include "host/services/OperationStack.h"
#include "tests/plugin/SceneFixture.h"

namespace {

class HierarchyCommands : public SceneFixture {
 protected:
  ~HierarchyCommands() override {
    g_theOperationStack.setDisplay(nullptr);
    g_theOperationStack.reset();
    g_interface->setAsker(nullptr);
  }
  // The last one becomes the primary.
  static void select(std::initializer_list<Module*> modules) {
    g_db->selectAllModules(false);
    for (Module* module : modules) module->setSelected(true);
  }
  // Notes what the innermost task shows; cancels once so much has been shown.
  void watch(size_t cancelAfter = 1000) {
    shown.clear();
    g_theOperationStack.setDisplay([this, cancelAfter](OperationStack::Task const* task) {
      shown.push_back(task ? task->caption.GetString() + " " + std::to_string(task->position) + "/" +
                                 std::to_string(task->last)
                           : "end");
      if (shown.size() == cancelAfter) g_theOperationStack.cancel();
    });
  }

  std::vector<std::string> shown;
};

TEST_F(HierarchyCommands, ProgressCountsTheNodesThatAreAdjusted) {
  auto *a = make("a"), *b = make("b"), *p = make("p");
  auto* device = make<AnalogDevice>("device");
  auto* subject = make<Character>("subject");
  select({a, device, subject, b, p});
  watch();
  EXPECT_EQ(run("parent", {}, {{"adjust"}, {"showProgress"}}),
            "warning: Object device does not contain animation data. Skipping -adjust option\n"
            "warning: Object subject is a Character. Characters must be root nodes. Skipping\nnothing");
  EXPECT_THAT(shown,
              testing::ElementsAre(" 0/2", "Parent adjusting a to p 0/2", "Parent adjusting a to p 1/2",
                                   "Parent adjusting b to p 1/2", "Parent adjusting b to p 2/2",
                                   "Parent adjusting b to p 2/2", "end"));
  EXPECT_TRUE(a->getParent() == p && device->getParent() == p && b->getParent() == p &&
              !subject->getParent());

  watch();
  EXPECT_EQ(run("unparent", {}, {{"adjustOnly"}, {"showProgress"}}),
            "warning: Object device does not contain animation data. Skipping -adjust option\nnothing");
  EXPECT_THAT(shown, testing::ElementsAre(" 0/4", "Unparent adjusting a 0/4", "Unparent adjusting a 1/4",
                                          "Unparent adjusting b 1/4", "Unparent adjusting b 2/4", "end"));
  EXPECT_EQ(a->getParent(), p);

  // Without adjusting, "parent" pops a task that is not its own.
  g_theOperationStack.pushTask(0, 9, 5, 1, true, "outer");
  select({b, a});
  EXPECT_EQ(run("parent", {}, {{"showProgress"}}),
            "warning: Can't use -showProgress flag without -adjust flag. Ignoring\nnothing");
  EXPECT_EQ(shown.back(), "end");
  EXPECT_EQ(*(shown.end() - 2), "outer 0/9");
}

TEST_F(HierarchyCommands, CancellingStopsAtOnceAndLeavesTheTask) {
  auto *a = make("a"), *b = make("b"), *p = make("p");
  for (auto const& [cancelAfter, moved] : {std::pair(2u, 0), {3u, 0}, {4u, 1}}) {
    select({a, b, p});
    watch(cancelAfter);
    EXPECT_EQ(run("parent", {}, {{"adjust"}, {"showProgress"}}), "failed");
    EXPECT_EQ((a->getParent() == p) + (b->getParent() == p), moved) << cancelAfter;
    EXPECT_EQ(g_theOperationStack.getNumTasks(), 1);
    g_theOperationStack.reset();
  }
  // "unparent" looks after each node only.
  p->addChild(b);
  select({a, b});
  watch(2);
  EXPECT_EQ(run("unparent", {}, {{"adjust"}, {"showProgress"}}), "failed");
  EXPECT_TRUE(a->getParent() == p && b->getParent() == p);
  EXPECT_EQ(g_theOperationStack.getNumTasks(), 1);
}

TEST_F(HierarchyCommands, BonesAndConstraintsStayInSetupsOfTheirKind) {
  auto* labeling = make<LabelingSetup>("labeling");
  auto* solving = make<SolvingSetup>("solving");
  auto* node = make("node");
  for (Module* module : {static_cast<Module*>(make<LabelingBone>("lb")),
                         static_cast<Module*>(make<LabelingConstraint>("lc"))}) {
    select({node, module, solving});
    EXPECT_EQ(run("parent"),
              "error: LabelingBones and LabelingConstraints may not be parented to a SolvingSetup\nfailed");
    EXPECT_TRUE(node->getParent() == solving && !module->getParent());
    EXPECT_EQ(run("parent", {}, {{"adjustOnly"}}), "nothing") << "the rule is not looked at";
    select({module, labeling});
    EXPECT_EQ(run("parent"), "nothing");
  }
  for (Module* module :
       {static_cast<Module*>(make<SolvingBone>("sb")), static_cast<Module*>(make<SolvingConstraint>("sc"))}) {
    select({module, labeling});
    EXPECT_EQ(run("parent"),
              "error: SolvingBones and SolvingConstraints may not be parented to a LabelingSetup\nfailed");
    select({module, solving});
    EXPECT_EQ(run("parent"), "nothing");
  }
}

// Below the tops: twins of one name, of which the first is the partner, and one of another class.
TEST_F(HierarchyCommands, CollapsePairsByNameAndClass) {
  auto *from = make("from"), *to = make("to");
  auto *source = make("arm", from), *target = make("arm", to), *second = make("arm_1", to);
  second->setName("arm");
  auto *marker = make<Marker>("hand", source), *hand = make<Marker>("hand", target);
  make<Marker>("leg", from);
  auto* leg = make("leg", to);
  select({from, to});
  EXPECT_EQ(run("collapse"), "error: There must be an active clip in the scene\nfailed");
  auto* clip = make<Clip>("take");
  source->setLocalPos(0, {1, 2, 3});
  marker->setLocalPos(0, {4, 5, 6});
  EXPECT_EQ(run("collapse"), "info: Copied data for 2 Modules\nnothing");
  EXPECT_EQ(target->getLocalPos(0), Vec3(1, 2, 3));
  EXPECT_EQ(hand->getLocalPos(0), Vec3(4, 5, 6));
  EXPECT_FALSE(second->hasKeysInClip(clip, true) || leg->hasKeysInClip(clip, true));

  // Now the target has keys, so it is asked.
  source->setLocalPos(0, {7, 8, 9});
  std::string question;
  bool answer = false;
  g_interface->setAsker([&](HString const& text) { return question = text.GetString(), answer; });
  EXPECT_EQ(run("collapse"), "error: User canceled collapse operation. Aborting.\nfailed");
  EXPECT_EQ(question,
            "1 or more of the target node's descendants have key data for the active clip\n"
            "Are you sure you want to overwrite?");
  EXPECT_EQ(target->getLocalPos(0), Vec3(1, 2, 3));
  answer = true;
  static_cast<BoolAttribute*>(hand->getAttribute("Locked"))->setValue(true, true, true, true, true);
  EXPECT_EQ(run("collapse"), "info: Copied data for 1 Modules\nnothing");
  EXPECT_EQ(target->getLocalPos(0), Vec3(7, 8, 9));
  select({hand, from});
  EXPECT_EQ(run("collapse"), "warning: Didn't copy data for any Modules\nnothing");
}

}  // namespace
