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
        m_sampler(out.sampler),
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
    ModelOutput output;
    output.name = channel.getName().GetString();
    output.kind = "SCALARS";
    if (auto const known = m_outputs.find(output.name); known != m_outputs.end()) {
      output.unit = known->second[2];
      output.kind = known->second[3];
      output.name = known->second[1];
    }
    m_out.keysLeftOut += m_sampler.keysOffGrid(channel);
    KeyTrack const* track = m_sampler.asItIs(channel);
    output.values = track ? *track : m_sampler.sampleWhere(m_sampler.framesWithData(channel), channel);
    m_out.take.outputs.push_back(std::move(output));
  }

  void addAnalog(Controller const& channel) {
    TakeAnalogChannel analog;
    analog.name = channel.getName().GetString();
    if (auto const known = m_analog.find(analog.name); known != m_analog.end()) {
      fileMetadata::Record const& record = known->second;
      analog.unit = record[2];
      analog.description = record[3];
      analog.scale = fileMetadata::textNumber(record[4]);
      analog.offset = fileMetadata::textNumber(record[5]);
      analog.name = record[1];
    }
    analog.samples = samples(channel);
    m_out.take.analog.push_back(std::move(analog));
  }

  // The keys inside the range, wherever they lie: devices sample faster than cameras. Where keys were taken
  // out of a track that bridges over them, its samples.
  KeyTrack samples(Controller const& channel) {
    KeyTrack const* lowest = m_sampler.dataTrack(channel);
    if (lowest && lowest->bridgesAny()) return samplesOfBridged(channel);
    if (!lowest) return m_sampler.clip() ? KeyTrack(KeyTrack::Shape::Scalar) : m_sampler.everyFrame(channel);
    KeyTrack track = *lowest;
    FrameGrid const& grid = m_sampler.grid();
    m_out.keysLeftOut += track.eraseRange(-kForever, grid.start() - 1);
    m_out.keysLeftOut += track.eraseRange(grid.end() + grid.period, kForever);
    if (isLayered(channel)) addLayers(track, channel);
    track.deselect(-kForever, kForever);
    return track;
  }

  KeyTrack samplesOfBridged(Controller const& channel) {
    FrameGrid const& frames = m_sampler.grid();
    FrameGrid grid;
    grid.period = channel.getDataPeriod(*m_sampler.clip());
    grid.firstFrame = frames.start() / grid.period;
    grid.count = frames.count * (frames.period / grid.period);
    FrameSampler const sampler(m_out.scene, grid);
    m_out.keysLeftOut += sampler.keysOffGrid(channel);
    return sampler.sampleWhere(sampler.framesWithData(channel), channel);
  }

  double analogRate() const {
    auto const* clip = objectAs<Clip>(m_sampler.clip());
    double const rate = clip ? clip->getFileTime().sampleRate : 0;
    return rate > 0 ? rate : m_out.take.rate;
  }

  bool isLayered(Controller const& channel) const {
    NLEClip const* clip = m_sampler.clip();
    int layers = 0;
    for (int layer = 0; layer < clip->getNumLayers(); ++layer) {
      KeyTrack const* track = channel.findTrack(clip, layer);
      layers += track && !track->empty() ? 1 : 0;
    }
    return layers > 1 || !channel.findTrack(clip, 0) || channel.findTrack(clip, 0)->empty();
  }

  void addLayers(KeyTrack& track, Controller const& channel) const {
    Controller::Values values{};
    for (int64 i = 0; i < track.count(); ++i) {
      int64 const time = track.timeAt(i);
      channel.evaluate(time, values);
      track.set(time, values);
    }
  }

  TakeExport& m_out;
  FrameSampler const& m_sampler;
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
