#include "commands/properties/AttributeWriting.h"

#include <cmath>

#include "host/command/Angles.h"
#include "host/command/Targets.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"

namespace {

bool isOne(Args const& args, Variable::VarType type) {
  return args.getCount() == 2 && args[1].getType() == type;
}

bool wrongShape(char const* command) {
  Command::logError("Invalid number or type of arguments for %s", command);
  return false;
}

// --- one value ---

// Why a value of the right shape is not taken.
bool refuse(char const* reason) {
  Command::logError("%s", reason);
  return false;
}

template <class Attributes, class Value>
bool put(Attributes& attribute, Value const& value, char const* limits) {
  return attribute.setValue(value, true, true, true, true) || refuse(limits);
}

constexpr char const kTooLarge[] = "The value is too large.";

// Integers and temperatures.
template <class Integers>
bool setInteger(Integers& attribute, Args const& args, bool relative) {
  if (!isOneNumber(args)) return false;
  int64 const value = changed(attribute.getValue(), integerFrom(args[1]), relative);
  return canBeHeld(value) ? put(attribute, static_cast<int>(value), kTooLarge) : refuse(kTooLarge);
}

bool setFloat(FloatAttribute& attribute, Args const& args, bool relative) {
  return isOneNumber(args) &&
         put(attribute, changed(attribute.getValue(), args[1].getFloatValue(-1), relative), kTooLarge);
}

bool setEnum(EnumAttribute& attribute, Args const& args) {
  return isOne(args, Variable::String) &&
         attribute.setValue(args[1].getStringValue(-1), true, true, true, true);
}

bool setString(StringAttribute& attribute, Args const& args) {
  return isOne(args, Variable::String) &&
         attribute.setValue(args[1].getStringValue(-1), true, true, 0, true, true);
}

bool setLines(MultiStringAttribute& attribute, Args const& args) {
  return isOne(args, Variable::String) &&
         attribute.setValue(args[1].getStringValue(-1), true, true, true, true);
}

bool setBool(BoolAttribute& attribute, Args const& args) {
  return isOne(args, Variable::Bool) &&
         attribute.setValue(changed(attribute.getValue(), args[1].getBoolValue(-1)), true, true, true, true);
}

// A number of frames, or a text of frames or timecode.
bool setTime(TimeAttribute& attribute, Args const& args, bool relative) {
  HTimeManager const& times = *HTimeManager::getInstance();
  double frames = 0;
  if (isOneNumber(args)) {
    frames = args[1].getFloatValue(-1);
  } else if (!isOne(args, Variable::String)) {
    return false;
  } else if (!times.framesFromString(args[1].getStringValue(-1), attribute.isRelative(), frames)) {
    Command::logError("\"%s\" is neither a number of frames nor timecode.", args[1].getStringValue(-1));
    return false;
  }
  constexpr char const kBeyond[] = "The time lies beyond the time line.";
  if (!times.isOnTimeLine(frames)) return refuse(kBeyond);
  int64 const ticks = times.getTimeFromFrameDouble(frames);
  return put(attribute, relative ? attribute.getTime() + ticks : ticks, kBeyond);
}

// --- several values ---

bool setVector(VectorAttribute& attribute, Args const& args, Change const& change, char const* command) {
  Vec3 given;
  if (!readVector(args, change.component, given)) return wrongShape(command);
  // Kept: with a component the whole new value is added, so that the other components double.
  Vec3 value = changed(attribute.getValue(), given, {change.component, false});
  if (change.relative) value += attribute.getValue();
  return put(attribute, value, kTooLarge);
}

bool setRotation(RotationAttribute& attribute, Args const& args, Change const& change, char const* command) {
  Vec3 angles;
  if (!readAngles(args, change.component, angles)) return wrongShape(command);
  // Kept: as for vectors, with a component the whole new rotation is composed.
  TalixRotation const value = changed(attribute.getValue(), angles, {change.component, false},
                                      rotationOrderOf(*attribute.getModule()));
  return attribute.setValue(change.relative ? attribute.getValue() * value : value, true, true, true, true);
}

bool readColor(Args const& args, Vec3& color) {
  if (isOne(args, Variable::IntArray)) {
    for (int i = 0; i < 3; ++i) color[i] = args[1].getIntValue(i);
    return args[1].getNumItems() == 3;
  }
  if (!readVector(args, -1, color)) return false;
  if (args.getCount() == 4)
    for (int i = 0; i < 3; ++i) color[i] = args[i + 1].getIntValue(-1);
  return true;
}

bool setColor(ColorAttribute& attribute, Args const& args, bool relative, char const* command) {
  if (isOne(args, Variable::String) && args[1].getStringValue(-1) == HString("default")) {
    attribute.setDefaultMode(true, true);
    return true;
  }
  Vec3 color;
  if (!readColor(args, color)) return wrongShape(command);
  return put(attribute, relative ? attribute.getValue() + color : color,
             "Red, green and blue are numbers from 0 to 255.");
}

// Pairs of a label and its state. The pairs before one that does not fit stay written.
bool setBits(BitFieldAttribute& attribute, Args const& args) {
  int const count = args.getCount();
  if (count > 2 * attribute.getNumFields() + 1) return false;
  for (int i = 1; i < count; i += 2) {
    if (i + 1 == count || args[i].getType() != Variable::String || args[i + 1].getType() != Variable::Bool)
      return false;
    HString const label = args[i].getStringValue(-1);
    bool const on = changed(attribute.getField(label), args[i + 1].getBoolValue(-1));
    if (!attribute.setValue(label, on, true, true, true, true)) return false;
  }
  return true;
}

// The largest square matrix that the numbers fill; those beyond it are passed over.
bool setMatrix(MatrixAttribute& attribute, Args const& args, char const* command) {
  int const count = args.getCount();
  if (count < 2 || count > 37) {
    Command::logError("Invalid number of arguments for %s", command);
    return false;
  }
  for (int i = 1; i < count; ++i) {
    if (args[i].isNumber()) continue;
    Command::logError("Invalid type of arguments for %s", command);
    return false;
  }
  auto const n = static_cast<int>(std::sqrt(count - 1));
  Matrix matrix(static_cast<uint64>(n));
  for (int i = 0; i < n * n; ++i) matrix[static_cast<uint64>(i / n)][i % n] = args[i + 1].getFloatValue(-1);
  return put(attribute, matrix, kTooLarge);
}

// --- references ---

bool setReference(ModAttribute& attribute, Args const& args) {
  if (!isOne(args, Variable::String)) return false;
  HString const path = args[1].getStringValue(-1);
  Module* module = nullptr;  // an empty path stands for none
  if (!path.IsEmpty() && !(module = moduleAt(path, "%s does not specify a module in the scene.")))
    return false;
  return attribute.setValue(module, true, true, true, true);
}

// A path that names no module leaves its entry empty.
bool setReferences(MultiModAttribute& attribute, Args const& args) {
  if (!isOne(args, Variable::StringArray)) return false;
  TSimpleArray<Module*> modules;
  for (int i = 0; i < args[1].getNumItems(); ++i)
    modules.add(g_db->getModuleWithPath(args[1].getStringValue(i), nullptr, false));
  return attribute.setValue(modules, true, true, true, true);
}

}  // namespace

bool setAttribute(Attribute& attribute, Args const& args, Change const& change, char const* command) {
  switch (attribute.getType()) {
    case Attribute::Integer:
      return setInteger(static_cast<IntAttribute&>(attribute), args, change.relative);
    case Attribute::Temperature:
      return setInteger(static_cast<TemperatureAttribute&>(attribute), args, change.relative);
    case Attribute::Enumeration:
      return setEnum(static_cast<EnumAttribute&>(attribute), args);
    case Attribute::Float:
      return setFloat(static_cast<FloatAttribute&>(attribute), args, change.relative);
    case Attribute::String:
      return setString(static_cast<StringAttribute&>(attribute), args);
    case Attribute::MultiString:
      return setLines(static_cast<MultiStringAttribute&>(attribute), args);
    case Attribute::Boolean:
      return setBool(static_cast<BoolAttribute&>(attribute), args);
    case Attribute::Vector:
      return setVector(static_cast<VectorAttribute&>(attribute), args, change, command);
    case Attribute::BitField:
      return setBits(static_cast<BitFieldAttribute&>(attribute), args);
    case Attribute::Rotation:
      return setRotation(static_cast<RotationAttribute&>(attribute), args, change, command);
    case Attribute::Time:
      return setTime(static_cast<TimeAttribute&>(attribute), args, change.relative);
    case Attribute::Color:
      return setColor(static_cast<ColorAttribute&>(attribute), args, change.relative, command);
    case Attribute::Event:
      static_cast<EventAttribute&>(attribute).doCallBack();
      return true;
    case Attribute::ModuleReference:
      return setReference(static_cast<ModAttribute&>(attribute), args);
    case Attribute::MatrixKind:
      return setMatrix(static_cast<MatrixAttribute&>(attribute), args, command);
    case Attribute::MultiModule:
      return setReferences(static_cast<MultiModAttribute&>(attribute), args);
    case Attribute::NoKind:
      break;
  }
  return true;
}
