#include "report/jpeg.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "errors.h"
#include "media/av_error.h"
#include "media/filter_pipe.h"

namespace dehaze {
namespace {

// Of the encoder, best first: 2 leaves about 44 dB, from 20 on blocks show.
constexpr std::array<int, 6> kQuantizers = {2, 3, 5, 8, 12, 18};
constexpr double kShrink = 0.75;
constexpr int kSmallestSide = 160;
// An sRGB or Display P3 profile has a few kilobytes; printer profiles have a thousand.
constexpr size_t kLargestProfile = 16384;

struct Size {
  int width;
  int height;
};

Size shown_size(const AVFrame& frame, AVRational pixel_aspect, int longest_side) {
  double width = frame.width;
  const double height = frame.height;
  if (pixel_aspect.num > 0 && pixel_aspect.den > 0) width *= av_q2d(pixel_aspect);
  const double factor = std::min(1.0, longest_side / std::max(width, height));
  const auto side = [factor](double length) {
    return std::max(1, static_cast<int>(std::lround(length * factor)));
  };
  return {side(width), side(height)};
}

FramePtr scaled(const AVFrame& rgb, const Size& size) {
  FramePtr frame = run_filter(
      rgb, "scale=w=" + std::to_string(size.width) + ":h=" + std::to_string(size.height) +
               ":flags=bicubic+accurate_rnd+full_chroma_inp:out_color_matrix=bt601:"
               "out_range=full,format=yuvj420p");
  frame->color_range = AVCOL_RANGE_JPEG;
  frame->colorspace = AVCOL_SPC_SMPTE170M;
  const AVFrameSideData* profile = av_frame_get_side_data(frame.get(), AV_FRAME_DATA_ICC_PROFILE);
  if (profile != nullptr && profile->size > kLargestProfile) {
    av_frame_remove_side_data(frame.get(), AV_FRAME_DATA_ICC_PROFILE);
  }
  return frame;
}

std::string encoded(const AVFrame& frame, int quantizer) {
  const AVCodec* codec = avcodec_find_encoder(AV_CODEC_ID_MJPEG);
  if (codec == nullptr) throw Error("FFmpeg was built without the encoder mjpeg");
  EncoderPtr encoder(avcodec_alloc_context3(codec));
  if (!encoder) throw std::bad_alloc();
  encoder->width = frame.width;
  encoder->height = frame.height;
  encoder->pix_fmt = static_cast<AVPixelFormat>(frame.format);
  encoder->color_range = frame.color_range;
  encoder->time_base = AVRational{1, 25};  // has to be set, means nothing for one picture
  encoder->flags |= AV_CODEC_FLAG_QSCALE;
  encoder->global_quality = quantizer * FF_QP2LAMBDA;
  const char* const what = "cannot encode a picture for the page";
  check(avcodec_open2(encoder.get(), codec, nullptr), what);
  FramePtr input = make_frame();
  check(av_frame_ref(input.get(), &frame), what);
  input->pts = 0;
  input->quality = encoder->global_quality;
  check(avcodec_send_frame(encoder.get(), input.get()), what);
  check(avcodec_send_frame(encoder.get(), nullptr), what);
  const PacketPtr packet = make_packet();
  check(avcodec_receive_packet(encoder.get(), packet.get()), what);
  return std::string(reinterpret_cast<const char*>(packet->data),
                     static_cast<size_t>(packet->size));
}

}  // namespace

Jpeg jpeg_within(const AVFrame& rgb, AVRational pixel_aspect, const JpegLimits& limits) {
  double side = limits.longest_side;
  while (true) {
    const Size size = shown_size(rgb, pixel_aspect, static_cast<int>(side));
    const FramePtr frame = scaled(rgb, size);
    Jpeg jpeg{size.width, size.height, ""};
    for (const int quantizer : kQuantizers) {
      jpeg.bytes = encoded(*frame, quantizer);
      if (jpeg.bytes.size() <= limits.bytes) return jpeg;
    }
    side = std::max(size.width, size.height) * kShrink;
    if (side < kSmallestSide) return jpeg;
  }
}

}  // namespace dehaze
