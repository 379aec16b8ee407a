#include "media/writer_picture.h"

#include <cerrno>
#include <cstring>

#include "errors.h"
#include "media/av_error.h"
#include "write_file.h"

namespace dehaze {
namespace {

// Both give about 44 dB against the PNG output for photographs.
constexpr int kJpegQuantizer = 2;
constexpr const char* kWebpQuality = "92";

const char* encoder_name(OutputKind kind) {
  switch (kind) {
    case OutputKind::kJpeg:
      return "mjpeg";
    case OutputKind::kPng:
      return "png";
    case OutputKind::kWebp:
      return "libwebp";
    default:
      throw Error("internal error: not a kind of picture");
  }
}

EncoderPtr open_encoder(const AVFrame& frame, OutputKind kind) {
  const AVCodec* codec = avcodec_find_encoder_by_name(encoder_name(kind));
  if (codec == nullptr) {
    throw Error(std::string("FFmpeg was built without the encoder ") + encoder_name(kind));
  }
  EncoderPtr encoder(avcodec_alloc_context3(codec));
  if (!encoder) throw std::bad_alloc();
  encoder->width = frame.width;
  encoder->height = frame.height;
  encoder->pix_fmt = static_cast<AVPixelFormat>(frame.format);
  encoder->color_range = frame.color_range;
  encoder->colorspace = frame.colorspace;
  encoder->time_base = AVRational{1, 25};  // has to be set, means nothing for one picture
  Dictionary options;
  if (kind == OutputKind::kJpeg) {
    encoder->flags |= AV_CODEC_FLAG_QSCALE;
    encoder->global_quality = kJpegQuantizer * FF_QP2LAMBDA;
  } else if (kind == OutputKind::kPng) {
    options.set("pred", "mixed");
  } else {
    options.set("quality", kWebpQuality);
  }
  check(avcodec_open2(encoder.get(), codec, options.address()),
        std::string("cannot set up the encoder ") + codec->name);
  return encoder;
}

Bytes profile_of(const AVFrame& frame) {
  const AVFrameSideData* profile = av_frame_get_side_data(&frame, AV_FRAME_DATA_ICC_PROFILE);
  return profile == nullptr ? Bytes() : Bytes(profile->data, profile->data + profile->size);
}

// Adds what the encoder left out.
Bytes with_blocks(const Bytes& file, const AVFrame& frame, OutputKind kind, const Bytes& exif) {
  switch (kind) {
    case OutputKind::kWebp:
      return webp_with_blocks(file, exif, profile_of(frame), frame.width, frame.height);
    case OutputKind::kPng:
      return exif.empty() ? file : png_with_exif(file, exif);
    default:
      return exif.empty() ? file : jpeg_with_exif(file, exif);
  }
}

}  // namespace

OutputSamples picture_samples(OutputKind kind, AVChromaLocation siting) {
  switch (kind) {
    case OutputKind::kJpeg:
      return {AV_PIX_FMT_YUVJ420P, {AVCOL_RANGE_JPEG, AVCOL_SPC_SMPTE170M, siting}};
    case OutputKind::kWebp:
      return {AV_PIX_FMT_YUV420P, {AVCOL_RANGE_MPEG, AVCOL_SPC_SMPTE170M, siting}};
    default:
      return {AV_PIX_FMT_RGB24, {AVCOL_RANGE_JPEG, AVCOL_SPC_RGB, siting}};
  }
}

void write_picture(const AVFrame& frame, OutputKind kind, const std::string& path,
                   const Bytes& exif) {
  const EncoderPtr encoder = open_encoder(frame, kind);
  FramePtr input = make_frame();
  check(av_frame_ref(input.get(), &frame), "cannot allocate a frame");
  input->pts = 0;
  input->quality = encoder->global_quality;
  const char* const what = "cannot encode the picture";
  check(avcodec_send_frame(encoder.get(), input.get()), what);
  check(avcodec_send_frame(encoder.get(), nullptr), what);
  PacketPtr packet = make_packet();
  check(avcodec_receive_packet(encoder.get(), packet.get()), what);
  const Bytes encoded(packet->data, packet->data + packet->size);
  packet.reset();
  const Bytes file = with_blocks(encoded, frame, kind, exif);
  if (!write_file(path, file.data(), file.size())) {
    throw Error(std::string("cannot write the picture: ") + std::strerror(errno));
  }
}

}  // namespace dehaze
