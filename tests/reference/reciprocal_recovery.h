// Per-pixel definition of the recovery J = A + (I - A) / t by a table of reciprocals, from a
// half-resolution map of transmissions: planar frames, stripes of them, and packed frames.
#pragma once

#include <cstdint>

#include "tests/reference/frame_recovery.h"

namespace haze::reference {

// floor(65536 / n); 65536 for n = 0.
int reciprocal(int n);

// Truncates to 0 ... 255; 0 for not a number.
int reciprocal_index(float x);

struct TransmissionMap {
  const float* t;
  int width;
  int height;

  // Index for luma pixel (x, y) of the frame: blocks beyond the map count as the nearest one in it.
  int luma_index(int x, int y) const;
  // Index for both chroma samples of a block.
  int chroma_index(int block_x, int block_y) const;
};

// light + floor(reciprocal * (value - light) / 256), cut to 0 ... 255. No tone curve.
uint8_t recover_integer(int value, int light, int index);

// light + (value - light) * reciprocal / 256 in single precision, cut to 0 ... 255 and truncated.
// No tone curve.
uint8_t recover_single(int value, float light, int index);

// The light's luma and chroma without truncation.
struct LightYuvSingle {
  float y;
  float u;
  float v;
};
LightYuvSingle light_to_yuv_single(const uint8_t* light_bgr);

// Planar frames of even sizes, in place: every luma pixel recovered, in integers and in floats.
void recover_each_integer(uint8_t* frame, const float* t, const uint8_t* light_bgr, int width,
                          int height);
void recover_each_single(uint8_t* frame, const float* t, const uint8_t* light_bgr, int width,
                         int height);

// One luma pixel per block recovered, the others averaged from those; the last block column and row
// have every pixel recovered and their top-left ones twice.
void recover_anchors(uint8_t* frame, const float* t, const uint8_t* light_bgr, int width,
                     int height);

// The same for separate luma and chroma; V follows width * height / 4 bytes after U.
void recover_anchors(uint8_t* luma, uint8_t* chroma, const float* t, const LightYuv& light,
                     int width, int height);

struct LumaRows {
  int first;
  int count;
};
// Luma rows of stripe 0 ... 3 of a frame.
LumaRows quarter_stripe(int frame_height, int stripe);

// One stripe of a planar frame, with a V plane that follows the stripe's own U rows.
void recover_stripe(uint8_t* frame, const float* t, const LightYuv& light, int width, int height,
                    int stripe);

// Packed frames, four bytes Y0, Cr, Y1, Cb per pixel pair; chroma comes from the upper row of each
// block.
void recover_packed(const uint8_t* src, const float* t, const uint8_t* light_bgr, uint8_t* dst,
                    int width, int height);

}  // namespace haze::reference
