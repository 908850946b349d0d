#include <algorithm>
#include <unordered_set>

#include "host/base/Text.h"
#include "host/scene/Devices.h"
#include "host/scene/PropertyTable.h"
#include "io/FileError.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeImportParts.h"

namespace talix {

namespace {

bool isDevice(Module const& module) { return module.isKindOf(&AnalogDevice::staticClass()); }

std::string channelName(std::string const& name, char const* byDefault) {
  std::string mended(withoutOuterBlanks(name));
  if (mended.empty()) mended = byDefault;
  for (char& c : mended)
    if (c == '.' || c == '\\') c = '_';
  return mended;
}

// The channels of one device: each name of the take gets one, under that name or, where it cannot have it,
// under a mended one.
class DeviceImport {
 public:
  DeviceImport(TakeImport& import, AnalogDevice& device, DataSource::PropertyType type,
               std::string const& path)
      : m_import(import), m_device(device), m_type(type), m_path(path) {}

  // Returns the channel's name.
  std::string add(std::string const& name, char const* byDefault, KeyTrack track) {
    std::string const mended = channelName(name, byDefault);
    std::string free = mended;
    for (int& number = m_lastNumber[mended]; !isFree(free);) free = mended + "_" + std::to_string(++number);
    Controller* channel = m_device.addChannel(free, m_type);
    if (!channel) throw FileError(m_path, "the scene has no channel name left for \"" + name + "\"");
    m_used.insert(free);
    channel->setTrack(&m_import.clip(), 0, std::move(track));
    if (free != name)
      m_import.info("the channel " + (name.empty() ? std::string("without a name") : "\"" + name + "\"") +
                    " of " + m_device.getName().GetString() + " became \"" + free + "\"");
    return free;
  }

 private:
  bool isFree(std::string const& name) const {
    return !m_used.contains(name) &&
           m_device.getDatabase()->getPropertyTable().obstacleToChannel(HString(name), m_type).IsEmpty();
  }

  TakeImport& m_import;
  AnalogDevice& m_device;
  DataSource::PropertyType m_type;
  std::string const& m_path;
  std::unordered_set<std::string> m_used;
  std::unordered_map<std::string, int> m_lastNumber;  // that a name was given
};

void importOutputs(TakeImport& import, Take& take, std::string const& path) {
  auto* device = import.place<AnalogDevice>(isDevice, "Outputs", nullptr);
  DeviceImport channels(import, *device, DataSource::Vec3Property, path);
  std::vector<fileMetadata::Record> records;
  for (ModelOutput& output : take.outputs)
    records.push_back({channels.add(output.name, "output", std::move(output.values)), output.name,
                       output.unit, output.kind});
  fileMetadata::setRecords(import.clip(), fileMetadata::kOutputs, records);
}

void importAnalog(TakeImport& import, Take& take, std::string const& path) {
  auto* device = import.place<AnalogDevice>(isDevice, "Analog", nullptr);
  DeviceImport channels(import, *device, DataSource::FloatProperty, path);
  std::vector<fileMetadata::Record> records;
  for (TakeAnalogChannel& analog : take.analog)
    records.push_back({channels.add(analog.name, "channel", std::move(analog.samples)), analog.name,
                       analog.unit, analog.description, fileMetadata::numberText(analog.scale),
                       fileMetadata::numberText(analog.offset)});
  fileMetadata::setRecords(import.clip(), fileMetadata::kAnalogChannels, records);
}

}  // namespace

void importDevices(TakeImport& import, Take& take, std::string const& path) {
  if (!take.outputs.empty()) importOutputs(import, take, path);
  if (!take.analog.empty()) importAnalog(import, take, path);
}

}  // namespace talix
