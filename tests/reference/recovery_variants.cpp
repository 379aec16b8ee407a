#include "tests/reference/recovery_variants.h"

#include <cmath>
#include <cstddef>

#include "tests/reference/frame_recovery.h"
#include "tests/reference/tone_curve.h"

namespace haze::reference {
namespace {

size_t at(int i) { return static_cast<size_t>(i); }

uint8_t entry(const std::vector<uint32_t>& table, int code, uint8_t value) {
  return static_cast<uint8_t>(table[at(code * 256 + value)] & 255u);
}

}  // namespace

std::vector<uint32_t> luma_table(int light_luma) {
  std::vector<uint32_t> table(at(kTableEntries));
  for (int code = 0; code < kTableCodes; ++code)
    for (int value = 0; value < 256; ++value)
      table[at(code * 256 + value)] =
          recover_luma(static_cast<uint8_t>(value), light_luma, recovery_factor(code));
  return table;
}

std::vector<uint32_t> chroma_table(int light_chroma) {
  std::vector<uint32_t> table(at(kTableEntries));
  for (int code = 0; code < kTableCodes; ++code)
    for (int value = 0; value < 256; ++value)
      table[at(code * 256 + value)] =
          recover_chroma(static_cast<uint8_t>(value), light_chroma, recovery_factor(code));
  return table;
}

SlotTables slot_tables(const uint8_t* light_bgr) {
  const LightYuv light = light_to_yuv(light_bgr);
  return {luma_table(light.y), chroma_table(light.v), chroma_table(light.u)};
}

MapRows recovery_stripe(int height, int stripe) {
  const int map_rows = height / 2;
  const int even = map_rows / 8 / 2 * 2;
  return {stripe * even, stripe < 7 ? even : map_rows - 7 * even};
}

void apply_tables(uint8_t* frame, const uint8_t* codes, const SlotTables& tables, int width,
                  int height, MapRows rows) {
  uint8_t* chroma = frame + width * height;
  for (int i = rows.first; i < rows.first + rows.count; ++i)
    for (int j = 0; j < width / 2; ++j) {
      const int code = codes[i * (width / 2) + j];
      if (code >= kTableCodes) continue;
      for (int y = 2 * i; y < 2 * i + 2; ++y)
        for (int x = 2 * j; x < 2 * j + 2; ++x)
          frame[y * width + x] = entry(tables.luma, code, frame[y * width + x]);
      uint8_t* pair = chroma + i * width + 2 * j;
      pair[0] = entry(tables.v, code, pair[0]);
      pair[1] = entry(tables.u, code, pair[1]);
    }
}

uint8_t divide_by_transmission(uint8_t value, int light, float t) {
  const float quotient = static_cast<float>(value - light) / t;
  const float x = static_cast<float>(light) + quotient;
  if (std::isnan(x) || x < 0.0f) return 0;
  if (x > 255.0f) return 255;
  return static_cast<uint8_t>(x);
}

void recover_nv21_float(uint8_t* frame, const float* transmission, const uint8_t* light_bgr,
                        int width, int height) {
  const LightYuv light = light_to_yuv(light_bgr);
  uint8_t* chroma = frame + width * height;
  const auto t_of = [&](int x, int y) { return transmission[y / 2 * (width / 2) + x / 2]; };
  for (int y = 0; y < height; ++y)
    for (int x = 0; x < width; ++x) {
      uint8_t& luma = frame[y * width + x];
      luma = kToneCurve[divide_by_transmission(luma, light.y, t_of(x, y))];
      if (y % 2 != 0) continue;
      uint8_t& sample = chroma[y / 2 * width + x];
      sample = divide_by_transmission(sample, x % 2 == 0 ? light.v : light.u, t_of(x, y));
    }
}

}  // namespace haze::reference
