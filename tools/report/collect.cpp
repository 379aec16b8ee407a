#include "report/collect.h"

#include <algorithm>
#include <filesystem>
#include <limits>
#include <memory>
#include <numeric>

#include "errors.h"
#include "frame_path.h"
#include "interrupt.h"
#include "media/reader.h"
#include "progress.h"
#include "report/gallery.h"
#include "report/reference.h"
#include "report/view_maker.h"

namespace dehaze {
namespace {

// A report may be passed on: folders are nobody's business.
std::string shown_name(const std::string& path) {
  return path == "-" ? "standard input" : std::filesystem::path(path).filename().string();
}

double mean_luma(const Nv21Frame& nv21) {
  const auto begin = nv21.bytes.begin();
  const int64_t pixels = int64_t{nv21.width} * nv21.height;
  return static_cast<double>(std::accumulate(begin, begin + pixels, int64_t{0})) /
         static_cast<double>(pixels);
}

// When frames are shown, in seconds from the first one.
class Timeline {
 public:
  explicit Timeline(const Reader& reader)
      : rate_(frames_per_second(reader)), base_(av_q2d(reader.video().time_base)) {}

  double seconds(const AVFrame& frame, int64_t number) {
    if (number == 0) first_ = frame.pts;
    has_stamps_ = has_stamps_ && frame.pts != AV_NOPTS_VALUE;
    if (has_stamps_) return static_cast<double>(frame.pts - first_) * base_;
    return rate_ > 0 ? static_cast<double>(number) / rate_ : static_cast<double>(number);
  }
  bool has_times() const { return has_stamps_ || rate_ > 0; }

 private:
  double rate_;
  double base_;
  int64_t first_ = 0;
  bool has_stamps_ = true;
};

int64_t expected_frames(const Reader& reader, int64_t limit) {
  if (reader.is_picture()) return 1;
  const int64_t count = reader.frame_count();
  if (count > 0) return std::min(count, limit);
  return limit == std::numeric_limits<int64_t>::max() ? 0 : limit;
}

// Sends frames through an engine and keeps what the page shows of them.
class Collector {
 public:
  Collector(const ReportOptions& options, const Reader& reader, const AVFrame& first,
            int64_t expected_frames, Console& console)
      : path_(first, source_of(reader, first), options.engine, console),
        view_maker_(reader, first),
        gallery_(expected_frames),
        timeline_(reader) {
    path_.keep_input();
    if (!options.reference.empty())
      reference_ = std::make_unique<Reference>(options.reference, reader.is_picture());
  }

  void add(const AVFrame& frame) {
    if (reference_) reference_->advance();
    path_.run(frame);
    const double seconds = timeline_.seconds(frame, frames_);
    if (gallery_.wants(frames_)) {
      View view = view_maker_.make(path_, frame, reference_.get());
      view.frame = frames_;
      view.seconds = seconds;
      gallery_.add(std::move(view));
    }
    moments_.push_back(
        {seconds, path_.engine().findings(), mean_luma(path_.input()), mean_luma(path_.result())});
    ++frames_;
  }

  void finish(ReportData& data) {
    data.size = path_.size();
    data.frames = frames_;
    data.has_times = timeline_.has_times();
    data.run = path_.engine().report();
    data.views = gallery_.take();
    data.moments = std::move(moments_);
  }

 private:
  FramePath path_;
  ViewMaker view_maker_;
  Gallery gallery_;
  Timeline timeline_;
  std::unique_ptr<Reference> reference_;
  int64_t frames_ = 0;
  std::vector<Moment> moments_;
};

}  // namespace

ReportData collect_report(const ReportOptions& options, Console& console) {
  Reader reader(options.input, options.raw_input);
  const bool is_picture = reader.is_picture();
  StepProgress steps(console, 2);
  if (is_picture) steps.begin("reading");
  const FramePtr frame = make_frame();
  if (!reader.read_frame(frame.get())) throw Error(reader.path() + ": holds no picture");

  ReportData data;
  data.input_name = shown_name(options.input);
  if (!options.reference.empty()) data.reference_name = shown_name(options.reference);
  data.is_picture = is_picture;
  data.options = options.engine;
  data.engine = choose_engine(options.engine, frame->width, frame->height, is_picture);

  const int64_t limit = is_picture               ? 1
                        : options.max_frames > 0 ? options.max_frames
                                                 : std::numeric_limits<int64_t>::max();
  const int64_t expected = expected_frames(reader, limit);
  Collector collector(options, reader, *frame, expected, console);
  Progress progress(console, "frames", expected);
  if (is_picture) steps.begin("taking the haze out and measuring");
  int64_t frames = 0;
  do {
    collector.add(*frame);
    reader.pending().clear();
    if (!is_picture) progress.advance();
    throw_if_interrupted();
  } while (++frames < limit && reader.read_frame(frame.get()));
  collector.finish(data);
  data.notes = console.notes();
  return data;
}

}  // namespace dehaze
