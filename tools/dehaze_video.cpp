#include "dehaze_video.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <optional>
#include <string>
#include <utility>

#include "errors.h"
#include "frame_path.h"
#include "interrupt.h"
#include "media/color_convert.h"
#include "media/filter_pipe.h"
#include "media/orientation.h"
#include "media/writer_video.h"
#include "output_file.h"
#include "progress.h"

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

}  // namespace

Outcome dehaze_video(Reader& reader, const Options& options, Console& console) {
  const OutputKind kind = options.output_kind;
  const FramePtr input = make_frame();
  if (!reader.read_frame(input.get())) throw Error(reader.path() + ": holds no video");

  FramePath path(*input, false, frames_per_second(reader), options.engine, console);
  note_what_is_lost(reader, path.size(), kind, console);
  const Orientation turn = turn_for(reader, kind);
  VideoFormat format = format_before_turn(reader, *input, path, kind);
  format.raw_layout = options.raw_output;
  format.longest = length_of(options.max_frames, frames_per_second(reader));
  FromNv21 from_nv21(format.width, format.height, path.siting(), format.samples);
  std::optional<FilterPipe> turner;

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
  int64_t frames = 0;
  do {
    FramePtr output = from_nv21.convert(path.run(*input));
    if (!turn.is_upright()) {
      if (!turner) turner.emplace(*output, turn.filter());
      output = turner->run(*output);
    }
    output->pts = input->pts;
    writer.write(*output, input->pkt_duration, reader.pending());
    progress.advance();
  } while (++frames < limit && reader.read_frame(input.get()));

  int64_t last = std::numeric_limits<int64_t>::max();
  if (frames == limit) {
    last = writer.end();
    if (!is_frames_only(kind)) reader.read_companions_until(last);
  }
  writer.finish(reader.pending(), last);
  throw_if_interrupted();
  if (file) file->commit();
  return {path.engine().report(), output_format.width, output_format.height, frames};
}

}  // namespace dehaze
