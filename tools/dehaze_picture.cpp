#include "dehaze_picture.h"

#include "errors.h"
#include "frame_path.h"
#include "interrupt.h"
#include "media/av_error.h"
#include "media/exif.h"
#include "media/filter_pipe.h"
#include "media/orientation.h"
#include "media/transparency.h"
#include "media/writer_picture.h"
#include "output_file.h"
#include "picture_result.h"
#include "progress.h"

namespace dehaze {
namespace {

void copy_icc_profile(const AVFrame& from, AVFrame* to) {
  const AVFrameSideData* profile = av_frame_get_side_data(&from, AV_FRAME_DATA_ICC_PROFILE);
  if (profile == nullptr) return;
  AVFrameSideData* copy =
      av_frame_new_side_data_from_buf(to, profile->type, av_buffer_ref(profile->buf));
  if (copy == nullptr) throw std::bad_alloc();
}

Bytes exif_for(const Reader& reader, const AVFrame& picture, OutputKind kind, Console& console) {
  if (!reader.is_picture()) return {};
  Bytes exif = read_exif(reader.path());
  if (exif.empty()) return {};
  if (!make_exif_upright(exif, picture.width, picture.height)) {
    console.note("the camera data (EXIF) is damaged; it is left out");
    return {};
  }
  if (kind == OutputKind::kJpeg && exif.size() > kLargestJpegExif) {
    console.note("the camera data (EXIF) is too long for JPEG; it is left out");
    return {};
  }
  return exif;
}

}  // namespace

Outcome dehaze_picture(Reader& reader, const Options& options, Console& console) {
  StepProgress progress(console, 4);
  progress.begin("reading");
  const FramePtr frame = make_frame();
  if (!reader.read_frame(frame.get())) throw Error(reader.path() + ": holds no picture");

  const Orientation orientation = orientation_of(reader.video(), *frame);
  FramePath path(*frame, source_of(reader, *frame), options.engine, console);
  const FrameSize& size = path.size();
  if (keeps_fine_color(path, *frame)) path.keep_input();
  progress.begin("taking the haze out");
  path.run(*frame);

  progress.begin("converting the result");
  OutputSamples samples = picture_samples(options.output_kind, path.siting());
  // Turning a 4:2:0 picture of an odd size would put its chroma half a sample off.
  const bool is_moved = size.is_padded() && !orientation.is_upright();
  if (samples.format == AV_PIX_FMT_YUVJ420P && (keeps_fine_color(path, *frame) || is_moved)) {
    samples.format = AV_PIX_FMT_YUVJ444P;
  }
  FramePtr picture = after_in(path, *frame, samples);

  const FramePtr alpha = take_alpha(*frame, size.visible_width, size.visible_height);
  if (alpha && options.output_kind == OutputKind::kJpeg) {
    console.note("JPEG has no transparency; it is left out");
  } else if (alpha) {
    picture = with_alpha(*picture, *alpha);
  }
  if (!orientation.is_upright()) picture = run_filter(*picture, orientation.filter());
  copy_icc_profile(*frame, picture.get());
  const Bytes exif = exif_for(reader, *picture, options.output_kind, console);

  throw_if_interrupted();
  progress.begin("writing");
  OutputFile file(options.output, options.force);
  write_picture(*picture, options.output_kind, file.temporary_path(), exif);
  throw_if_interrupted();
  file.commit();
  return {path.engine().report(), picture->width, picture->height, 1};
}

}  // namespace dehaze
