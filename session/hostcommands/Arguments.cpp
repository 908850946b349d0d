#include "session/hostcommands/Arguments.h"

#include <algorithm>
#include <cmath>

#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/PropertyTable.h"

namespace talix {

Module* moduleAt(HString const& path, HRuntimeClass const* type) {
  Module* module = g_db->getModuleWithPath(path, type, false);
  if (!module) {
    char const* kind = type ? type->getName() : "Module";
    Command::logError("%s is not a valid unique path to a %s in the scene.", path.GetStr(), kind);
  }
  return module;
}

std::optional<ChannelChoice> channelNamed(HString const& given) {
  HString name = given;
  Controller::fixChannelStr(name);
  ChannelChoice choice{Controller::mapPropertyName(name)};
  int const dot = name.GetLength() - 2;
  if (choice.id == 0 && dot > 0 && name[dot] == '.') {
    char const letter = static_cast<char>(name[dot + 1] | 0x20);
    if (letter >= 'x' && letter <= 'z') {
      choice.mask = 1u << (letter - 'x');
      name = name.Left(static_cast<uint64>(dot));
      choice.id = Controller::mapPropertyName(name);
    }
  }
  if (choice.id == 0) {
    Command::logError("Unknown property type: %s", given.GetStr());
    return {};
  }
  DataSource::PropertyType const type = Controller::mapToPropertyType(choice.id);
  if (choice.mask != 7 && type != DataSource::Vec3Property && type != DataSource::RotProperty) {
    Command::logError("%s has no components.", name.GetStr());
    return {};
  }
  return choice;
}

bool isNew(Module const& module, HString const& name, char const* what, HString const& obstacle) {
  if (module.getProperty(name) || module.getAttribute(name.GetStr()))
    Command::logError("Module %s already has a property named %s.", module.getName().GetStr(), name.GetStr());
  else if (!obstacle.IsEmpty())
    Command::logError("\"%s\" cannot be the name of %s: %s.", name.GetStr(), what, obstacle.GetStr());
  else
    return true;
  return false;
}

bool isFrameNumber(Variable const& value) {
  return value.getType() == Variable::Int || value.getType() == Variable::Float;
}

bool areFrameNumbers(Args const& args) { return std::all_of(args.begin(), args.end(), isFrameNumber); }

std::optional<int64> timeOfFrame(double frame) {
  HTimeManager const& times = *HTimeManager::getInstance();
  if (std::abs(frame) > static_cast<double>(kForever / times.getTicksPerFrame() - 1)) {
    Command::logError("Frame %g lies beyond the time line.", frame);
    return {};
  }
  return times.getTimeFromFrameDouble(frame);
}

std::optional<HTimeRange> rangeOfFrames(double start, double end) {
  std::optional<int64> const first = timeOfFrame(start);
  if (!first) return {};
  std::optional<int64> const last = timeOfFrame(end);
  if (!last) return {};
  if (*first > *last) {
    Command::logError("The start frame %g lies after the end frame %g.", start, end);
    return {};
  }
  return HTimeRange(*first, *last);
}

}  // namespace talix
