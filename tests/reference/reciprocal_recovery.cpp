#include "tests/reference/reciprocal_recovery.h"

#include <algorithm>
#include <cstddef>
#include <vector>

#include "tests/reference/tone_curve.h"

namespace haze::reference {
namespace {

size_t at(int i) { return static_cast<size_t>(i); }

int floor_of_256th(int value) {
  const int quotient = value / 256;
  return value % 256 < 0 ? quotient - 1 : quotient;
}

uint8_t recover_luma_integer(int value, int light, int index) {
  return kToneCurve[recover_integer(value, light, index)];
}

TransmissionMap map_of_frame(const float* t, int width, int height) {
  return {t, width / 2, height / 2};
}

// Both chroma planes of a frame or a stripe.
template <class Recover, class Light>
void recover_chroma_planes(uint8_t* chroma, const TransmissionMap& map, const Light& light,
                           Recover recover) {
  uint8_t* u = chroma;
  uint8_t* v = chroma + map.width * map.height;
  for (int by = 0; by < map.height; ++by)
    for (int bx = 0; bx < map.width; ++bx) {
      const int index = map.chroma_index(bx, by);
      *u = recover(*u, light.u, index);
      *v = recover(*v, light.v, index);
      ++u;
      ++v;
    }
}

template <class Recover, class Light>
void recover_each(uint8_t* frame, const float* t, const Light& light, int width, int height,
                  Recover recover) {
  const TransmissionMap map = map_of_frame(t, width, height);
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      uint8_t& luma = frame[y * width + x];
      luma = kToneCurve[recover(luma, light.y, map.luma_index(x, y))];
    }
  recover_chroma_planes(frame + width * height, map, light, recover);
}

}  // namespace

int reciprocal(int n) { return n == 0 ? 65536 : 65536 / n; }

int reciprocal_index(float x) {
  if (!(x > 0.0f)) return 0;
  return x >= 255.0f ? 255 : static_cast<int>(x);
}

int TransmissionMap::luma_index(int x, int y) const {
  const int bx = x / 2;
  const int by = y / 2;
  const auto sample = [&](int column, int row) {
    return t[std::min(row, height - 1) * width + std::min(column, width - 1)];
  };
  const float own = sample(bx, by);
  const bool odd_column = x % 2 != 0;
  const bool odd_row = y % 2 != 0;
  if (odd_column && odd_row) {
    float sum = own + sample(bx + 1, by);
    sum = sum + sample(bx, by + 1);
    sum = sum + sample(bx + 1, by + 1);
    return reciprocal_index(-1.0f + sum * 64.0f);
  }
  if (odd_column) return reciprocal_index(-1.0f + (own + sample(bx + 1, by)) * 128.0f);
  if (odd_row) return reciprocal_index(-1.0f + (own + sample(bx, by + 1)) * 128.0f);
  return reciprocal_index(own * 255.0f);
}

int TransmissionMap::chroma_index(int block_x, int block_y) const {
  return reciprocal_index(t[block_y * width + block_x] * 255.0f);
}

uint8_t recover_integer(int value, int light, int index) {
  const int x = light + floor_of_256th(reciprocal(index) * (value - light));
  return static_cast<uint8_t>(std::min(std::max(x, 0), 255));
}

uint8_t recover_single(int value, float light, int index) {
  const float factor = static_cast<float>(reciprocal(index) * 0.00390625);
  const float difference = static_cast<float>(value) - light;
  const float product = difference * factor;
  const float x = light + product;
  if (x > 255.0f) return 255;
  if (x < 0.0f) return 0;
  return static_cast<uint8_t>(x);
}

LightYuvSingle light_to_yuv_single(const uint8_t* light_bgr) {
  const double green = light_bgr[1] * 0.587;
  const double blue = light_bgr[0] * 0.114;
  const double red = light_bgr[2] * 0.299;
  const double sum = green + blue;
  const float y = static_cast<float>(sum + red);
  const float u_difference = static_cast<float>(light_bgr[0]) - y;
  const float v_difference = static_cast<float>(light_bgr[2]) - y;
  const double u_offset = static_cast<double>(u_difference) * 0.564;
  const double v_offset = static_cast<double>(v_difference) * 0.713;
  return {y, static_cast<float>(128.0 + u_offset), static_cast<float>(128.0 + v_offset)};
}

void recover_each_integer(uint8_t* frame, const float* t, const uint8_t* light_bgr, int width,
                          int height) {
  recover_each(frame, t, light_to_yuv(light_bgr), width, height, recover_integer);
}

void recover_each_single(uint8_t* frame, const float* t, const uint8_t* light_bgr, int width,
                         int height) {
  recover_each(frame, t, light_to_yuv_single(light_bgr), width, height, recover_single);
}

void recover_anchors(uint8_t* frame, const float* t, const uint8_t* light_bgr, int width,
                     int height) {
  recover_anchors(frame, frame + width * height, t, light_to_yuv(light_bgr), width, height);
}

void recover_anchors(uint8_t* luma, uint8_t* chroma, const float* t, const LightYuv& light,
                     int width, int height) {
  const TransmissionMap map = map_of_frame(t, width, height);
  // Once recovered top-left pixels by block, from the untouched frame.
  std::vector<int> anchors;
  for (int y = 0; y < height; y += 2)
    for (int x = 0; x < width; x += 2)
      anchors.push_back(recover_luma_integer(luma[y * width + x], light.y, map.luma_index(x, y)));
  const auto anchor = [&](int bx, int by) { return anchors[at(by * map.width + bx)]; };

  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int bx = x / 2;
      const int by = y / 2;
      const bool odd_column = x % 2 != 0;
      const bool odd_row = y % 2 != 0;
      uint8_t& out = luma[y * width + x];
      if (bx == map.width - 1 || by == map.height - 1) {
        const int value = odd_column || odd_row ? out : anchor(bx, by);
        out = recover_luma_integer(value, light.y, map.luma_index(x, y));
      } else {
        int sum = anchor(bx, by);
        int count = 1;
        if (odd_column) sum += anchor(bx + 1, by), ++count;
        if (odd_row) sum += anchor(bx, by + 1), ++count;
        if (odd_column && odd_row) sum += anchor(bx + 1, by + 1), ++count;
        out = static_cast<uint8_t>(sum / count);
      }
    }
  recover_chroma_planes(chroma, map, light, recover_integer);
}

LumaRows quarter_stripe(int frame_height, int stripe) {
  const int rows = frame_height / 4 / 2 * 2;
  return {stripe * rows, stripe < 3 ? rows : frame_height - 3 * rows};
}

void recover_stripe(uint8_t* frame, const float* t, const LightYuv& light, int width, int height,
                    int stripe) {
  const LumaRows rows = quarter_stripe(height, stripe);
  const int map_row = rows.first / 2;
  recover_anchors(frame + width * rows.first, frame + width * height + width / 2 * map_row,
                  t + map_row * (width / 2), light, width, rows.count);
}

void recover_packed(const uint8_t* src, const float* t, const uint8_t* light_bgr, uint8_t* dst,
                    int width, int height) {
  const TransmissionMap map = map_of_frame(t, width, height);
  const LightYuv light = light_to_yuv(light_bgr);
  const int row_bytes = 2 * width;
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      const int luma = y * row_bytes + 2 * x;
      dst[luma] = recover_luma_integer(src[luma], light.y, map.luma_index(x, y));
      const int light_chroma = x % 2 == 0 ? light.v : light.u;
      dst[luma + 1] = recover_integer(src[y / 2 * 2 * row_bytes + 2 * x + 1], light_chroma,
                                      map.chroma_index(x / 2, y / 2));
    }
}

}  // namespace haze::reference
