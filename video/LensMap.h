// Takes a lens' distortion out of pictures and its principal point to their centre.
#pragma once

#include <cstdint>
#include <vector>

#include "host/services/VideoJob.h"
#include "video/Av.h"

namespace talix_video {

class LensMap {
 public:
  // The formats that it works on, as the filter "format" takes them.
  static constexpr char const kFormats[] =
      "yuv420p|yuv422p|yuv444p|yuvj420p|yuvj422p|yuvj444p|yuv411p|yuv410p|yuv440p|gray";

  // For pictures of the size and format of `like`.
  LensMap(VideoLens const& lens, bool undistort, bool centre, AVFrame const& like);
  bool fits(AVFrame const& picture) const;
  // A new picture, with what belongs to the old one. Black where the old one shows nothing.
  FramePtr apply(AVFrame const& picture) const;

 private:
  // Where a pixel comes from, in 1/256 of a pixel from the first one's centre.
  struct Place {
    int32_t x, y;
  };
  struct Plane {
    int width = 0, height = 0;
    std::vector<Place> places;
  };
  Plane planeOf(VideoLens const& lens, bool undistort, bool centre, int log2x, int log2y) const;
  static void applyTo(Plane const& plane, uint8_t const* from, int fromStride, uint8_t* to, int toStride,
                      uint8_t black);

  int m_width, m_height, m_format;
  Plane m_luma, m_chroma;
};

}  // namespace talix_video
