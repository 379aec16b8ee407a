// Output: H.264 in MP4, MOV or MKV with copied sound and subtitles; Y4M or raw frames as a file or
// on a pipe.
#pragma once

#include <cstdint>
#include <deque>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "media/color_convert.h"
#include "media/companion_tracks.h"
#include "media/ffmpeg_handles.h"
#include "media/filter_pipe.h"
#include "media/reader.h"
#include "output_kind.h"
#include "raw_format.h"

namespace dehaze {

// Everything about the frames that a video file states in its header.
struct VideoFormat {
  int width;
  int height;
  OutputSamples samples;  // what the values are
  AVColorRange range;     // what the file says they are: the input's tags, which may be
  AVColorSpace matrix;    // missing
  AVColorPrimaries primaries;
  AVColorTransferCharacteristic transfer;
  AVRational sample_aspect_ratio;  // 0/1 if unknown
  RawLayout raw_layout;            // of raw frames
  int64_t longest;                 // AV_TIME_BASE units; INT64_MAX if it is not cut off
};

// 4:2:0 in the range, matrix and tags of the input. The size and aspect ratio are the caller's.
VideoFormat video_format_like(const AVFrame& first_frame, AVChromaLocation siting);

// True if the container can say that a player has to turn the picture; for the others the pixels
// have to be turned.
bool stores_rotation(OutputKind kind);

class VideoWriter {
 public:
  // path: "-" or an existing file.
  VideoWriter(OutputKind kind, const std::string& path, const Reader& reader,
              const VideoFormat& format);

  // What of the input the output cannot hold and is therefore left out.
  const std::vector<std::string>& left_out() const { return companions_.left_out(); }

  // frame.pts and `duration` in units of the input video's time base, AV_NOPTS_VALUE and 0 if
  // unknown. Takes the packets off `companions` that begin before the frame.
  void write(AVFrame& frame, int64_t duration, std::deque<PacketPtr>& companions);

  // End of the last frame so far, in AV_TIME_BASE units of the input.
  int64_t end() const;

  // Writes what is still held back, of the companions only what begins before `last`
  // (AV_TIME_BASE units), and completes the file.
  void finish(std::deque<PacketPtr>& companions, int64_t last);

 private:
  void open_encoder(const VideoFormat& format, OutputKind kind);
  void add_video_stream(const Reader& reader);
  void open_file(const std::string& path);
  int64_t place_in_time(int64_t pts, int64_t duration);
  FramePtr in_raw_layout(const AVFrame& frame);
  void encode(const AVFrame* frame);
  void write_packet(AVPacket& packet);
  void write_companions_before(int64_t end, std::deque<PacketPtr>& packets);

  bool is_frames_only_;
  RawLayout raw_layout_;
  std::optional<FilterPipe> raw_pipe_;  // to the raw layout; none if nothing is to be done
  bool has_constant_rate_;
  OutputPtr container_;
  EncoderPtr encoder_;
  PacketPtr packet_ = make_packet();
  AVStream* video_ = nullptr;  // owned by the container
  CompanionTracks companions_;
  std::map<int64_t, int64_t> durations_;  // of the frames in the encoder, by time stamp
  AVRational frame_rate_;
  AVRational input_base_;
  int64_t start_ = 0;         // of the input, in AV_TIME_BASE units; the output starts at 0
  int64_t frame_length_ = 1;  // typical, in units of input_base_
  int64_t frames_ = 0;
  int64_t last_pts_ = 0;  // of the input, in units of input_base_
  int64_t last_duration_ = 0;
};

}  // namespace dehaze
