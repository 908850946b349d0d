#include "session/hostcommands/AttributeValues.h"

#include <algorithm>
#include <cmath>
#include <iterator>

#include "host/command/Angles.h"
#include "host/command/Arguments.h"
#include "host/command/Frames.h"
#include "host/command/Targets.h"
#include "host/scene/HTimeManager.h"

namespace talix {

namespace {

// Single values: arrays are taken apart.
using Values = std::vector<Variable>;

constexpr AttributeKind kAttributeKinds[] = {
    {"int", Attribute::Integer, "an integer"},
    {"enum", Attribute::Enumeration, "strings, its labels"},
    {"float", Attribute::Float, "a number"},
    {"string", Attribute::String, "a string"},
    {"multiString", Attribute::MultiString, "strings, one for each line"},
    {"bool", Attribute::Boolean, "true or false"},
    {"vector", Attribute::Vector, "a vector or three numbers"},
    {"bitField", Attribute::BitField, "strings, its labels"},
    {"rotation", Attribute::Rotation, "a vector or three numbers, angles in degrees"},
    {"time", Attribute::Time, "a number of frames or a timecode"},
    {"color", Attribute::Color, "a vector or three numbers, from 0 to 255"},
    {"event", Attribute::Event, "no values"},
    {"module", Attribute::ModuleReference, "the path of a module"},
    {"none", Attribute::NoKind, "no values"},
    {"matrix", Attribute::MatrixKind, "the numbers of a square matrix, row by row"},
    {"multiModule", Attribute::MultiModule, "paths of modules"},
    {"temperature", Attribute::Temperature, "an integer"},
};

enum class Reading { Taken, Misfit, Logged };

bool isString(Variable const& value) { return value.getType() == Variable::String; }

Values flattened(Args const& args, int first) {
  Values values;
  for (int i = first; i < args.getCount(); ++i)
    for (int k = 0; k < args[i].getNumItems(); ++k) values.push_back(args[i].getArrayValue(k));
  return values;
}

Attribute::Labels labelsFrom(Values const& values) {
  std::vector<HString> labels;
  for (Variable const& value : values) labels.emplace_back(value.getStringValue(-1));
  return std::make_shared<std::vector<HString> const>(std::move(labels));
}

std::optional<Vec3> vectorFrom(Values const& values) {
  if (values.size() == 1 && values[0].getType() == Variable::Vector) return values[0].getVecValue(-1);
  if (values.size() != 3 || !std::all_of(values.begin(), values.end(), isIntOrFloat)) return {};
  return Vec3(values[0].getFloatValue(-1), values[1].getFloatValue(-1), values[2].getFloatValue(-1));
}

HString linesFrom(Values const& values) {
  std::string text;
  for (Variable const& value : values) {
    if (&value != &values.front()) text += '\n';
    text += value.getStringValue(-1);
  }
  return HString(std::move(text));
}

Reading takeVector(Attribute& attribute, Values const& values, Module const& module) {
  std::optional<Vec3> const vector = vectorFrom(values);
  if (!vector) return Reading::Misfit;
  if (attribute.getType() == Attribute::Vector) {
    static_cast<VectorAttribute&>(attribute).setValue(*vector, true, true, true, true);
  } else if (attribute.getType() == Attribute::Rotation) {
    static_cast<RotationAttribute&>(attribute).setValue(rotationFromDegrees(*vector, rotationOrderOf(module)),
                                                        true, true, true, true);
  } else {
    if (!static_cast<ColorAttribute&>(attribute).setValue(*vector, true, true, true, true))
      return Reading::Misfit;
  }
  return Reading::Taken;
}

Reading takeTime(TimeAttribute& attribute, Values const& values) {
  if (values.size() != 1) return Reading::Misfit;
  double frame = 0;
  if (isIntOrFloat(values[0]))
    frame = values[0].getFloatValue(-1);
  else if (!isString(values[0]) ||
           !HTimeManager::getInstance()->framesFromString(values[0].getStringValue(-1), false, frame))
    return Reading::Misfit;
  std::optional<int64> const time = timeOfFrame(frame);
  if (!time) return Reading::Logged;
  attribute.setValue(*time, true, true, true, true);
  return Reading::Taken;
}

Reading takeMatrix(MatrixAttribute& attribute, Values const& values) {
  auto const n = static_cast<uint64>(std::llround(std::sqrt(static_cast<double>(values.size()))));
  if (n * n != values.size() || !std::all_of(values.begin(), values.end(), isIntOrFloat))
    return Reading::Misfit;
  Matrix matrix(n);
  for (uint64 i = 0; i < values.size(); ++i) matrix[i / n][i % n] = values[i].getFloatValue(-1);
  attribute.setValue(matrix, true, true, true, true);
  return Reading::Taken;
}

Reading takeModules(Attribute& attribute, Values const& values) {
  if (!std::all_of(values.begin(), values.end(), isString)) return Reading::Misfit;
  TSimpleArray<Module*> modules;
  for (Variable const& value : values) {
    Module* module = moduleAt(value.getStringValue(-1));
    if (!module) return Reading::Logged;
    modules.add(module);
  }
  if (attribute.getType() == Attribute::MultiModule) {
    static_cast<MultiModAttribute&>(attribute).setValue(modules, true, true, true, true);
    return Reading::Taken;
  }
  if (modules.getCount() != 1) return Reading::Misfit;
  static_cast<ModAttribute&>(attribute).setValue(modules[0], true, true, true, true);
  return Reading::Taken;
}

Reading takeScalar(Attribute& attribute, Values const& values) {
  if (values.size() != 1) return Reading::Misfit;
  Variable const& value = values[0];
  switch (attribute.getType()) {
    case Attribute::Integer:
      if (value.getType() != Variable::Int) return Reading::Misfit;
      static_cast<IntAttribute&>(attribute).setValue(value.getIntValue(-1), true, true, true, true);
      return Reading::Taken;
    case Attribute::Temperature:
      if (value.getType() != Variable::Int) return Reading::Misfit;
      static_cast<TemperatureAttribute&>(attribute).setValue(value.getIntValue(-1), true, true, true, true);
      return Reading::Taken;
    case Attribute::Float:
      if (!isIntOrFloat(value)) return Reading::Misfit;
      static_cast<FloatAttribute&>(attribute).setValue(value.getFloatValue(-1), true, true, true, true);
      return Reading::Taken;
    case Attribute::String:
      if (!isString(value)) return Reading::Misfit;
      static_cast<StringAttribute&>(attribute).setValue(value.getStringValue(-1), true, true, 0, true, true);
      return Reading::Taken;
    case Attribute::Boolean: {
      double const number = value.getFloatValue(-1);
      if (!value.isNumber() || (number != 0 && number != 1)) return Reading::Misfit;
      static_cast<BoolAttribute&>(attribute).setValue(number != 0, true, true, true, true);
      return Reading::Taken;
    }
    default:
      return Reading::Misfit;
  }
}

Reading takeValues(Attribute& attribute, Values const& values, Module const& module) {
  switch (attribute.getType()) {
    case Attribute::Enumeration:
    case Attribute::BitField:
      return Reading::Taken;  // the labels are there already
    case Attribute::MultiString:
      if (!std::all_of(values.begin(), values.end(), isString)) return Reading::Misfit;
      static_cast<MultiStringAttribute&>(attribute).setValue(linesFrom(values), true, true, true, true);
      return Reading::Taken;
    case Attribute::Vector:
    case Attribute::Rotation:
    case Attribute::Color:
      return takeVector(attribute, values, module);
    case Attribute::Time:
      return takeTime(static_cast<TimeAttribute&>(attribute), values);
    case Attribute::MatrixKind:
      return takeMatrix(static_cast<MatrixAttribute&>(attribute), values);
    case Attribute::ModuleReference:
    case Attribute::MultiModule:
      return takeModules(attribute, values);
    default:
      return takeScalar(attribute, values);
  }
}

bool isReference(Attribute const& attribute) {
  return attribute.getType() == Attribute::ModuleReference || attribute.getType() == Attribute::MultiModule;
}

}  // namespace

AttributeKind const* findAttributeKind(HString const& name) {
  auto const* kind = std::find_if(std::begin(kAttributeKinds), std::end(kAttributeKinds),
                                  [&](AttributeKind const& known) { return name == known.name; });
  return kind == std::end(kAttributeKinds) ? nullptr : kind;
}

std::string attributeKindNames() {
  std::string names;
  for (AttributeKind const& kind : kAttributeKinds) {
    if (!names.empty()) names += &kind == std::end(kAttributeKinds) - 1 ? " or " : ", ";
    names += kind.name;
  }
  return names;
}

std::unique_ptr<Attribute> makeAttribute(AttributeKind const& kind, HString const& name, Args const& args,
                                         int first, Module const& module) {
  Values const values = flattened(args, first);
  bool const labelled = kind.takesLabels();
  Reading reading = Reading::Taken;
  std::unique_ptr<Attribute> attribute;
  if (labelled && !std::all_of(values.begin(), values.end(), isString)) {
    reading = Reading::Misfit;
  } else {
    attribute = Attribute::create(kind.type, name, labelled ? labelsFrom(values) : nullptr);
    if (!values.empty()) reading = takeValues(*attribute, values, module);
  }
  if (reading == Reading::Misfit)
    Command::logError("An attribute of kind %s takes %s.", kind.name, kind.values);
  if (reading != Reading::Taken) return nullptr;
  // A default outlives the module that it names, so references have none.
  if (!isReference(*attribute)) attribute->takeAsDefault();
  return attribute;
}

}  // namespace talix
