#include "dehaze_video.h"

#include <algorithm>
#include <cmath>
#include <deque>
#include <iterator>
#include <limits>
#include <optional>
#include <string>
#include <utility>

#include "bounded_queue.h"
#include "errors.h"
#include "frame_path.h"
#include "interrupt.h"
#include "media/color_convert.h"
#include "media/filter_pipe.h"
#include "media/orientation.h"
#include "media/writer_video.h"
#include "output_file.h"
#include "progress.h"
#include "stage_threads.h"

namespace dehaze {
namespace {

void note_what_is_lost(const Reader& reader, const FrameSize& size, OutputKind kind,
                       Console& console) {
  if (!is_frames_only(kind)) {
    if (size.is_padded()) {
      console.note("H.264 needs an even size; the last column or row is repeated, giving " +
                   std::to_string(size.padded_width()) + " x " +
                   std::to_string(size.padded_height()));
    }
    return;
  }
  const std::string name = kind == OutputKind::kY4m ? "Y4M holds" : "raw frames hold";
  if (!reader.companions().empty()) {
    console.note(name + " no audio or subtitles; they are left out");
  }
  if (!reader.has_constant_rate()) {
    console.note(name + " no time stamps; all frames become equally long");
  }
}

// By which the pixels have to be turned, because the output cannot tell the player to do it.
Orientation turn_for(const Reader& reader, OutputKind kind) {
  const int32_t* matrix = display_matrix(reader.video());
  return matrix == nullptr || stores_rotation(kind) ? Orientation() : orientation_of_matrix(matrix);
}

VideoFormat format_before_turn(const Reader& reader, const AVFrame& first, const FramePath& path,
                               OutputKind kind) {
  const FrameSize& size = path.size();
  const bool even_only = !is_frames_only(kind);
  VideoFormat format = video_format_like(first, path.siting());
  format.width = even_only ? size.padded_width() : size.visible_width;
  format.height = even_only ? size.padded_height() : size.visible_height;
  format.sample_aspect_ratio = reader.sample_aspect_ratio(first);
  return format;
}

// Of so many frames, in AV_TIME_BASE units; INT64_MAX if there is no limit or it is unknown.
int64_t length_of(int64_t frames, double frames_per_second) {
  if (frames == 0 || frames_per_second <= 0) return std::numeric_limits<int64_t>::max();
  return std::llround(static_cast<double>(frames) / frames_per_second * AV_TIME_BASE);
}

VideoFormat turned(VideoFormat format, const Orientation& turn) {
  if (turn.transposed) {
    std::swap(format.width, format.height);
    if (format.sample_aspect_ratio.num > 0) {
      std::swap(format.sample_aspect_ratio.num, format.sample_aspect_ratio.den);
    }
  }
  return format;
}

// A frame on its way, with the packets that were read along with it.
struct Shot {
  FramePtr frame;
  std::deque<PacketPtr> companions;
};

Shot take_shot(Reader& reader, FramePtr frame) {
  Shot shot = {std::move(frame), {}};
  shot.companions.swap(reader.pending());
  return shot;
}

// Large frames wait in shorter queues.
size_t queue_length(const AVFrame& frame) {
  constexpr int64_t kMostBytes = 64 << 20;
  constexpr int64_t kMostFrames = 4;
  const int64_t bytes = int64_t{frame.width} * frame.height * 3 / 2;
  return static_cast<size_t>(std::clamp<int64_t>(kMostBytes / bytes, 1, kMostFrames));
}

// Takes the haze out of one frame after the other.
class Dehazer {
 public:
  Dehazer(FramePath& path, const VideoFormat& format, const Orientation& turn)
      : path_(path),
        from_nv21_(format.width, format.height, path.siting(), format.samples),
        turn_(turn) {}

  FramePtr run(const AVFrame& input) {
    FramePtr output = from_nv21_.convert(path_.run(input));
    if (!turn_.is_upright()) {
      if (!turner_) turner_.emplace(*output, turn_.filter());
      output = turner_->run(*output);
    }
    output->pts = input.pts;
    output->pkt_duration = input.pkt_duration;
    return output;
  }

 private:
  FramePath& path_;
  FromNv21 from_nv21_;
  Orientation turn_;
  std::optional<FilterPipe> turner_;
};

// Decodes, dehazes and encodes up to `limit` frames at the same time; the first one is decoded
// already. Returns their number. What was read along with them and not written yet is left in
// `companions`.
int64_t run_stages(Reader& reader, FramePtr first, int64_t limit, Dehazer& dehazer,
                   VideoWriter& writer, Progress& progress, std::deque<PacketPtr>& companions) {
  BoundedQueue<Shot> decoded(queue_length(*first));
  BoundedQueue<Shot> dehazed(queue_length(*first));
  int64_t frames = 0;
  StageThreads stages([&] {
    decoded.cancel();
    dehazed.cancel();
  });
  stages.start([&] {
    FramePtr frame = std::move(first);
    while (decoded.push(take_shot(reader, std::move(frame)))) {
      frame = make_frame();
      if (++frames == limit || !reader.read_frame(frame.get())) break;
    }
    decoded.close();
  });
  stages.start([&] {
    while (std::optional<Shot> shot = decoded.pop()) {
      shot->frame = dehazer.run(*shot->frame);
      // Here, because this stage is the only one that may have notes for the console.
      progress.advance();
      if (!dehazed.push(std::move(*shot))) return;
    }
    dehazed.close();
  });
  stages.start([&] {
    while (std::optional<Shot> shot = dehazed.pop()) {
      std::move(shot->companions.begin(), shot->companions.end(), std::back_inserter(companions));
      writer.write(*shot->frame, shot->frame->pkt_duration, companions);
    }
  });
  stages.join();
  return frames;
}

}  // namespace

Outcome dehaze_video(Reader& reader, const Options& options, Console& console) {
  const OutputKind kind = options.output_kind;
  FramePtr first = make_frame();
  if (!reader.read_frame(first.get())) throw Error(reader.path() + ": holds no video");

  FramePath path(*first, source_of(reader, *first), options.engine, console);
  note_what_is_lost(reader, path.size(), kind, console);
  const Orientation turn = turn_for(reader, kind);
  VideoFormat format = format_before_turn(reader, *first, path, kind);
  format.raw_layout = options.raw_output;
  format.longest = length_of(options.max_frames, frames_per_second(reader));
  Dehazer dehazer(path, format, turn);

  std::optional<OutputFile> file;
  if (options.output != "-") file.emplace(options.output, options.force);
  const VideoFormat output_format = turned(format, turn);
  // Declared after the file, so that it is closed before the file is removed.
  VideoWriter writer(kind, file ? file->temporary_path() : options.output, reader, output_format);
  for (const std::string& text : writer.left_out()) console.note(text);

  const int64_t limit =
      options.max_frames > 0 ? options.max_frames : std::numeric_limits<int64_t>::max();
  const int64_t expected = reader.frame_count();
  Progress progress(console, "frames",
                    expected > 0 || options.max_frames > 0
                        ? std::min(limit, expected > 0 ? expected : limit)
                        : 0);
  std::deque<PacketPtr> companions;
  const int64_t frames =
      run_stages(reader, std::move(first), limit, dehazer, writer, progress, companions);

  int64_t last = std::numeric_limits<int64_t>::max();
  if (frames == limit) {
    last = writer.end();
    if (!is_frames_only(kind)) reader.read_companions_until(last);
  }
  std::move(reader.pending().begin(), reader.pending().end(), std::back_inserter(companions));
  reader.pending().clear();
  writer.finish(companions, last);
  throw_if_interrupted();
  if (file) file->commit();
  return {path.engine().report(), output_format.width, output_format.height, frames};
}

}  // namespace dehaze
