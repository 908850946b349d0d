// Videos as tests see them: whole in memory, written and read with FFmpeg's libraries.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

struct VideoFile {
  static constexpr int kWidth = 64, kHeight = 48;
  struct Picture {
    double time = 0;               // seconds
    std::vector<uint8_t> y, u, v;  // full size, a quarter each
    int width = kWidth, height = kHeight;

    double mean(std::vector<uint8_t> const& plane) const;
  };

  std::vector<Picture> pictures;
  int rate = 25, perSeconds = 1;  // rate / perSeconds pictures a second
  std::string timecode;
  std::string sound;      // its codec; empty: none
  size_t soundBytes = 0;  // of the packets
  bool turned = false;    // by a quarter
  int aspect = 1;         // a pixel's width by its height

  // `count` pictures of a colour, each a little brighter, with a white square at its right lower edge.
  static VideoFile plain(int count);
  // As MPEG-4 with sound of two channels that is not compressed; the container goes by the suffix.
  void write(std::string const& path) const;
  static VideoFile read(std::string const& path);
};
