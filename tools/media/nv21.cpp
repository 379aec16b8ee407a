#include "media/nv21.h"

extern "C" {
#include <libavutil/imgutils.h>
#include <libavutil/pixdesc.h>
}

#include <algorithm>
#include <cstring>

#include "errors.h"
#include "media/av_error.h"

namespace dehaze {
namespace {

void copy_rows(const uint8_t* src, int src_row_bytes, uint8_t* dst, int dst_row_bytes, int bytes,
               int rows) {
  for (int y = 0; y < rows; ++y) {
    std::memcpy(dst, src, static_cast<size_t>(bytes));
    src += src_row_bytes;
    dst += dst_row_bytes;
  }
}

// Bytes between neighbouring pixels of a plane.
int pixel_step(const AVPixFmtDescriptor& format, int plane) {
  int step = 0;
  for (int i = 0; i < format.nb_components; ++i) {
    if (format.comp[i].plane == plane) step = std::max(step, format.comp[i].step);
  }
  return step;
}

bool is_chroma_plane(const AVPixFmtDescriptor& format, int plane) {
  return !(format.flags & AV_PIX_FMT_FLAG_RGB) && (plane == 1 || plane == 2);
}

}  // namespace

void pack_nv21(const AVFrame& planar, Nv21Frame& nv21) {
  const int width = nv21.width;
  const int height = nv21.height;
  if (planar.width != width || planar.height != height) {
    throw Error("internal error: a converted frame does not have the size that was asked for");
  }
  uint8_t* dst = nv21.bytes.data();
  copy_rows(planar.data[0], planar.linesize[0], dst, width, width, height);
  dst += static_cast<ptrdiff_t>(width) * height;
  for (int y = 0; y < height / 2; ++y) {
    const uint8_t* u = planar.data[1] + static_cast<ptrdiff_t>(y) * planar.linesize[1];
    const uint8_t* v = planar.data[2] + static_cast<ptrdiff_t>(y) * planar.linesize[2];
    for (int x = 0; x < width / 2; ++x) {
      *dst++ = v[x];
      *dst++ = u[x];
    }
  }
}

FramePtr unpack_nv21(const Nv21Frame& nv21) {
  const int width = nv21.width;
  const int height = nv21.height;
  FramePtr planar = make_frame();
  planar->format = AV_PIX_FMT_YUV420P;
  planar->width = width;
  planar->height = height;
  check(av_frame_get_buffer(planar.get(), 0), "cannot allocate a frame");
  const uint8_t* src = nv21.bytes.data();
  copy_rows(src, width, planar->data[0], planar->linesize[0], width, height);
  src += static_cast<ptrdiff_t>(width) * height;
  for (int y = 0; y < height / 2; ++y) {
    uint8_t* u = planar->data[1] + static_cast<ptrdiff_t>(y) * planar->linesize[1];
    uint8_t* v = planar->data[2] + static_cast<ptrdiff_t>(y) * planar->linesize[2];
    for (int x = 0; x < width / 2; ++x) {
      v[x] = *src++;
      u[x] = *src++;
    }
  }
  return planar;
}

bool has_fixed_pixel_step(AVPixelFormat pixel_format) {
  const AVPixFmtDescriptor* format = av_pix_fmt_desc_get(pixel_format);
  if (format == nullptr) return false;
  const uint64_t excluded =
      AV_PIX_FMT_FLAG_PAL | AV_PIX_FMT_FLAG_BITSTREAM | AV_PIX_FMT_FLAG_HWACCEL;
  if (format->flags & excluded) return false;
  // Packed 4:2:2 and the like hold several pixels per step.
  const bool is_packed_yuv = !(format->flags & AV_PIX_FMT_FLAG_PLANAR) &&
                             (format->log2_chroma_w > 0 || format->log2_chroma_h > 0);
  return !is_packed_yuv;
}

FramePtr pad_to_even(const AVFrame& frame) {
  FramePtr padded = make_frame();
  const AVPixelFormat pixel_format = static_cast<AVPixelFormat>(frame.format);
  if ((frame.width % 2 == 0 && frame.height % 2 == 0) || !has_fixed_pixel_step(pixel_format)) {
    check(av_frame_ref(padded.get(), &frame), "cannot allocate a frame");
    return padded;
  }
  check(av_frame_copy_props(padded.get(), &frame), "cannot allocate a frame");
  padded->format = frame.format;
  padded->width = frame.width + frame.width % 2;
  padded->height = frame.height + frame.height % 2;
  check(av_frame_get_buffer(padded.get(), 0), "cannot allocate a frame");

  const AVPixFmtDescriptor& format = *av_pix_fmt_desc_get(pixel_format);
  const int planes = av_pix_fmt_count_planes(pixel_format);
  for (int plane = 0; plane < planes; ++plane) {
    const bool is_chroma = is_chroma_plane(format, plane);
    const int shift_x = is_chroma ? format.log2_chroma_w : 0;
    const int shift_y = is_chroma ? format.log2_chroma_h : 0;
    const int step = pixel_step(format, plane);
    const int bytes = AV_CEIL_RSHIFT(frame.width, shift_x) * step;
    const int padded_bytes = AV_CEIL_RSHIFT(padded->width, shift_x) * step;
    const int rows = AV_CEIL_RSHIFT(frame.height, shift_y);
    const int padded_rows = AV_CEIL_RSHIFT(padded->height, shift_y);
    for (int y = 0; y < padded_rows; ++y) {
      const uint8_t* src =
          frame.data[plane] + static_cast<ptrdiff_t>(std::min(y, rows - 1)) * frame.linesize[plane];
      uint8_t* dst = padded->data[plane] + static_cast<ptrdiff_t>(y) * padded->linesize[plane];
      std::memcpy(dst, src, static_cast<size_t>(bytes));
      for (int x = bytes; x < padded_bytes; ++x) dst[x] = dst[x - step];
    }
  }
  return padded;
}

}  // namespace dehaze
