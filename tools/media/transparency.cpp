#include "media/transparency.h"

extern "C" {
#include <libavutil/pixdesc.h>
}

#include <algorithm>
#include <cstring>
#include <string>

#include "errors.h"
#include "media/av_error.h"
#include "media/filter_pipe.h"

namespace dehaze {
namespace {

constexpr uint8_t kOpaque = 255;

const uint8_t* row_of(const AVFrame& frame, int plane, int y) {
  return frame.data[plane] + static_cast<ptrdiff_t>(y) * frame.linesize[plane];
}

uint8_t* row_of(AVFrame& frame, int plane, int y) {
  return frame.data[plane] + static_cast<ptrdiff_t>(y) * frame.linesize[plane];
}

bool is_opaque(const AVFrame& alpha) {
  for (int y = 0; y < alpha.height; ++y) {
    const uint8_t* row = row_of(alpha, 0, y);
    if (!std::all_of(row, row + alpha.width, [](uint8_t a) { return a == kOpaque; })) return false;
  }
  return true;
}

FramePtr make_like(const AVFrame& picture, AVPixelFormat format) {
  FramePtr frame = make_frame();
  check(av_frame_copy_props(frame.get(), &picture), "cannot allocate a frame");
  frame->format = format;
  frame->width = picture.width;
  frame->height = picture.height;
  check(av_frame_get_buffer(frame.get(), 0), "cannot allocate a frame");
  return frame;
}

FramePtr rgba_from(const AVFrame& rgb, const AVFrame& alpha) {
  FramePtr rgba = make_like(rgb, AV_PIX_FMT_RGBA);
  for (int y = 0; y < rgb.height; ++y) {
    const uint8_t* color = row_of(rgb, 0, y);
    const uint8_t* opacity = row_of(alpha, 0, y);
    uint8_t* dst = row_of(*rgba, 0, y);
    for (int x = 0; x < rgb.width; ++x) {
      for (int c = 0; c < 3; ++c) *dst++ = *color++;
      *dst++ = opacity[x];
    }
  }
  return rgba;
}

FramePtr yuva420p_from(const AVFrame& yuv, const AVFrame& alpha) {
  FramePtr yuva = make_like(yuv, AV_PIX_FMT_YUVA420P);
  for (int plane = 0; plane < 4; ++plane) {
    const bool is_chroma = plane == 1 || plane == 2;
    const int width = is_chroma ? AV_CEIL_RSHIFT(yuv.width, 1) : yuv.width;
    const int height = is_chroma ? AV_CEIL_RSHIFT(yuv.height, 1) : yuv.height;
    for (int y = 0; y < height; ++y) {
      const uint8_t* src = plane == 3 ? row_of(alpha, 0, y) : row_of(yuv, plane, y);
      std::memcpy(row_of(*yuva, plane, y), src, static_cast<size_t>(width));
    }
  }
  return yuva;
}

}  // namespace

FramePtr take_alpha(const AVFrame& frame, int width, int height) {
  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(static_cast<AVPixelFormat>(frame.format));
  if (!(format.flags & AV_PIX_FMT_FLAG_ALPHA)) return nullptr;
  std::string filter = "format=rgba,alphaextract";
  if (frame.width != width || frame.height != height) {
    filter += ",scale=" + std::to_string(width) + ":" + std::to_string(height) +
              ":flags=bicubic+accurate_rnd";
  }
  FramePtr alpha = run_filter(frame, filter + ",format=gray");
  return is_opaque(*alpha) ? nullptr : std::move(alpha);
}

FramePtr with_alpha(const AVFrame& picture, const AVFrame& alpha) {
  if (picture.width != alpha.width || picture.height != alpha.height) {
    throw Error("internal error: transparency of another size than the picture");
  }
  switch (picture.format) {
    case AV_PIX_FMT_RGB24:
      return rgba_from(picture, alpha);
    case AV_PIX_FMT_YUV420P:
      return yuva420p_from(picture, alpha);
    default:
      throw Error("internal error: transparency for an unexpected pixel format");
  }
}

}  // namespace dehaze
