#include "media/writer_video.h"

extern "C" {
#include <libavutil/avutil.h>
#include <libavutil/pixdesc.h>
}

#include <algorithm>
#include <cstring>

#include "errors.h"
#include "interrupt.h"
#include "media/av_error.h"
#include "media/metadata.h"
#include "media/orientation.h"
#include "media/raw_frames.h"

namespace dehaze {
namespace {

// Visually close to the input; the haze removal brings out texture that would cost a smaller file
// its detail first.
constexpr const char* kQuality = "18";
constexpr const char* kSpeed = "fast";
constexpr AVRational kUsualFrameRate = {25, 1};  // where a Y4M header needs one and none is known

const char* container_name(OutputKind kind) {
  switch (kind) {
    case OutputKind::kMp4:
      return "mp4";
    case OutputKind::kMov:
      return "mov";
    case OutputKind::kMkv:
      return "matroska";
    case OutputKind::kY4m:
      return "yuv4mpegpipe";
    case OutputKind::kRaw:
      return "rawvideo";
    default:
      throw Error("internal error: not a kind of video");
  }
}

const char* encoder_name(OutputKind kind) {
  switch (kind) {
    case OutputKind::kY4m:
      return "wrapped_avframe";
    case OutputKind::kRaw:
      return "rawvideo";
    default:
      return "libx264";
  }
}

int stop_waiting(void*) { return is_stopping(); }

void copy_display_matrix(const AVStream& from, AVStream* to) {
  const int32_t* matrix = display_matrix(from);
  if (matrix == nullptr) return;
  constexpr size_t kBytes = 9 * sizeof(int32_t);
  uint8_t* copy = av_stream_new_side_data(to, AV_PKT_DATA_DISPLAYMATRIX, kBytes);
  if (copy == nullptr) throw std::bad_alloc();
  std::memcpy(copy, matrix, kBytes);
}

}  // namespace

VideoFormat video_format_like(const AVFrame& frame, AVChromaLocation siting) {
  SampleMeaning meaning = meaning_of(frame, false);
  VideoFormat format = {};
  format.width = frame.width;
  format.height = frame.height;
  format.primaries = frame.color_primaries;
  format.transfer = frame.color_trc;
  format.sample_aspect_ratio = frame.sample_aspect_ratio;
  if (meaning.matrix == AVCOL_SPC_RGB) {
    meaning = {AVCOL_RANGE_MPEG, guessed_video_matrix(frame.width, frame.height), siting};
    format.range = meaning.range;
    format.matrix = meaning.matrix;
  } else {
    // Missing tags stay missing, except that full range is always said: players assume limited.
    format.range = meaning.range == AVCOL_RANGE_JPEG ? AVCOL_RANGE_JPEG : frame.color_range;
    format.matrix = frame.colorspace;
  }
  meaning.siting = siting;
  format.samples = {AV_PIX_FMT_YUV420P, meaning};
  return format;
}

// The MKV muxer of FFmpeg 5.1 leaves rotation out, and Y4M has no place for it.
bool stores_rotation(OutputKind kind) {
  return kind == OutputKind::kMp4 || kind == OutputKind::kMov;
}

VideoWriter::VideoWriter(OutputKind kind, const std::string& path, const Reader& reader,
                         const VideoFormat& format)
    : is_frames_only_(is_frames_only(kind)),
      raw_layout_(format.raw_layout),
      has_constant_rate_(reader.has_constant_rate()),
      frame_rate_(reader.frame_rate()),
      input_base_(reader.video().time_base) {
  // Where no time stamps can be written, the average keeps the length of the video.
  const AVRational average = reader.video().avg_frame_rate;
  if (is_frames_only_ && !has_constant_rate_ && average.num > 0) frame_rate_ = average;
  if (frame_rate_.num <= 0 || frame_rate_.den <= 0) frame_rate_ = kUsualFrameRate;
  frame_length_ = std::max<int64_t>(av_rescale_q(1, av_inv_q(frame_rate_), input_base_), 1);
  const int64_t start = reader.container().start_time;
  if (start != AV_NOPTS_VALUE) start_ = std::max<int64_t>(start, 0);

  AVFormatContext* container = nullptr;
  const std::string url = path == "-" ? "pipe:1" : "file:" + path;
  check(avformat_alloc_output_context2(&container, nullptr, container_name(kind), url.c_str()),
        "cannot set up the output");
  container_.reset(container);
  open_encoder(format, kind);
  add_video_stream(reader);
  if (stores_rotation(kind)) copy_display_matrix(reader.video(), video_);
  if (!is_frames_only_) companions_.add(reader, *container_, start_);
  copy_container_metadata(reader.container(), *container_);
  if (!is_frames_only_) copy_chapters(reader.container(), *container_, start_, format.longest);
  open_file(url);
}

void VideoWriter::open_encoder(const VideoFormat& format, OutputKind kind) {
  const char* const name = encoder_name(kind);
  const AVCodec* codec = avcodec_find_encoder_by_name(name);
  if (codec == nullptr) {
    throw Error(std::string("FFmpeg was built without the encoder ") + name);
  }
  encoder_.reset(avcodec_alloc_context3(codec));
  if (!encoder_) throw std::bad_alloc();
  encoder_->width = format.width;
  encoder_->height = format.height;
  encoder_->pix_fmt =
      kind == OutputKind::kRaw ? pixel_format_of(format.raw_layout) : format.samples.format;
  encoder_->color_range = format.range;
  encoder_->colorspace = format.matrix;
  encoder_->color_primaries = format.primaries;
  encoder_->color_trc = format.transfer;
  encoder_->chroma_sample_location = format.samples.meaning.siting;
  encoder_->sample_aspect_ratio = format.sample_aspect_ratio;
  encoder_->framerate = frame_rate_;
  encoder_->time_base = is_frames_only_ ? av_inv_q(frame_rate_) : input_base_;
  encoder_->field_order = AV_FIELD_PROGRESSIVE;
  if (container_->oformat->flags & AVFMT_GLOBALHEADER) {
    encoder_->flags |= AV_CODEC_FLAG_GLOBAL_HEADER;
  }
  Dictionary options;
  if (!is_frames_only_) {
    options.set("crf", kQuality);
    options.set("preset", kSpeed);
    // Writes the frame rate into the stream instead of the tick of the time stamps. The time stamps
    // themselves stay as they are.
    if (has_constant_rate_) options.set("x264-params", "force-cfr=1");
  }
  check(avcodec_open2(encoder_.get(), codec, options.address()),
        std::string("cannot set up the encoder ") + name);
}

void VideoWriter::add_video_stream(const Reader& reader) {
  video_ = avformat_new_stream(container_.get(), nullptr);
  if (video_ == nullptr) throw std::bad_alloc();
  check(avcodec_parameters_from_context(video_->codecpar, encoder_.get()),
        "cannot set up the output");
  video_->time_base = encoder_->time_base;
  video_->sample_aspect_ratio = encoder_->sample_aspect_ratio;
  video_->avg_frame_rate = is_frames_only_ ? frame_rate_ : reader.video().avg_frame_rate;
  video_->r_frame_rate = is_frames_only_ ? frame_rate_ : reader.video().r_frame_rate;
  video_->disposition = reader.video().disposition;
  copy_stream_metadata(reader.video(), *video_);
}

void VideoWriter::open_file(const std::string& url) {
  const AVIOInterruptCB interrupt = {stop_waiting, nullptr};
  container_->interrupt_callback = interrupt;
  check(avio_open2(&container_->pb, url.c_str(), AVIO_FLAG_WRITE, &interrupt, nullptr),
        "cannot open the output");
  Dictionary options;
  // The index goes in front, so that players can start before they have the whole file. Containers
  // that do not know the option leave it in the dictionary.
  options.set("movflags", "+faststart");
  // Whoever reads the pipe gets each frame as soon as it is ready.
  if (url == "pipe:1") container_->flags |= AVFMT_FLAG_FLUSH_PACKETS;
  check(avformat_write_header(container_.get(), options.address()), "cannot write the output");
}

// Time stamps of the output never stand still or go back, whatever the input does.
int64_t VideoWriter::place_in_time(int64_t pts, int64_t duration) {
  if (pts == AV_NOPTS_VALUE) {
    pts = frames_ == 0 ? av_rescale_q(start_, AV_TIME_BASE_Q, input_base_)
                       : last_pts_ + last_duration_;
  }
  if (frames_ > 0) pts = std::max(pts, last_pts_ + 1);
  last_pts_ = pts;
  last_duration_ = duration > 0 ? duration : frame_length_;
  return pts;
}

void VideoWriter::write(AVFrame& frame, int64_t duration, std::deque<PacketPtr>& companions) {
  const int64_t before = last_pts_;
  const int64_t pts = place_in_time(frame.pts, duration);
  write_companions_before(av_rescale_q(pts, input_base_, AV_TIME_BASE_Q), companions);
  if (is_frames_only_) {
    frame.pts = frames_;
  } else {
    const int64_t shift = av_rescale_q(start_, AV_TIME_BASE_Q, input_base_);
    frame.pts = pts - shift;
    if (frames_ > 0) durations_[before - shift] = pts - before;
    durations_[frame.pts] = last_duration_;
  }
  ++frames_;
  frame.pict_type = AV_PICTURE_TYPE_NONE;
  if (encoder_->codec_id == AV_CODEC_ID_RAWVIDEO) {
    encode(in_raw_layout(frame).get());
  } else {
    encode(&frame);
  }
}

FramePtr VideoWriter::in_raw_layout(const AVFrame& frame) {
  FramePtr raw = make_frame();
  check(av_frame_ref(raw.get(), &frame), "cannot allocate a frame");
  if (frame.format != encoder_->pix_fmt) {
    if (!raw_pipe_) {
      raw_pipe_.emplace(frame, std::string("format=") + av_get_pix_fmt_name(encoder_->pix_fmt));
    }
    // Only the order of the chroma bytes changes: the scaler must not make it limited range.
    raw->color_range = AVCOL_RANGE_UNSPECIFIED;
    raw = raw_pipe_->run(*raw);
    raw->pts = frame.pts;
  }
  if (raw_layout_ == RawLayout::kYv12) swap_chroma(*raw);
  return raw;
}

int64_t VideoWriter::end() const {
  return av_rescale_q(last_pts_ + last_duration_, input_base_, AV_TIME_BASE_Q);
}

void VideoWriter::encode(const AVFrame* frame) {
  check(avcodec_send_frame(encoder_.get(), frame), "cannot encode a frame");
  for (;;) {
    throw_if_interrupted();
    const int result = avcodec_receive_packet(encoder_.get(), packet_.get());
    if (result == AVERROR(EAGAIN) || result == AVERROR_EOF) return;
    check(result, "cannot encode a frame");
    if (is_frames_only_) {
      packet_->duration = 1;
    } else if (const auto known = durations_.find(packet_->pts); known != durations_.end()) {
      packet_->duration = known->second;
      durations_.erase(known);
    }
    packet_->stream_index = video_->index;
    av_packet_rescale_ts(packet_.get(), encoder_->time_base, video_->time_base);
    write_packet(*packet_);
  }
}

void VideoWriter::write_packet(AVPacket& packet) {
  const char* const what = "cannot write the output";
  check(av_interleaved_write_frame(container_.get(), &packet), what);
  // Errors of buffered writes show up here.
  if (container_->pb->error < 0) check(container_->pb->error, what);
}

void VideoWriter::write_companions_before(int64_t end, std::deque<PacketPtr>& packets) {
  companions_.pass_on(end, packets, [this](AVPacket& packet) { write_packet(packet); });
}

void VideoWriter::finish(std::deque<PacketPtr>& companions, int64_t last) {
  write_companions_before(last, companions);
  encode(nullptr);
  const char* const what = "cannot complete the output";
  check(av_write_trailer(container_.get()), what);
  check(avio_closep(&container_->pb), what);
}

}  // namespace dehaze
