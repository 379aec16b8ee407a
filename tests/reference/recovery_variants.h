// Per-byte definition of two further recoveries of NV21 frames: by tables kept per slot, and from a
// map of plain transmissions.
#pragma once

#include <cstdint>
#include <vector>

namespace haze::reference {

constexpr int kTableCodes = 160;
constexpr int kTableEntries = kTableCodes * 256;

// One slot's tables: entry code * 256 + value. Luma goes through the tone curve.
std::vector<uint32_t> luma_table(int light_luma);
std::vector<uint32_t> chroma_table(int light_chroma);

struct SlotTables {
  std::vector<uint32_t> luma;
  std::vector<uint32_t> v;
  std::vector<uint32_t> u;
};
SlotTables slot_tables(const uint8_t* light_bgr);

// Rows of the transmission map, which are row pairs of luma, that stripe 0 ... 7 covers.
struct MapRows {
  int first;
  int count;
};
MapRows recovery_stripe(int height, int stripe);

// Replaces each byte by the low byte of its entry in the given map rows; blocks with codes of 160
// and above stay.
void apply_tables(uint8_t* frame, const uint8_t* codes, const SlotTables& tables, int width,
                  int height, MapRows rows);

// A + (value - A) / t, cut to 0 ... 255 and truncated; 0 where it is not a number. No tone curve.
uint8_t divide_by_transmission(uint8_t value, int light, float t);

void recover_nv21_float(uint8_t* frame, const float* transmission, const uint8_t* light_bgr,
                        int width, int height);

}  // namespace haze::reference
