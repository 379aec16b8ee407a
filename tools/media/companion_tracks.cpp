#include "media/companion_tracks.h"

#include <cstring>
#include <utility>

#include "errors.h"
#include "media/av_error.h"
#include "media/metadata.h"

namespace dehaze {
namespace {

AVStream* copy_stream(const AVStream& input, AVFormatContext& container) {
  AVStream* output = avformat_new_stream(&container, nullptr);
  if (output == nullptr) throw std::bad_alloc();
  check(avcodec_parameters_copy(output->codecpar, input.codecpar), "cannot copy a track");
  output->codecpar->codec_tag = 0;  // the containers have codes of their own
  output->time_base = input.time_base;
  output->disposition = input.disposition;
  copy_stream_metadata(input, *output);
  return output;
}

bool is_mkv(const AVFormatContext& container) {
  return std::strcmp(container.oformat->name, "matroska") == 0;
}

}  // namespace

void CompanionTracks::add(const Reader& reader, AVFormatContext& container, int64_t start) {
  start_ = start;
  for (const AVStream* input : reader.companions()) add_track(*input, container);
  // Fonts of subtitles.
  for (unsigned i = 0; is_mkv(container) && i < reader.container().nb_streams; ++i) {
    const AVStream& input = *reader.container().streams[i];
    if (input.codecpar->codec_type == AVMEDIA_TYPE_ATTACHMENT) copy_stream(input, container);
  }
}

void CompanionTracks::add_track(const AVStream& input, AVFormatContext& container) {
  const AVOutputFormat& format = *container.oformat;
  const AVCodecID codec = input.codecpar->codec_id;
  const std::string name = avcodec_get_name(codec);
  if (avformat_query_codec(&format, codec, FF_COMPLIANCE_NORMAL) == 1) {
    tracks_[input.index] = {input.time_base, copy_stream(input, container), nullptr};
  } else if (input.codecpar->codec_type == AVMEDIA_TYPE_AUDIO) {
    throw Error("this kind of output cannot hold " + name + " audio; use .mkv");
  } else if (SubtitleConverter::can_convert(codec, format)) {
    auto converter = std::make_unique<SubtitleConverter>(input, format);
    AVStream* output = copy_stream(input, container);
    converter->describe(*output->codecpar);
    tracks_[input.index] = {input.time_base, output, std::move(converter)};
  } else {
    left_out_.push_back("this kind of output cannot hold " + name +
                        " subtitles; they are left out (.mkv holds most)");
  }
}

// False if there is nothing to write.
bool CompanionTracks::prepare(const Track& track, AVPacket& packet) {
  if (track.converter && !track.converter->convert(packet)) return false;
  const int64_t shift = av_rescale_q(start_, AV_TIME_BASE_Q, track.input_base);
  if (packet.pts != AV_NOPTS_VALUE) packet.pts -= shift;
  if (packet.dts != AV_NOPTS_VALUE) packet.dts -= shift;
  av_packet_rescale_ts(&packet, track.input_base, track.output->time_base);
  packet.stream_index = track.output->index;
  packet.pos = -1;
  return true;
}

void CompanionTracks::pass_on(int64_t end, std::deque<PacketPtr>& packets,
                              const std::function<void(AVPacket&)>& write) {
  std::deque<PacketPtr> later;
  for (PacketPtr& packet : packets) {
    const auto found = tracks_.find(packet->stream_index);
    if (found == tracks_.end()) continue;
    const Track& track = found->second;
    const int64_t begin = packet->pts != AV_NOPTS_VALUE ? packet->pts : packet->dts;
    if (begin != AV_NOPTS_VALUE &&
        av_compare_ts(begin, track.input_base, end, AV_TIME_BASE_Q) >= 0) {
      later.push_back(std::move(packet));
    } else if (prepare(track, *packet)) {
      write(*packet);
    }
  }
  packets.swap(later);
}

}  // namespace dehaze
