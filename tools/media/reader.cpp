#include "media/reader.h"

extern "C" {
#include <libavutil/avutil.h>
}

#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstring>

#include "errors.h"
#include "interrupt.h"
#include "media/av_error.h"
#include "media/raw_frames.h"
#include "media/unsupported.h"

namespace dehaze {
namespace {

constexpr double kRateTolerance = 0.01;

int stop_waiting(void*) { return is_stopping(); }

bool ends_with(const std::string& text, const std::string& end) {
  return text.size() >= end.size() && text.compare(text.size() - end.size(), end.size(), end) == 0;
}

bool is_format(const AVInputFormat& format, const char* name) {
  return std::strstr(format.name, name) != nullptr;
}

// Pictures are read by demultiplexers like "jpeg_pipe".
bool is_picture_format(const AVInputFormat& format) {
  return ends_with(format.name, "_pipe") || is_format(format, "image2");
}

bool is_companion(const AVStream& stream) {
  const AVMediaType type = stream.codecpar->codec_type;
  return type == AVMEDIA_TYPE_AUDIO || type == AVMEDIA_TYPE_SUBTITLE;
}

std::string coding_name(const AVCodecParameters& parameters) {
  char tag[AV_FOURCC_MAX_STRING_SIZE];
  return parameters.codec_id == AV_CODEC_ID_NONE
             ? std::string("\"") + av_fourcc_make_string(tag, parameters.codec_tag) + "\""
             : avcodec_get_name(parameters.codec_id);
}

void check_readable_file(const std::string& path) {
  struct stat status = {};
  if (stat(path.c_str(), &status) != 0) throw Error(path + ": " + std::strerror(errno));
  if (S_ISDIR(status.st_mode)) {
    throw Error(path + ": is a folder; give the name of a picture or a video");
  }
  if (S_ISREG(status.st_mode) && status.st_size == 0) throw Error(path + ": the file is empty");
}

void check_supported_kind(const std::string& path) {
  const std::string kind = unsupported_kind(path);
  if (!kind.empty()) throw Error(path + ": " + kind);
}

// True for containers whose header gives the true duration unless the file breaks off.
bool declares_duration(const AVFormatContext& container) {
  return (is_format(*container.iformat, "mov") || is_format(*container.iformat, "matroska")) &&
         container.duration_estimation_method == AVFMT_DURATION_FROM_STREAM &&
         container.duration > 0;
}

}  // namespace

Reader::Reader(const std::string& path, const std::optional<RawFormat>& raw)
    : path_(path == "-" ? "standard input" : path), raw_(raw) {
  if (path == "-") {
    open("pipe:0");
  } else {
    check_readable_file(path);
    if (!raw_) check_supported_kind(path);
    // The prefix keeps names with a colon from being taken for network addresses.
    open("file:" + path);
  }
  is_picture_ = is_picture_format(*container_->iformat);
  choose_streams();
  if (raw_) set_raw_meaning(*raw_, *video_->codecpar);
  open_decoder();
}

void Reader::open(const std::string& url) {
  const AVIOInterruptCB interrupt = {stop_waiting, nullptr};
  AVIOContext* io = nullptr;
  check(avio_open2(&io, url.c_str(), AVIO_FLAG_READ, &interrupt, nullptr), path_);
  io_.reset(io);

  AVFormatContext* container = avformat_alloc_context();
  if (container == nullptr) throw std::bad_alloc();
  container->pb = io_.get();
  container->interrupt_callback = interrupt;
  // Playlists and the like may name other files; nothing beyond the one given is opened.
  Dictionary options;
  options.set("protocol_whitelist", "none");
  // No name is passed, so that the content alone decides.
  const bool is_pipe = url == "pipe:0";
  const char* const format_name = raw_ ? "rawvideo" : is_pipe ? "yuv4mpegpipe" : nullptr;
  const AVInputFormat* format =
      format_name != nullptr ? av_find_input_format(format_name) : nullptr;
  if (raw_) set_raw_options(*raw_, options);
  const int result = avformat_open_input(&container, nullptr, format, options.address());
  container_.reset(container);  // null after a failure
  if (result < 0 && is_pipe && !raw_) {
    throw_if_interrupted();
    throw Error(path_ +
                ": not a YUV4MPEG2 stream; a pipe has to carry Y4M (ffmpeg -f "
                "yuv4mpegpipe) or raw frames (--raw)");
  }
  check(result, path_ + ": not a picture or video that can be read");
  demuxer_errors_ = demuxer_errors_logged();
  check(avformat_find_stream_info(container_.get(), nullptr), path_ + ": cannot be read");
}

void Reader::choose_streams() {
  const int index = av_find_best_stream(container_.get(), AVMEDIA_TYPE_VIDEO, -1, -1, nullptr, 0);
  if (index < 0) throw Error(path_ + ": holds no picture or video");
  video_ = container_->streams[index];
  if (video_->disposition & AV_DISPOSITION_ATTACHED_PIC) {
    throw Error(path_ + ": holds no video, only a cover picture");
  }
  for (unsigned i = 0; i < container_->nb_streams; ++i) {
    const AVStream* stream = container_->streams[i];
    if (is_companion(*stream)) companions_.push_back(stream);
  }
}

void Reader::open_decoder() {
  const AVCodec* codec = avcodec_find_decoder(video_->codecpar->codec_id);
  if (codec == nullptr) {
    throw Error(path_ + ": there is no decoder for " + coding_name(*video_->codecpar));
  }
  decoder_.reset(avcodec_alloc_context3(codec));
  if (!decoder_) throw std::bad_alloc();
  check(avcodec_parameters_to_context(decoder_.get(), video_->codecpar), path_);
  decoder_->pkt_timebase = video_->time_base;
  decoder_->thread_count = 0;  // as many as there are processors
  // Without it a picture file that breaks off decodes to a picture with a grey rest. The decoder of
  // TIFF would take every unknown tag for damage.
  if (is_picture_ && codec->id != AV_CODEC_ID_TIFF) decoder_->err_recognition |= AV_EF_EXPLODE;
  check(avcodec_open2(decoder_.get(), codec, nullptr), path_ + ": cannot decode " + codec->name);
}

bool Reader::is_y4m() const { return is_format(*container_->iformat, "yuv4mpegpipe"); }

AVRational Reader::frame_rate() const {
  return av_guess_frame_rate(container_.get(), video_, nullptr);
}

bool Reader::has_constant_rate() const {
  if (raw_) return true;
  const double average = av_q2d(video_->avg_frame_rate);
  const double rate = av_q2d(frame_rate());
  // An average over rounded time stamps is a little off.
  return average > 0 && std::abs(average - rate) < kRateTolerance * rate;
}

AVRational Reader::sample_aspect_ratio(const AVFrame& frame) const {
  // Only read there.
  return av_guess_sample_aspect_ratio(container_.get(), video_, const_cast<AVFrame*>(&frame));
}

int64_t Reader::frame_count() const {
  if (video_->nb_frames > 0) return video_->nb_frames;
  const AVRational rate = frame_rate();
  if (rate.num <= 0 || rate.den <= 0) return 0;
  if (video_->duration > 0) {
    return av_rescale_q(video_->duration, video_->time_base, av_inv_q(rate));
  }
  if (container_->duration > 0) {
    return av_rescale_q(container_->duration, AV_TIME_BASE_Q, av_inv_q(rate));
  }
  return 0;
}

Error Reader::damaged(const std::string& detail) const {
  const std::string logged = take_last_logged_error();
  std::string text = path_ + ": the " + (is_picture_ ? "picture" : "video") +
                     " is damaged or incomplete: " + detail +
                     (logged.empty() ? "" : " (" + logged + ")");
  if (frames_ > 0) {
    text += "; --max-frames " + std::to_string(frames_) + " takes the part before the damage";
  } else {
    text += "; use an undamaged copy";
  }
  return Error(text);
}

bool Reader::read_packet() {
  throw_if_interrupted();
  av_packet_unref(packet_.get());
  const int result = av_read_frame(container_.get(), packet_.get());
  if (result == AVERROR_EOF) {
    check_complete_end();
    return false;
  }
  if (result < 0) {
    throw_if_interrupted();
    char reason[AV_ERROR_MAX_STRING_SIZE] = {};
    av_strerror(result, reason, sizeof(reason));
    throw damaged(reason);
  }
  bytes_used_ = avio_tell(io_.get());
  const AVStream* stream = container_->streams[packet_->stream_index];
  if (packet_->pts != AV_NOPTS_VALUE) {
    const int64_t end = packet_->pts + std::max<int64_t>(packet_->duration, 0);
    latest_end_ = std::max(latest_end_, av_rescale_q(end, stream->time_base, AV_TIME_BASE_Q));
  }
  const bool is_used = stream == video_ || is_companion(*stream);
  if (is_used && (packet_->flags & AV_PKT_FLAG_CORRUPT)) throw damaged("a packet is cut short");
  if (is_companion(*stream)) {
    pending_.push_back(make_packet());
    av_packet_move_ref(pending_.back().get(), packet_.get());
  }
  return true;
}

// An ordinary end of file is not always the end of the video.
void Reader::check_complete_end() {
  if (demuxer_errors_logged() > demuxer_errors_) throw damaged("it breaks off");
  // The Y4M demultiplexer drops a last frame that is cut short.
  if (is_y4m() && frames_ > 0 && avio_tell(io_.get()) > bytes_used_) {
    throw damaged("the last frame is cut short");
  }
  if (!declares_duration(*container_)) return;
  // MKV states the last time stamp as its duration, MP4 the length.
  const bool from_zero = is_format(*container_->iformat, "matroska");
  const bool starts_late = container_->start_time != AV_NOPTS_VALUE && !from_zero;
  const int64_t found = latest_end_ - (starts_late ? container_->start_time : 0);
  // A file that broke off between two blocks of data; small differences are common.
  if (found < container_->duration / 10 * 9 - AV_TIME_BASE) {
    char detail[96];
    std::snprintf(detail, sizeof(detail), "it ends after %.1f of %.1f seconds",
                  static_cast<double>(found) / AV_TIME_BASE,
                  static_cast<double>(container_->duration) / AV_TIME_BASE);
    throw damaged(detail);
  }
}

// Hands the next video packet, or the end, to the decoder. False if the packet was of no use.
bool Reader::send_packet() {
  if (!read_packet()) {
    at_end_ = true;
    avcodec_send_packet(decoder_.get(), nullptr);
    return true;
  }
  if (packet_->data == nullptr || packet_->stream_index != video_->index) return false;
  const int result = avcodec_send_packet(decoder_.get(), packet_.get());
  if (result >= 0) return true;
  if (result == AVERROR(ENOMEM)) throw std::bad_alloc();
  // A recording may begin in the middle of a group of pictures.
  if (frames_ > 0 || is_picture_) throw damaged("a frame cannot be decoded");
  return false;
}

bool Reader::read_frame(AVFrame* frame) {
  for (;;) {
    const int result = avcodec_receive_frame(decoder_.get(), frame);
    if (result == AVERROR(EAGAIN) && !at_end_) {
      while (!send_packet()) {
      }
      continue;
    }
    if (result == AVERROR_EOF || (result == AVERROR(EAGAIN) && at_end_)) {
      if (frames_ == 0) throw damaged("no frame can be decoded");
      return false;
    }
    const bool is_broken =
        result < 0 || frame->decode_error_flags != 0 || (frame->flags & AV_FRAME_FLAG_CORRUPT) != 0;
    if (is_broken) {
      if (frames_ > 0 || is_picture_) throw damaged("a frame cannot be decoded");
      continue;
    }
    ++frames_;
    if (raw_ && raw_->layout == RawLayout::kYv12) swap_chroma(*frame);
    frame->pts = frame->best_effort_timestamp;
    return true;
  }
}

void Reader::read_companions_until(int64_t end) {
  std::vector<bool> done(container_->nb_streams, true);
  for (const AVStream* stream : companions_) {
    // Subtitles may be minutes apart.
    const bool is_sound = stream->codecpar->codec_type == AVMEDIA_TYPE_AUDIO;
    done[static_cast<size_t>(stream->index)] = !is_sound;
  }
  const auto note_packet = [&](const AVPacket& packet) {
    const AVRational time_base = container_->streams[packet.stream_index]->time_base;
    if (packet.pts != AV_NOPTS_VALUE &&
        av_compare_ts(packet.pts, time_base, end, AV_TIME_BASE_Q) >= 0) {
      done[static_cast<size_t>(packet.stream_index)] = true;
    }
  };
  for (const PacketPtr& packet : pending_) note_packet(*packet);
  while (std::find(done.begin(), done.end(), false) != done.end()) {
    const size_t before = pending_.size();
    try {
      if (!read_packet()) return;
    } catch (const Error&) {
      return;  // damage beyond the frames that were asked for
    }
    if (pending_.size() > before) note_packet(*pending_.back());
  }
}

}  // namespace dehaze
