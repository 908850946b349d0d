// Channels of a module by name, and numbers of channels and attributes by name.

#include "host/math/Degrees.h"
#include "host/scene/Database.h"
#include "host/scene/HTimeManager.h"
#include "host/scene/Node.h"
#include "host/scene/PropertyTable.h"

namespace {

// Splits "Translation.y" into the channel name and 1; -1 without a component.
int splitComponent(HString& name) {
  int const dot = name.ReverseFind('.');
  if (dot < 0 || dot != name.GetLength() - 2) return -1;
  char const letter = static_cast<char>(name[dot + 1] | 0x20);
  if (letter < 'x' || letter > 'z') return -1;
  name = name.Left(static_cast<uint64>(dot));
  return letter - 'x';
}

// One component of a vector channel, or one angle of a rotation channel in degrees.
double componentValue(Controller const& channel, int component, bool byDefault, int64 now) {
  if (auto const* vector = objectAs<Vec3Controller>(&channel))
    return (byDefault ? vector->getConstValue() : vector->getValue(now))[component];
  auto const& rotations = static_cast<RotController const&>(channel);
  Vec3 angles;
  (byDefault ? rotations.getConstValue() : rotations.getValue(now))
      .getAsEuler(rotationOrderOf(*channel.getModule()), angles);
  return angles[component] * kDegreesPerRadian;
}

double scalarValue(Controller const& channel, bool byDefault, int64 now) {
  if (auto const* floats = objectAs<FloatController>(&channel))
    return byDefault ? floats->getConstValue() : floats->getValue(now);
  if (auto const* ints = objectAs<IntController>(&channel))
    return byDefault ? ints->getConstValue() : ints->getValue(now);
  auto const& bools = static_cast<BoolController const&>(channel);
  return byDefault ? bools.getConstValue() : bools.getValue(now);
}

// The number of an attribute, or the text that says which reader to use.
HString attributeValue(Attribute const& attribute, double& value) {
  switch (attribute.getType()) {
    case Attribute::Integer:
      value = static_cast<IntAttribute const&>(attribute).getValue();
      return {};
    case Attribute::Enumeration:
      value = static_cast<EnumAttribute const&>(attribute).getIndex();
      return {};
    case Attribute::Float:
      value = static_cast<FloatAttribute const&>(attribute).getValue();
      return {};
    case Attribute::Boolean:
      value = static_cast<BoolAttribute const&>(attribute).getValue();
      return {};
    case Attribute::Time:
      value = static_cast<TimeAttribute const&>(attribute).getValue();
      return {};
    case Attribute::Temperature:
      value = static_cast<TemperatureAttribute const&>(attribute).getValue();
      return {};
    case Attribute::String:
    case Attribute::MultiString:
      return "Use getStringProperty for this type of attribute";
    case Attribute::Vector:
    case Attribute::Rotation:
      return "Use getVectorProperty for this type of attribute";
    case Attribute::BitField:
      return "Use getBooleanArrayProperty for this type of attribute";
    case Attribute::Color:
      return "Use getIntArrayProperty for this type of attribute";
    case Attribute::Event:
    case Attribute::ModuleReference:
    case Attribute::NoKind:
    case Attribute::MatrixKind:
    case Attribute::MultiModule:
      break;
  }
  return "Unsupported attribute type";
}

}  // namespace

Controller* Module::addChannel(HString const& name, DataSource::PropertyType type) {
  return addChannel(name, Controller::create(type));
}

Controller* Module::addChannel(HString const& name, std::unique_ptr<Controller> channel) {
  DataSource::PropertyType const type = channel ? channel->getPropertyType() : DataSource::NoProperty;
  unsigned const id = m_database->getPropertyTable().add(name, type);
  if (id == 0) return nullptr;
  if (Controller* existing = getProperty(id)) return existing;
  channel->m_module = this;
  channel->m_propertyId = id;
  channel->m_id = ControlID(++m_database->m_lastID);
  storeChannel(std::move(channel));
  return m_channels.back().get();
}

HString Module::getPropertyVal(HString const& name, double& value, bool byDefault) const {
  HString channelName = name;
  int const component = splitComponent(channelName);
  PropertyTable const& table = m_database->getPropertyTable();
  unsigned const id = table.findId(channelName);
  DataSource::PropertyType const type = table.getType(id);
  bool const several = type == DataSource::Vec3Property || type == DataSource::RotProperty;
  if (id != 0 && (several || component < 0)) {
    Controller const* channel = getProperty(id);
    HString text;
    if (!channel) {
      text.Format("Cannot find property named %s on module %s", name.GetStr(), getName().GetStr());
      return text;
    }
    int64 const now = m_database->getTimeManager()->getTime();
    if (several && component < 0) return "Use getVectorProperty for this type of property";
    value =
        several ? componentValue(*channel, component, byDefault, now) : scalarValue(*channel, byDefault, now);
    return {};
  }
  if (Attribute const* attribute = getAttribute(name.GetStr())) return attributeValue(*attribute, value);
  HString text;
  text.Format("Unknown property type: %s", name.GetStr());
  return text;
}
