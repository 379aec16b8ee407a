// Text subtitles from the form of one container to that of another.
#pragma once

#include "media/ffmpeg_handles.h"

namespace dehaze {

class SubtitleConverter {
 public:
  // True for text, if the container holds text at all.
  static bool can_convert(AVCodecID codec, const AVOutputFormat& container);

  SubtitleConverter(const AVStream& input, const AVOutputFormat& container);

  // Puts the new form into the description of the output's track.
  void describe(AVCodecParameters& output) const;

  // Rewrites the packet, whose times stay as they are. False if it shows nothing.
  bool convert(AVPacket& packet);

 private:
  DecoderPtr decoder_;
  EncoderPtr encoder_;
};

}  // namespace dehaze
