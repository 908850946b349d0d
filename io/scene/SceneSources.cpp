#include "io/scene/SceneSources.h"

#include <algorithm>
#include <optional>

#include "host/scene/SceneReader.h"

namespace talix {

namespace {

class ChannelSource final : public SampleSource {
 public:
  ChannelSource(FrameSamplerPtr sampler, Controller const& channel, std::vector<Controller const*> measured,
                std::function<void(double*)> then)
      : m_sampler(std::move(sampler)),
        m_channel(channel),
        m_measured(std::move(measured)),
        m_then(std::move(then)) {}

  void read(SampleTimes const& times, double* values, bool* known) override {
    m_sampler->sample(m_channel, times, values);
    std::fill_n(known, times.count(), true);
    for (Controller const* channel : m_measured) m_sampler->markGaps(*channel, times, known);
    if (!m_then) return;
    auto const width = static_cast<int64>(Controller::shapeOf(m_channel.getPropertyType()));
    for (int64 i = 0; i < times.count(); ++i) m_then(values + i * width);
  }

 private:
  FrameSamplerPtr m_sampler;
  Controller const& m_channel;
  std::vector<Controller const*> m_measured;
  std::function<void(double*)> m_then;
};

}  // namespace

SampleSourcePtr channelSource(FrameSamplerPtr sampler, Controller const& channel,
                              std::vector<Controller const*> measured, std::function<void(double*)> then) {
  return std::make_unique<ChannelSource>(std::move(sampler), channel, std::move(measured), std::move(then));
}

// One block of all nodes, with the reader made when the first is asked for.
class WorldSources::Block {
 public:
  explicit Block(FrameSamplerPtr sampler) : m_sampler(std::move(sampler)) {}

  FrameSampler const& sampler() const { return *m_sampler; }

  size_t add(Node const& node, bool turns) {
    m_turns = m_turns || turns;
    if (m_nodes.empty() || m_nodes.back() != &node) m_nodes.push_back(&node);
    return m_nodes.size() - 1;
  }

  void read(SampleTimes const& times) {
    if (times.count() == m_count && times[0] == m_start && times.period() == m_period) return;
    if (!m_reader) m_reader.emplace(m_nodes, m_sampler->shown());
    auto const values = static_cast<size_t>(times.count()) * m_nodes.size();
    m_positions.resize(3 * values);
    if (m_turns) m_rotations.resize(4 * values);
    m_reader->readWorld(
        times, {.positions = m_positions.data(), .rotations = m_turns ? m_rotations.data() : nullptr});
    m_start = times[0];
    m_period = times.period();
    m_count = times.count();
  }

  // The values of one node, `width` (3: positions, 4: rotations) doubles for each time of the block.
  void copy(size_t node, size_t width, double* values) const {
    std::vector<double> const& all = width == 3 ? m_positions : m_rotations;
    for (size_t i = 0; i < static_cast<size_t>(m_count); ++i)
      std::copy_n(all.data() + (i * m_nodes.size() + node) * width, width, values + i * width);
  }

 private:
  FrameSamplerPtr m_sampler;
  std::vector<Node const*> m_nodes;
  bool m_turns = false;  // whether anybody asks for rotations
  std::optional<SceneReader> m_reader;
  std::vector<double> m_positions, m_rotations;
  int64 m_start = 0, m_period = 0, m_count = 0;  // the times that they hold
};

class WorldSources::Source final : public SampleSource {
 public:
  Source(std::shared_ptr<Block> block, size_t node, size_t width, Controller const* measured)
      : m_block(std::move(block)), m_node(node), m_width(width), m_measured(measured) {}

  void read(SampleTimes const& times, double* values, bool* known) override {
    if (times.count() == 0) return;
    m_block->read(times);
    m_block->copy(m_node, m_width, values);
    std::fill_n(known, times.count(), true);
    if (m_measured) m_block->sampler().markGaps(*m_measured, times, known);
  }

 private:
  std::shared_ptr<Block> m_block;
  size_t m_node, m_width;
  Controller const* m_measured;
};

WorldSources::WorldSources(FrameSamplerPtr sampler) : m_block(std::make_shared<Block>(std::move(sampler))) {}

SampleSourcePtr WorldSources::positions(Node const& node, Controller const* measured) {
  return std::make_unique<Source>(m_block, m_block->add(node, false), 3, measured);
}

SampleSourcePtr WorldSources::rotations(Node const& node) {
  return std::make_unique<Source>(m_block, m_block->add(node, true), 4, nullptr);
}

}  // namespace talix
