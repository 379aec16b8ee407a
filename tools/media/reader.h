// Input: a picture, a video or a pipe, as decoded frames and untouched packets of what goes with
// them: sound and subtitles.
#pragma once

#include <deque>
#include <optional>
#include <string>
#include <vector>

#include "errors.h"
#include "media/ffmpeg_handles.h"
#include "raw_format.h"

namespace dehaze {

class Reader {
 public:
  // "-" reads Y4M from standard input. What the file is follows from its content, not its name,
  // unless it is raw frames. Throws Error if there is nothing to decode.
  explicit Reader(const std::string& path, const std::optional<RawFormat>& raw = std::nullopt);

  const std::string& path() const { return path_; }
  bool is_picture() const { return is_picture_; }
  const AVFormatContext& container() const { return *container_; }
  const AVStream& video() const { return *video_; }
  // Sound and subtitles.
  const std::vector<const AVStream*>& companions() const { return companions_; }
  bool is_y4m() const;

  // Frames per second, {0, 1} if unknown.
  AVRational frame_rate() const;
  // As far as the container's averages tell.
  bool has_constant_rate() const;
  // 0/1 if unknown.
  AVRational sample_aspect_ratio(const AVFrame& frame) const;
  // Often an estimate; 0 if unknown.
  int64_t frame_count() const;

  // Decodes the next frame in display order, its time stamp (pts) in units of the video's time
  // base or AV_NOPTS_VALUE. False at the end. Throws Error if the data is damaged or breaks off.
  bool read_frame(AVFrame* frame);

  // Packets of the companions that came along with the frames read so far.
  std::deque<PacketPtr>& pending() { return pending_; }

  // Reads on for the companions only, until all sound has passed `end` (in AV_TIME_BASE units).
  void read_companions_until(int64_t end);

 private:
  void open(const std::string& url);
  void choose_streams();
  void open_decoder();
  bool read_packet();  // false at the end
  bool send_packet();
  void check_complete_end();
  Error damaged(const std::string& detail) const;

  std::string path_;
  std::optional<RawFormat> raw_;
  bool is_picture_ = false;
  IoPtr io_;  // outlives the container that reads through it
  InputPtr container_;
  AVStream* video_ = nullptr;
  std::vector<const AVStream*> companions_;
  DecoderPtr decoder_;
  PacketPtr packet_ = make_packet();
  std::deque<PacketPtr> pending_;
  bool at_end_ = false;
  int64_t frames_ = 0;
  int64_t bytes_used_ = 0;      // position after the last complete packet
  int64_t latest_end_ = 0;      // of any packet, in AV_TIME_BASE units
  int64_t demuxer_errors_ = 0;  // logged before the first packet
};

}  // namespace dehaze
