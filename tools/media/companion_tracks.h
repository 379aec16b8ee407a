// The tracks of an output video besides the picture: sound, subtitles and their fonts, packet by
// packet from the input.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "media/ffmpeg_handles.h"
#include "media/reader.h"
#include "media/subtitle_converter.h"

namespace dehaze {

class CompanionTracks {
 public:
  // Adds a track to the container for each companion. Throws Error for sound that it cannot hold.
  // start: what of the input becomes 0 in the output, in AV_TIME_BASE units.
  void add(const Reader& reader, AVFormatContext& container, int64_t start);

  // What the container cannot hold and is therefore left out.
  const std::vector<std::string>& left_out() const { return left_out_; }

  // Takes the packets off `packets` that begin before `end` (AV_TIME_BASE units of the input) and
  // hands them to `write`, ready for the container.
  void pass_on(int64_t end, std::deque<PacketPtr>& packets,
               const std::function<void(AVPacket&)>& write);

 private:
  struct Track {
    AVRational input_base;
    AVStream* output;
    std::unique_ptr<SubtitleConverter> converter;  // null: copied
  };

  void add_track(const AVStream& input, AVFormatContext& container);
  bool prepare(const Track& track, AVPacket& packet);

  std::map<int, Track> tracks_;  // by index of the input's stream
  std::vector<std::string> left_out_;
  int64_t start_ = 0;
};

}  // namespace dehaze
