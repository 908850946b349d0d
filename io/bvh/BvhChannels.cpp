#include "io/bvh/BvhChannels.h"

#include <algorithm>
#include <iterator>

#include "io/TextScanner.h"

namespace talix {

std::optional<BvhChannel> bvhChannel(std::string_view name) {
  if (name.empty()) return std::nullopt;
  std::string_view const kind = name.substr(1);
  bool const isRotation = equalsIgnoringCase(kind, "rotation");
  if (!isRotation && !equalsIgnoringCase(kind, "position")) return std::nullopt;
  switch (name[0]) {
    case 'X':
    case 'x':
      return BvhChannel{isRotation, 0};
    case 'Y':
    case 'y':
      return BvhChannel{isRotation, 1};
    case 'Z':
    case 'z':
      return BvhChannel{isRotation, 2};
    default:
      return std::nullopt;
  }
}

std::string bvhChannelName(BvhChannel channel) {
  return std::string(1, "XYZ"[channel.axis]) + (channel.isRotation ? "rotation" : "position");
}

std::vector<int> rotationAxes(std::vector<BvhChannel> const& channels) {
  std::vector<int> axes;
  for (BvhChannel const& channel : channels)
    if (channel.isRotation) axes.push_back(channel.axis);
  return axes;
}

int rotationOrderOf(std::vector<int> const& channelAxes) {
  std::vector<int> axes;
  auto const add = [&](int axis) {
    if (std::find(axes.begin(), axes.end(), axis) == axes.end()) axes.push_back(axis);
  };
  std::for_each(channelAxes.rbegin(), channelAxes.rend(), add);
  bool const twoGiven = axes.size() == 2;
  for (int axis = 0; axis < 3; ++axis) add(axis);
  if (twoGiven) std::swap(axes[1], axes[2]);
  auto const order = std::find_if(std::begin(kOrderAxes), std::end(kOrderAxes), [&](int const(&of)[3]) {
    return std::equal(axes.begin(), axes.end(), of);
  });
  return static_cast<int>(order - std::begin(kOrderAxes));
}

}  // namespace talix
