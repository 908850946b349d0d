#include "video/LensMap.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace talix_video {

namespace {

constexpr int32_t kNowhere = std::numeric_limits<int32_t>::min();
constexpr int kUnit = 256;

double radial(VideoLens const& lens, double r2) { return 1 + r2 * (lens.k1 + r2 * (lens.k2 + r2 * lens.k3)); }

// The square of the radius up to which rays further out are seen further out. Beyond, the polynomial folds
// back and would show the picture a second time.
double greatestRadius2(VideoLens const& lens, double most2) {
  constexpr int kSteps = 4096;
  for (int i = 0; i <= kSteps; ++i) {
    double const r2 = most2 * i / kSteps;
    if (1 + r2 * (3 * lens.k1 + r2 * (5 * lens.k2 + r2 * 7 * lens.k3)) <= 0) return r2;
  }
  return most2;
}

}  // namespace

LensMap::LensMap(VideoLens const& lens, bool undistort, bool centre, AVFrame const& like)
    : m_width(like.width), m_height(like.height), m_format(like.format) {
  AVPixFmtDescriptor const* format = av_pix_fmt_desc_get(static_cast<AVPixelFormat>(like.format));
  m_luma = planeOf(lens, undistort, centre, 0, 0);
  if (format->nb_components > 1)
    m_chroma = planeOf(lens, undistort, centre, format->log2_chroma_w, format->log2_chroma_h);
}

bool LensMap::fits(AVFrame const& picture) const {
  return picture.width == m_width && picture.height == m_height && picture.format == m_format;
}

LensMap::Plane LensMap::planeOf(VideoLens const& lens, bool undistort, bool centre, int log2x,
                                int log2y) const {
  Plane plane{AV_CEIL_RSHIFT(m_width, log2x), AV_CEIL_RSHIFT(m_height, log2y), {}};
  plane.places.reserve(static_cast<size_t>(plane.width) * static_cast<size_t>(plane.height));
  double const scaleX = 1 << log2x, scaleY = 1 << log2y;
  double const moveX = centre ? lens.cx - m_width / 2.0 : 0, moveY = centre ? lens.cy - m_height / 2.0 : 0;
  double const farX = std::max(std::abs(lens.cx), std::abs(m_width - lens.cx)) + std::abs(moveX);
  double const farY = std::max(std::abs(lens.cy), std::abs(m_height - lens.cy)) + std::abs(moveY);
  double const most2 =
      greatestRadius2(lens, (farX / lens.fx) * (farX / lens.fx) + (farY / lens.fy) * (farY / lens.fy));
  for (int row = 0; row < plane.height; ++row) {
    for (int column = 0; column < plane.width; ++column) {
      // From here on in pixels of the whole picture, from its corner; a pixel's centre is at its half.
      double x = (column + 0.5) * scaleX + moveX, y = (row + 0.5) * scaleY + moveY;
      bool seen = true;
      if (undistort) {
        double const u = (x - lens.cx) / lens.fx, v = (y - lens.cy) / lens.fy, r2 = u * u + v * v;
        seen = r2 <= most2;
        double const stretch = radial(lens, r2);
        x = lens.cx + lens.fx * (u * stretch + 2 * lens.p1 * u * v + lens.p2 * (r2 + 2 * u * u));
        y = lens.cy + lens.fy * (v * stretch + lens.p1 * (r2 + 2 * v * v) + 2 * lens.p2 * u * v);
      }
      seen = seen && x >= 0 && x <= m_width && y >= 0 && y <= m_height;
      auto const place = [](double at) { return static_cast<int32_t>(std::lround((at - 0.5) * kUnit)); };
      plane.places.push_back(seen ? Place{place(x / scaleX), place(y / scaleY)} : Place{kNowhere, kNowhere});
    }
  }
  return plane;
}

FramePtr LensMap::apply(AVFrame const& picture) const {
  FramePtr made = newFrame();
  made->format = picture.format;
  made->width = picture.width;
  made->height = picture.height;
  check(av_frame_get_buffer(made.get(), 0), "no room for a picture");
  check(av_frame_copy_props(made.get(), &picture), "no room for a picture");
  auto const format = static_cast<AVPixelFormat>(picture.format);
  bool const full = picture.color_range == AVCOL_RANGE_JPEG || format == AV_PIX_FMT_YUVJ420P ||
                    format == AV_PIX_FMT_YUVJ422P || format == AV_PIX_FMT_YUVJ444P ||
                    format == AV_PIX_FMT_GRAY8;
  applyTo(m_luma, picture.data[0], picture.linesize[0], made->data[0], made->linesize[0], full ? 0 : 16);
  for (int i = 1; i <= 2 && !m_chroma.places.empty(); ++i)
    applyTo(m_chroma, picture.data[i], picture.linesize[i], made->data[i], made->linesize[i], 128);
  return made;
}

void LensMap::applyTo(Plane const& plane, uint8_t const* from, int fromStride, uint8_t* to, int toStride,
                      uint8_t black) {
  Place const* place = plane.places.data();
  int const right = plane.width - 1, bottom = plane.height - 1;
  for (int row = 0; row < plane.height; ++row, to += toStride) {
    for (int column = 0; column < plane.width; ++column, ++place) {
      if (place->x == kNowhere) {
        to[column] = black;
        continue;
      }
      int const x = std::clamp(place->x, 0, right * kUnit), y = std::clamp(place->y, 0, bottom * kUnit);
      int const x0 = x / kUnit, x1 = std::min(x0 + 1, right), partX = x % kUnit;
      int const y0 = y / kUnit, y1 = std::min(y0 + 1, bottom), partY = y % kUnit;
      uint8_t const* upper = from + static_cast<ptrdiff_t>(y0) * fromStride;
      uint8_t const* lower = from + static_cast<ptrdiff_t>(y1) * fromStride;
      int const above = upper[x0] * (kUnit - partX) + upper[x1] * partX;
      int const below = lower[x0] * (kUnit - partX) + lower[x1] * partX;
      to[column] = static_cast<uint8_t>((above * (kUnit - partY) + below * partY + kUnit * kUnit / 2) /
                                        (kUnit * kUnit));
    }
  }
}

}  // namespace talix_video
