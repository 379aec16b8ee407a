#include "media/filter_pipe.h"

extern "C" {
#include <libavfilter/buffersink.h>
#include <libavfilter/buffersrc.h>
#include <libavutil/mem.h>
#include <libavutil/pixdesc.h>
}

#include "errors.h"
#include "media/av_error.h"

namespace dehaze {
namespace {

struct FreeInOut {
  void operator()(AVFilterInOut* list) const { avfilter_inout_free(&list); }
};

// Parses the description and ties its loose ends to the buffer source and sink.
void parse_graph(AVFilterGraph* graph, const std::string& description, AVFilterContext* source,
                 AVFilterContext* sink) {
  std::unique_ptr<AVFilterInOut, FreeInOut> first(avfilter_inout_alloc());
  std::unique_ptr<AVFilterInOut, FreeInOut> last(avfilter_inout_alloc());
  if (!first || !last) throw std::bad_alloc();
  // "in" and "out" are the names that the parser gives to unnamed ends.
  first->name = av_strdup("in");
  first->filter_ctx = source;
  last->name = av_strdup("out");
  last->filter_ctx = sink;
  AVFilterInOut* outputs = first.release();
  AVFilterInOut* inputs = last.release();
  const int result =
      avfilter_graph_parse_ptr(graph, description.c_str(), &inputs, &outputs, nullptr);
  first.reset(outputs);
  last.reset(inputs);
  check(result, "cannot build the filter " + description);
}

}  // namespace

FilterPipe::FilterPipe(const AVFrame& like, const std::string& description)
    : graph_(avfilter_graph_alloc()) {
  if (!graph_) throw std::bad_alloc();
  // For the scaler that the graph puts in where two filters have no pixel format in common.
  graph_->scale_sws_opts = av_strdup("flags=bicubic+accurate_rnd+full_chroma_int+full_chroma_inp");
  // The time base has no effect: time stamps pass by the filters.
  const std::string arguments =
      "width=" + std::to_string(like.width) + ":height=" + std::to_string(like.height) +
      ":pix_fmt=" + std::to_string(like.format) + ":time_base=1/1:sar=1/1";
  check(avfilter_graph_create_filter(&source_, avfilter_get_by_name("buffer"), "in",
                                     arguments.c_str(), nullptr, graph_.get()),
        "cannot set up colour conversion");
  check(avfilter_graph_create_filter(&sink_, avfilter_get_by_name("buffersink"), "out", nullptr,
                                     nullptr, graph_.get()),
        "cannot set up colour conversion");
  parse_graph(graph_.get(), description, source_, sink_);
  check(avfilter_graph_config(graph_.get(), nullptr), "cannot convert these colours");
}

FramePtr FilterPipe::run(const AVFrame& frame) {
  FramePtr input = make_frame();
  check(av_frame_ref(input.get(), &frame), "cannot allocate a frame");
  // Whether a frame is part of an interlaced pair, and how its pixels are stretched, must not
  // change the way it is filtered.
  input->interlaced_frame = 0;
  input->sample_aspect_ratio = AVRational{1, 1};
  check(av_buffersrc_add_frame(source_, input.get()), "cannot convert colours");
  FramePtr output = make_frame();
  check(av_buffersink_get_frame(sink_, output.get()), "cannot convert colours");
  return output;
}

FramePtr run_filter(const AVFrame& frame, const std::string& description) {
  FilterPipe pipe(frame, description);
  return pipe.run(frame);
}

}  // namespace dehaze
