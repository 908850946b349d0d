#include <cmath>
#include <unordered_map>

#include "host/scene/Devices.h"
#include "host/scene/HTimeManager.h"
#include "io/scene/FileMetadata.h"
#include "io/scene/TakeExportParts.h"

namespace talix {

namespace {

// What the clip remembers of its channels, by their name in the scene.
using MetadataByChannel = std::unordered_map<std::string, fileMetadata::Record>;

MetadataByChannel metadataOf(NLEClip const* clip, char const* attribute, size_t fields) {
  MetadataByChannel byChannel;
  if (!clip) return byChannel;
  for (fileMetadata::Record& record : fileMetadata::records(*clip, attribute, fields)) {
    std::string channel = record[0];
    byChannel.emplace(std::move(channel), std::move(record));
  }
  return byChannel;
}

class DeviceExport {
 public:
  explicit DeviceExport(TakeExport& out)
      : m_out(out),
        m_sampler(*out.sampler),
        m_samples(sampleTimes()),
        m_analog(metadataOf(m_sampler.clip(), fileMetadata::kAnalogChannels, 6)),
        m_outputs(metadataOf(m_sampler.clip(), fileMetadata::kOutputs, 4)) {}

  void add(AnalogDevice const& device) {
    for (int i = 0; i < device.getNumChannels(); ++i) {
      Controller const& channel = *device.getChannel(i);
      if (!m_sampler.belongsToClip(channel)) continue;
      if (channel.getPropertyType() == DataSource::Vec3Property)
        addOutput(channel);
      else if (channel.getPropertyType() == DataSource::FloatProperty)
        addAnalog(channel);
      else
        m_out.warn("takes hold vector and float channels of devices only; \"" +
                   channel.getName().GetString() + "\" of " + device.getName().GetString() + " was left out");
    }
  }

  void finish() {
    if (m_out.take.analog.empty()) return;
    m_out.take.analogRate = analogRate();
  }

 private:
  void addOutput(Controller const& channel) {
    ModelOutputSource output;
    output.name = channel.getName().GetString();
    output.kind = "SCALARS";
    if (auto const known = m_outputs.find(output.name); known != m_outputs.end()) {
      output.unit = known->second[2];
      output.kind = known->second[3];
      output.name = known->second[1];
    }
    m_out.keysLeftOut += m_sampler.keysOffGrid(channel);
    output.values = channelSource(m_out.sampler, channel, {&channel});
    m_out.take.outputs.push_back(std::move(output));
  }

  void addAnalog(Controller const& channel) {
    AnalogSource analog;
    analog.name = channel.getName().GetString();
    if (auto const known = m_analog.find(analog.name); known != m_analog.end()) {
      fileMetadata::Record const& record = known->second;
      analog.unit = record[2];
      analog.description = record[3];
      analog.scale = fileMetadata::textNumber(record[4]);
      analog.offset = fileMetadata::textNumber(record[5]);
      analog.name = record[1];
    }
    m_out.keysLeftOut += m_sampler.keysOff(channel, m_samples);
    analog.samples = channelSource(m_out.sampler, channel, {&channel});
    m_out.take.analog.push_back(std::move(analog));
  }

  double analogRate() const {
    auto const* clip = objectAs<Clip>(m_sampler.clip());
    double const rate = clip ? clip->getFileTime().sampleRate : 0;
    return rate > 0 ? rate : m_out.take.rate;
  }

  // Devices sample faster than cameras.
  SampleTimes sampleTimes() const {
    FrameGrid const& frames = m_sampler.grid();
    double const perFrame = analogRate() / m_out.take.rate;
    return {frames.start(), ticksPerFrameAt(analogRate()),
            std::llround(static_cast<double>(frames.count) * perFrame)};
  }

  TakeExport& m_out;
  FrameSampler const& m_sampler;
  SampleTimes m_samples;
  MetadataByChannel m_analog, m_outputs;
};

}  // namespace

void exportDevices(TakeExport& out) {
  DeviceExport devices(out);
  for (int i = 0; i < out.scene.getNumModules(); ++i)
    if (auto const* device = objectAs<AnalogDevice>(out.scene.getModule(i))) devices.add(*device);
  devices.finish();
}

}  // namespace talix
