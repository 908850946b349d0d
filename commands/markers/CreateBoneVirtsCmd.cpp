#include "commands/markers/BoneVirtuals.h"
#include "host/command/Results.h"
#include "host/command/ScriptCommand.h"
#include "host/scene/Database.h"

namespace {

class CreateBoneVirtsCmd final : public ScriptCommand<CreateBoneVirtsCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "createBoneVirts",
      .displayName = "Create Bone Virtual Markers",
      .category = "Data Editing",
      .purpose = "Creates virtual markers for the selected bones.",
      .example = "createBoneVirts -joint",
      .argsText =
          "For each selected SolvingBone with a child bone: BONE_virtA and BONE_virtB on either side of the "
          "child joint, a quarter of the bone's length from it. Of several child bones the last counts. They "
          "are tied by solving constraints and keyed over the animation range in the active clip.",
      .options =
          {{"joint",
            "adds BONE_virt in the bone's own joint, so that the three tell the whole pose of the bone"}},
      .returns = Variable::StringArray};
  static constexpr int kJoint = info.option("joint");

  bool execute(Given const& given, Args const&, Variable& result) override {
    m_created.clear();
    bool const withJoint = GivenOptions(given).has(kJoint);
    // New markers are not selected, so the selection stays as it is.
    int bones = 0;
    for (int i = 0; i < g_db->getNumSelectedNodes(); ++i) {
      Node* node = g_db->getSelectedNode(i);
      if (SolvingBone* bone = usableBone(node); bone && makeBoneVirtuals(*bone, withJoint, m_created))
        ++bones;
    }
    if (bones == 0) {
      logWarning("Please select at least one bone to create virtual markers for.");
      return true;
    }
    logInfo("Created %d virtual marker(s) for %d bone(s)", static_cast<int>(m_created.size()), bones);
    Variable paths(Variable::StringArray, static_cast<int>(m_created.size()));
    for (size_t i = 0; i < m_created.size(); ++i)
      paths.setValue(m_created[i]->getMinimumPathString(false).GetStr(), static_cast<int>(i));
    return answer(result, paths);
  }

 private:
  static SolvingBone* usableBone(Node* node) {
    auto* bone = objectAs<SolvingBone>(node);
    if (!bone)
      logWarning("'%s' is not a SolvingBone. Skipping.", node->getName().GetStr());
    else if (bone->getNumDofs() < 1)
      logWarning("'%s' does not have any DOF's. Skipping.", node->getName().GetStr());
    else if (bone->getNumNodeChildren() == 0)
      logWarning("'%s' does not have any children. Skipping.", node->getName().GetStr());
    else
      return bone;
    return nullptr;
  }

  std::vector<Marker*> m_created;  // in one run
};

}  // namespace

Command* newCreateBoneVirtsCmd() { return new (std::nothrow) CreateBoneVirtsCmd; }
