#include "commands/properties/PropertyReading.h"
#include "host/command/Angles.h"
#include "host/command/Results.h"

namespace {

class GetVectorPropertyCmd final : public ScriptCommand<GetVectorPropertyCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "getVectorProperty",
      .displayName = "Get Vector/Rotation Property",
      .category = "Data Editing",
      .subCategory = "Data Retrieval",
      .purpose = "Reads a property of a module as a vector: lengths in millimetres, angles in degrees.",
      .example = "getVectorProperty LFHD Translation",
      .args = {"moduleName propertyName", 2, 2, {Variable::String, Variable::String}},
      .argsText =
          "moduleName is a path, propertyName a channel or an attribute in exact case: a vector, a colour, a "
          "rotation. A channel is read at the current time, angles in the node's own order; one without "
          "vectors reads as <0 0 0>.",
      .options = {{"c", "the default value of the channel instead; no effect on attributes"},
                  {"d", "the same as -c"}},
      .returns = Variable::Vector,
      .solo = Solo::no};

  bool execute(Given const& given, Args const& args, Variable& result) override;
};

Vec3 channelVector(Controller const& channel, bool byDefault) {
  if (Vec3Controller const* vector = objectAs<Vec3Controller>(&channel)) return valueOf(*vector, byDefault);
  if (RotController const* rotation = objectAs<RotController>(&channel))
    return eulerDegrees(valueOf(*rotation, byDefault), rotationOrderOf(*channel.getModule()));
  return {};  // kept: a channel of another kind reads as zero
}

bool GetVectorPropertyCmd::execute(Given const& given, Args const& args, Variable& result) {
  Module const* module =
      moduleAt(args[0].getStringValue(-1),
               "%s  is not a valid unique path to a Module in the scene.");  // two spaces: kept
  if (!module) return false;
  HString const name = args[1].getStringValue(-1);
  if (Controller const* channel = module->getProperty(name))
    return answer(result, channelVector(*channel, isByDefault<GetVectorPropertyCmd>(given)));

  Attribute const* attribute = module->getAttribute(name.GetStr());
  if (VectorAttribute const* vector = objectAs<VectorAttribute>(attribute))
    return answer(result, vector->getValue());
  if (ColorAttribute const* color = objectAs<ColorAttribute>(attribute))
    return answer(result, color->getValue());
  if (RotationAttribute const* rotation = objectAs<RotationAttribute>(attribute))
    return answer(result, eulerDegrees(rotation->getValue(), rotationOrderOf(*module)));
  logError("Unknown property: %s", name.GetStr());  // kept: for an attribute of another kind as well
  return false;
}

}  // namespace

Command* newGetVectorPropertyCmd() { return new (std::nothrow) GetVectorPropertyCmd; }
