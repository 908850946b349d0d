// A chain of FFmpeg's filters for the pictures, or the sound, of one stream.
#pragma once

#include <initializer_list>
#include <string>

#include "video/Av.h"

namespace talix_video {

struct FilterOption {
  char const* name;
  std::string value;
};

class FilterGraph {
 public:
  // Begins with its source: "buffer" or "abuffer".
  FilterGraph(char const* source, std::initializer_list<FilterOption> options);
  void add(char const* filter, std::initializer_list<FilterOption> options = {});
  // Ends it with "buffersink" or "abuffersink".
  void finish(char const* sink);

  AVFilterContext* getSink() const { return m_last; }
  // Calls use(made) for what it makes of a frame (null: no more come), which is nothing or more.
  template <class Use>
  void run(AVFrame* frame, Use use) {
    push(frame);
    FramePtr made = newFrame();
    while (pull(*made)) {
      use(*made);
      av_frame_unref(made.get());
    }
  }

 private:
  void push(AVFrame* frame);
  bool pull(AVFrame& frame);  // false when it has none for now

  GraphPtr m_graph;
  AVFilterContext* m_first = nullptr;
  AVFilterContext* m_last = nullptr;
};

// Pictures as a stream has them, at the begin of a graph.
FilterGraph pictureGraph(int width, int height, int format, AVRational timeBase, AVRational aspect,
                         AVRational rate);

std::string textOf(AVRational value);

}  // namespace talix_video
