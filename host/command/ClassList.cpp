// Every run-time class by name: the only list, so that a class exists for scripts when it stands here.

#include <string_view>
#include <unordered_map>

#include "host/command/Command.h"
#include "host/command/CommandPluginBase.h"
#include "host/scene/Attribute.h"
#include "host/scene/Character.h"
#include "host/scene/Clips.h"
#include "host/scene/Constraints.h"
#include "host/scene/Devices.h"
#include "host/scene/Marker.h"
#include "host/scene/Setups.h"

namespace {

template <class... Classes>
std::unordered_map<std::string_view, HRuntimeClass*> byName() {
  return {{Classes::staticClass().getName(), &Classes::staticClass()}...};
}

}  // namespace

HRuntimeClass* HRuntimeClass::findClass(char const* name) {
  static auto const classes =
      byName<HObject, Module, Node, Marker, Character, BaseBone, LabelingBone, SolvingBone, ConstraintBase,
             PositionConstraintBase, LabelingConstraint, SolvingConstraint, LabelingCluster, OpticalCamera,
             ParameterizedSetup, LabelingSetup, SolvingSetup, NLEClip, Clip, BlendClip, SystemGroup,
             AnalogDevice, DataSource, Controller, FloatController, IntController, BoolController,
             Vec3Controller, RotController, Attribute, IntAttribute, EnumAttribute, FloatAttribute,
             StringAttribute, NameAttribute, MultiStringAttribute, BoolAttribute, VectorAttribute,
             BitFieldAttribute, RotationAttribute, TimeAttribute, ColorAttribute, EventAttribute,
             ModAttribute, NoneAttribute, MatrixAttribute, MultiModAttribute, TemperatureAttribute, Command,
             HomCorePluginBase, CommandPluginBase>();
  auto const found = classes.find(name ? name : "");
  return found == classes.end() ? nullptr : found->second;
}
