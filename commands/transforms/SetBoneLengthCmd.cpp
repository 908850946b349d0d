#include "commands/transforms/TransformWriting.h"
#include "host/command/Arguments.h"
#include "host/scene/Bones.h"
#include "host/scene/Database.h"

namespace {

class SetBoneLengthCmd final : public ScriptCommand<SetBoneLengthCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "setBoneLength",
      .displayName = "Set Bone Length",
      .category = "Data Editing",
      .subCategory = "Data Manipulators",
      .purpose = "Gives the primary selected bone a length in millimetres by moving its children.",
      .example = "setBoneLength 420 -adjustChildren",
      .args = {"length"},
      .argsText = "The length in mm, 0 or more. Sets the pre-translations of all node children; keys stay.",
      .options = {{"relative", "length is a factor of the present length"},
                  {"adjustChildren", "shifts the children's own children back by what the bone gained"}}};

  // A whole number will do as well.
  bool checkArgSyntax(Args const& args, Given const&) const override {
    return args.getCount() == 1 && areNumbers(args);
  }

  bool execute(Given const& given, Args const& args, Variable&) override;
};

struct NewPlace {
  Node* node;
  Vec3 preTranslation;
};

// Where a bone's children, and with `adjust` their own node children, go for a length, or for a factor.
std::vector<NewPlace> placesFor(Node const& bone, double length, bool relative, bool adjust) {
  std::vector<NewPlace> places;
  for (int i = 0; i < bone.getNumNodeChildren(); ++i) {
    Node* child = bone.getNodeChild(i);
    Vec3 offset = child->getPreTranslation();
    double const former = offset.length(), wanted = relative ? former * length : length;
    offset.setLength(wanted);
    places.push_back({child, offset});
    for (int k = 0; adjust && k < child->getNumNodeChildren(); ++k) {
      Node* grandchild = child->getNodeChild(k);
      Vec3 theirs = grandchild->getPreTranslation();
      // Below 0 when the bone passes it by: then it lies on the child's other side.
      theirs.setLength(theirs.length() - (wanted - former));
      places.push_back({grandchild, theirs});
    }
  }
  return places;
}

bool SetBoneLengthCmd::execute(Given const& given, Args const& args, Variable&) {
  Module* primary = g_db->getPrimarySelectedModule();
  auto* bone = objectAs<BaseBone>(primary);
  if (!bone) {
    logError("Primary selection must be a LabelingBone or SolvingBone.");
    return false;
  }
  if (bone->getNumNodeChildren() == 0) {
    logError("Primary selection must have at least one child that is a Node");
    return false;
  }
  double const length = args[0].getFloatValue(-1);
  if (!areFinite({length, 0, 0}, info.name)) return false;
  if (length < 0) {
    logError("Length parameter must be positive");  // kept: 0 will do
    return false;
  }
  GivenOptions const options(given);
  std::vector<NewPlace> const places = placesFor(*bone, length, options.has(info.option("relative")),
                                                 options.has(info.option("adjustChildren")));
  for (NewPlace const& place : places)
    if (!areFinite(place.preTranslation, info.name)) return false;
  for (auto const& [node, preTranslation] : places)
    if (isFree(obstacleToPreTransform(*node), "Pre-translation", *node))
      node->setPreTranslation(preTranslation);
  return true;
}

}  // namespace

Command* newSetBoneLengthCmd() { return new (std::nothrow) SetBoneLengthCmd; }
