// The channel names of BVH and the rotation order that a list of them stands for.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace talix {

struct BvhChannel {
  bool isRotation = false;
  int axis = 0;  // 0 x, 1 y, 2 z

  bool operator==(BvhChannel const&) const = default;
};

// In any case; nothing when the name is none of Xposition ... Zrotation.
std::optional<BvhChannel> bvhChannel(std::string_view name);
std::string bvhChannelName(BvhChannel);

// The axes of the rotation channels, in the file's order: the last one turns first.
std::vector<int> rotationAxes(std::vector<BvhChannel> const& channels);

// The axes of rotation orders 0 to 5 (XYZ XZY YXZ YZX ZXY ZYX); the first turns first.
inline constexpr int kOrderAxes[6][3] = {{0, 1, 2}, {0, 2, 1}, {1, 0, 2}, {1, 2, 0}, {2, 0, 1}, {2, 1, 0}};

// The rotation order of channels with these axes. With two axes the missing one comes in the middle and with
// one it comes first, so that angles by this order are the channels' own and never meet gimbal lock. An axis
// given twice counts where it first turns.
int rotationOrderOf(std::vector<int> const& channelAxes);

}  // namespace talix
