#include "video/FilterGraph.h"

namespace talix_video {

FilterGraph::FilterGraph(char const* source, std::initializer_list<FilterOption> options)
    : m_graph(owned<GraphPtr>(avfilter_graph_alloc())) {
  add(source, options);
  m_first = m_last;
}

void FilterGraph::add(char const* filter, std::initializer_list<FilterOption> options) {
  std::string const cannot = std::string("the filter ") + filter + " cannot be used";
  AVFilter const* kind = avfilter_get_by_name(filter);
  if (!kind) throw VideoError(cannot + ": FFmpeg has none");
  AVFilterContext* added = avfilter_graph_alloc_filter(m_graph.get(), kind, nullptr);
  if (!added) throw std::bad_alloc();
  // Set one by one: within one text the values would have to be quoted.
  for (FilterOption const& option : options)
    check(av_opt_set(added, option.name, option.value.c_str(), AV_OPT_SEARCH_CHILDREN), cannot);
  check(avfilter_init_str(added, nullptr), cannot);
  if (m_last) check(avfilter_link(m_last, 0, added, 0), cannot);
  m_last = added;
}

void FilterGraph::finish(char const* sink) {
  add(sink);
  check(avfilter_graph_config(m_graph.get(), nullptr), "the filters do not go together");
}

void FilterGraph::push(AVFrame* frame) {
  check(av_buffersrc_add_frame_flags(m_first, frame, AV_BUFFERSRC_FLAG_KEEP_REF), "the filters fail");
}

bool FilterGraph::pull(AVFrame& frame) {
  int const result = av_buffersink_get_frame(m_last, &frame);
  if (result == AVERROR(EAGAIN) || result == AVERROR_EOF) return false;
  check(result, "the filters fail");
  return true;
}

FilterGraph pictureGraph(int width, int height, int format, AVRational timeBase, AVRational aspect,
                         AVRational rate) {
  return FilterGraph("buffer", {{"video_size", std::to_string(width) + "x" + std::to_string(height)},
                                {"pix_fmt", std::to_string(format)},
                                {"time_base", textOf(timeBase)},
                                {"pixel_aspect", textOf(aspect.num > 0 ? aspect : AVRational{0, 1})},
                                {"frame_rate", textOf(rate)}});
}

std::string textOf(AVRational value) { return std::to_string(value.num) + "/" + std::to_string(value.den); }

}  // namespace talix_video
