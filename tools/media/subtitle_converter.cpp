#include "media/subtitle_converter.h"

extern "C" {
#include <libavutil/mem.h>
}

#include <cstring>
#include <string>
#include <vector>

#include "errors.h"
#include "media/av_error.h"

namespace dehaze {
namespace {

constexpr size_t kLargestText = 1 << 16;

// What the container holds text as.
AVCodecID text_codec_of(const AVOutputFormat& container) {
  const bool is_mkv = std::strcmp(container.name, "matroska") == 0;
  return is_mkv ? AV_CODEC_ID_SUBRIP : AV_CODEC_ID_MOV_TEXT;
}

struct Subtitle {
  Subtitle() = default;
  ~Subtitle() { avsubtitle_free(&value); }
  Subtitle(const Subtitle&) = delete;
  Subtitle& operator=(const Subtitle&) = delete;

  AVSubtitle value = {};
};

DecoderPtr allocate_context(const AVCodec* codec) {
  DecoderPtr context(avcodec_alloc_context3(codec));
  if (!context) throw std::bad_alloc();
  return context;
}

}  // namespace

bool SubtitleConverter::can_convert(AVCodecID codec, const AVOutputFormat& container) {
  const AVCodecDescriptor* descriptor = avcodec_descriptor_get(codec);
  return descriptor != nullptr && (descriptor->props & AV_CODEC_PROP_TEXT_SUB) &&
         avcodec_find_decoder(codec) != nullptr &&
         avcodec_find_encoder(text_codec_of(container)) != nullptr;
}

SubtitleConverter::SubtitleConverter(const AVStream& input, const AVOutputFormat& container) {
  const char* const what = "cannot convert the subtitles";
  const AVCodec* from = avcodec_find_decoder(input.codecpar->codec_id);
  decoder_ = allocate_context(from);
  check(avcodec_parameters_to_context(decoder_.get(), input.codecpar), what);
  decoder_->pkt_timebase = input.time_base;
  check(avcodec_open2(decoder_.get(), from, nullptr), what);

  const AVCodec* to = avcodec_find_encoder(text_codec_of(container));
  encoder_ = allocate_context(to);
  encoder_->time_base = input.time_base;
  // Styles, in the form that all decoders and encoders of text share.
  if (decoder_->subtitle_header != nullptr) {
    const size_t size = static_cast<size_t>(decoder_->subtitle_header_size);
    // One more byte for the end of the text.
    encoder_->subtitle_header = static_cast<uint8_t*>(av_mallocz(size + 1));
    if (encoder_->subtitle_header == nullptr) throw std::bad_alloc();
    std::memcpy(encoder_->subtitle_header, decoder_->subtitle_header, size);
    encoder_->subtitle_header_size = decoder_->subtitle_header_size;
  }
  check(avcodec_open2(encoder_.get(), to, nullptr), what);
}

void SubtitleConverter::describe(AVCodecParameters& output) const {
  check(avcodec_parameters_from_context(&output, encoder_.get()), "cannot convert the subtitles");
}

bool SubtitleConverter::convert(AVPacket& packet) {
  Subtitle subtitle;
  int has_subtitle = 0;
  const int result =
      avcodec_decode_subtitle2(decoder_.get(), &subtitle.value, &has_subtitle, &packet);
  if (result < 0 || has_subtitle == 0 || subtitle.value.num_rects == 0) return false;
  // Encoders refuse a delay; the packet's own time says when it begins.
  subtitle.value.start_display_time = 0;
  std::vector<uint8_t> text(kLargestText);
  const int size = avcodec_encode_subtitle(encoder_.get(), text.data(),
                                           static_cast<int>(text.size()), &subtitle.value);
  if (size <= 0) return false;
  const PacketPtr times = make_packet();
  check(av_packet_copy_props(times.get(), &packet), "cannot convert the subtitles");
  times->stream_index = packet.stream_index;
  av_packet_unref(&packet);
  check(av_new_packet(&packet, size), "cannot convert the subtitles");
  std::memcpy(packet.data, text.data(), static_cast<size_t>(size));
  check(av_packet_copy_props(&packet, times.get()), "cannot convert the subtitles");
  packet.stream_index = times->stream_index;
  return true;
}

}  // namespace dehaze
