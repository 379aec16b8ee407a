// 256-bit vectors under the names that the x86 kernels are written in; see simd_avx512.h. For
// source files compiled with the flags of CpuLevel::kAvx2 only.
#pragma once

#include <immintrin.h>
#include <stdint.h>

namespace haze {

struct Avx2 {
  using Int = __m256i;
  using Float = __m256;
  static constexpr int kBytes = 32;
  static constexpr int kFloats = 8;

  static Int load(const void* from) {
    return _mm256_loadu_si256(static_cast<const __m256i*>(from));
  }
  static void store(void* to, Int a) { _mm256_storeu_si256(static_cast<__m256i*>(to), a); }
  static void store_halves(void* low, void* high, Int a) {
    _mm_storeu_si128(static_cast<__m128i*>(low), _mm256_castsi256_si128(a));
    _mm_storeu_si128(static_cast<__m128i*>(high), _mm256_extracti128_si256(a, 1));
  }

  static Int set8(int a) { return _mm256_set1_epi8(static_cast<char>(a)); }
  static Int set16(int a) { return _mm256_set1_epi16(static_cast<short>(a)); }
  static Int set32(int a) { return _mm256_set1_epi32(a); }
  static Int set_pairs16(int even, int odd) {
    return _mm256_set1_epi32(odd * 65536 + (even & 0xFFFF));
  }

  static Int bit_and(Int a, Int b) { return _mm256_and_si256(a, b); }
  static Int bit_xor(Int a, Int b) { return _mm256_xor_si256(a, b); }
  static Int bit_or(Int a, Int b) { return _mm256_or_si256(a, b); }
  static Int add16(Int a, Int b) { return _mm256_add_epi16(a, b); }
  static Int add32(Int a, Int b) { return _mm256_add_epi32(a, b); }
  static Int min16(Int a, Int b) { return _mm256_min_epi16(a, b); }
  static Int max16(Int a, Int b) { return _mm256_max_epi16(a, b); }
  static Int max8u(Int a, Int b) { return _mm256_max_epu8(a, b); }
  static Int round_high_product16(Int a, Int b) { return _mm256_mulhrs_epi16(a, b); }
  static Int sum_of_products16(Int a, Int b) { return _mm256_madd_epi16(a, b); }
  template <int kBits>
  static Int shift_left16(Int a) {
    return _mm256_slli_epi16(a, kBits);
  }
  template <int kBits>
  static Int shift_right16(Int a) {
    return _mm256_srai_epi16(a, kBits);
  }
  template <int kBits>
  static Int shift_left32(Int a) {
    return _mm256_slli_epi32(a, kBits);
  }
  template <int kBits>
  static Int shift_right32(Int a) {
    return _mm256_srai_epi32(a, kBits);
  }

  static Int low_as_high_bytes(Int a) { return _mm256_unpacklo_epi8(_mm256_setzero_si256(), a); }
  static Int high_as_high_bytes(Int a) { return _mm256_unpackhi_epi8(_mm256_setzero_si256(), a); }
  static Int narrow32(Int low, Int high) { return _mm256_packs_epi32(low, high); }

  static Int clamp16(Int low, Int high) {
    return _mm256_permute4x64_epi64(_mm256_packus_epi16(low, high), 0xD8);  // 0, 2, 1, 3
  }
  static Int clamp32(const Int (&a)[4]) {
    const Int order = _mm256_setr_epi32(0, 4, 1, 5, 2, 6, 3, 7);
    return _mm256_permutevar8x32_epi32(
        _mm256_packus_epi16(_mm256_packs_epi32(a[0], a[1]), _mm256_packs_epi32(a[2], a[3])), order);
  }

  static Int load_bytes16(const uint8_t* from) {
    return _mm256_cvtepu8_epi16(_mm_loadu_si128(reinterpret_cast<const __m128i*>(from)));
  }
  static Int sub16(Int a, Int b) { return _mm256_sub_epi16(a, b); }
  static Int sub32(Int a, Int b) { return _mm256_sub_epi32(a, b); }
  static Int running_sums32(Int a) {
    a = add32(a, _mm256_slli_si256(a, 4));
    a = add32(a, _mm256_slli_si256(a, 8));
    // The lower half's total, in the upper half alone.
    const Int total = _mm256_permutevar8x32_epi32(a, set32(3));
    return add32(a, _mm256_blend_epi32(_mm256_setzero_si256(), total, 0xF0));
  }
  static Int repeat_last32(Int a) { return _mm256_permutevar8x32_epi32(a, set32(7)); }
  static void store_low_halves32(void* to, Int a) {
    const Int halves = _mm256_permute4x64_epi64(_mm256_packus_epi32(a, a), 0x08);  // 0, 2
    _mm_storeu_si128(static_cast<__m128i*>(to), _mm256_castsi256_si128(halves));
  }

  static Int min8u(Int a, Int b) { return _mm256_min_epu8(a, b); }
  static Int interleave_low8(Int a, Int b) { return _mm256_unpacklo_epi8(a, b); }
  static Int interleave_high8(Int a, Int b) { return _mm256_unpackhi_epi8(a, b); }
  static Int interleave_low16(Int a, Int b) { return _mm256_unpacklo_epi16(a, b); }
  static Int interleave_high16(Int a, Int b) { return _mm256_unpackhi_epi16(a, b); }
  static Int clamp16_by_lanes(Int low, Int high) { return _mm256_packus_epi16(low, high); }

  static void split_bytes(Int bytes, Float (&quarters)[4]) {
    const Int exponent = set16(0x4B00);
    const Int low = _mm256_unpacklo_epi8(bytes, _mm256_setzero_si256());
    const Int high = _mm256_unpackhi_epi8(bytes, _mm256_setzero_si256());
    quarters[0] = _mm256_castsi256_ps(_mm256_unpacklo_epi16(low, exponent));
    quarters[1] = _mm256_castsi256_ps(_mm256_unpackhi_epi16(low, exponent));
    quarters[2] = _mm256_castsi256_ps(_mm256_unpacklo_epi16(high, exponent));
    quarters[3] = _mm256_castsi256_ps(_mm256_unpackhi_epi16(high, exponent));
  }
  static Int join_clamped(const Int (&quarters)[4]) {
    return _mm256_packus_epi16(_mm256_packs_epi32(quarters[0], quarters[1]),
                               _mm256_packs_epi32(quarters[2], quarters[3]));
  }
  static void load_half(const uint8_t* from, Float& low, Float& high) {
    const Int bytes = _mm256_permute4x64_epi64(
        _mm256_castsi128_si256(_mm_loadu_si128(reinterpret_cast<const __m128i*>(from))),
        0x50);  // 0, 0, 1, 1
    const Int words = _mm256_unpacklo_epi8(bytes, _mm256_setzero_si256());
    low = _mm256_castsi256_ps(_mm256_unpacklo_epi16(words, set16(0x4B00)));
    high = _mm256_castsi256_ps(_mm256_unpackhi_epi16(words, set16(0x4B00)));
  }
  static void order_half(Float& low, Float& high) {
    const Float first = low;
    low = _mm256_permute2f128_ps(first, high, 0x20);
    high = _mm256_permute2f128_ps(first, high, 0x31);
  }
  static void split_pairs(Float a_low, Float a_high, Float b_low, Float b_high,
                          Float (&quarters)[4]) {
    quarters[0] = _mm256_unpacklo_ps(a_low, b_low);
    quarters[1] = _mm256_unpackhi_ps(a_low, b_low);
    quarters[2] = _mm256_unpacklo_ps(a_high, b_high);
    quarters[3] = _mm256_unpackhi_ps(a_high, b_high);
  }
  template <int kQuarter>
  static Float split_group(Float a, Float b) {
    return _mm256_blend_ps(_mm256_permute_ps(a, kQuarter * 0x55),
                           _mm256_permute_ps(b, kQuarter * 0x55), 0x44);
  }
  static Int load_in_turn(const uint8_t* first, const uint8_t* second) {
    return bit_or(load_bytes16(first), shift_left16<8>(load_bytes16(second)));
  }
  static void store_in_turn(uint8_t* first, uint8_t* second, Int a) {
    store_halves(first, second, clamp16(bit_and(a, set16(0x00FF)), _mm256_srli_epi16(a, 8)));
  }

  // Each 128-bit lane holds sixteen pixels in three chunks of sixteen bytes. At offset o of chunk c
  // stands channel (c + o) % 3, so a channel is picked from the chunks by offset alone and then put
  // in order within the lane.
  static void load_three(const uint8_t* from, Int (&channels)[3]) {
    const Int chunks[3] = {load_lanes(from, from + 48), load_lanes(from + 16, from + 64),
                           load_lanes(from + 32, from + 80)};
    for (int channel = 0; channel < 3; ++channel)
      channels[channel] = _mm256_shuffle_epi8(
          pick(chunks[channel], chunks[(channel + 2) % 3], chunks[(channel + 1) % 3]),
          repeat_lane(kSplitOrder[channel].bytes));
  }
  static void store_three(uint8_t* to, Int a, Int b, Int c) {
    const Int x = _mm256_shuffle_epi8(a, repeat_lane(kJoinOrder[0].bytes));
    const Int y = _mm256_shuffle_epi8(b, repeat_lane(kJoinOrder[1].bytes));
    const Int z = _mm256_shuffle_epi8(c, repeat_lane(kJoinOrder[2].bytes));
    const Int chunks[3] = {pick(x, y, z), pick(y, z, x), pick(z, x, y)};
    for (int chunk = 0; chunk < 3; ++chunk)
      store_halves(to + 16 * chunk, to + 48 + 16 * chunk, chunks[chunk]);
  }

  static Float set_float(float a) { return _mm256_set1_ps(a); }
  static Float set_alternating(float a, float b) { return _mm256_setr_ps(a, b, a, b, a, b, a, b); }
  static Float load_bytes(const uint8_t* from) {
    return _mm256_cvtepi32_ps(
        _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(from))));
  }
  static void store_floats(float* to, Float a) { _mm256_storeu_ps(to, a); }
  static Float load_floats(const float* from) { return _mm256_loadu_ps(from); }
  static Float set_four(float a, float b, float c, float d) {
    return _mm256_setr_ps(a, b, c, d, a, b, c, d);
  }
  static Float add(Float a, Float b) { return _mm256_add_ps(a, b); }
  static Float sub(Float a, Float b) { return _mm256_sub_ps(a, b); }
  static Float mul(Float a, Float b) { return _mm256_mul_ps(a, b); }
  static Float div(Float a, Float b) { return _mm256_div_ps(a, b); }
  static Float size_of(Float a) { return _mm256_andnot_ps(set_float(-0.0f), a); }
  static Float wide_quotient(Float a, Float b, double c) {
    const auto half = [c](__m128 x, __m128 y) {
      return _mm256_cvtpd_ps(
          _mm256_div_pd(_mm256_cvtps_pd(x), _mm256_add_pd(_mm256_cvtps_pd(y), _mm256_set1_pd(c))));
    };
    const __m128 low = half(_mm256_castps256_ps128(a), _mm256_castps256_ps128(b));
    const __m128 high = half(_mm256_extractf128_ps(a, 1), _mm256_extractf128_ps(b, 1));
    return _mm256_insertf128_ps(_mm256_castps128_ps256(low), high, 1);
  }
  static Float min(Float a, Float b) { return _mm256_min_ps(a, b); }
  static Float max(Float a, Float b) { return _mm256_max_ps(a, b); }
  static Float to_float(Int a) { return _mm256_cvtepi32_ps(a); }
  static Int truncate(Float a) { return _mm256_cvttps_epi32(a); }
  static Float whole_part(Float a) {
    return _mm256_round_ps(a, _MM_FROUND_TO_ZERO | _MM_FROUND_NO_EXC);
  }

  // A table of 256 bytes as sixteen of 16: all are looked up at the lower half of the index, and
  // its upper four bits choose between neighbours, then between pairs, and so on.
  struct Table {
    explicit Table(const uint8_t* table_bytes) : bytes(table_bytes) {}

    Int operator[](Int index) const {
      const Int low_half = bit_and(index, set8(0x0F));
      // A bit to choose by has to be the highest of its byte.
      const Int bit4 = shift_left16<3>(index);
      const Int bit5 = shift_left16<2>(index);
      const Int bit6 = shift_left16<1>(index);
      const auto sixteen = [&](int range) {
        return _mm256_shuffle_epi8(repeat_lane(bytes + 16 * range), low_half);
      };
      const auto sixty_four = [&](int range) {
        return _mm256_blendv_epi8(_mm256_blendv_epi8(sixteen(range), sixteen(range + 1), bit4),
                                  _mm256_blendv_epi8(sixteen(range + 2), sixteen(range + 3), bit4),
                                  bit5);
      };
      return _mm256_blendv_epi8(_mm256_blendv_epi8(sixty_four(0), sixty_four(4), bit6),
                                _mm256_blendv_epi8(sixty_four(8), sixty_four(12), bit6), index);
    }

    const uint8_t* bytes;
  };

 private:
  struct LaneOrder {
    uint8_t bytes[16];
  };

  // Byte i of a channel stands at offset (3 i + channel) % 16 of its chunk.
  static constexpr LaneOrder split_order(int channel) {
    LaneOrder order = {};
    for (int i = 0; i < 16; ++i) order.bytes[i] = static_cast<uint8_t>((3 * i + channel) % 16);
    return order;
  }
  static constexpr LaneOrder join_order(int channel) {
    LaneOrder order = {};
    for (int i = 0; i < 16; ++i) order.bytes[(3 * i + channel) % 16] = static_cast<uint8_t>(i);
    return order;
  }
  static const LaneOrder kSplitOrder[3];
  static const LaneOrder kJoinOrder[3];

  static Int load_lanes(const uint8_t* low, const uint8_t* high) {
    return _mm256_inserti128_si256(
        _mm256_castsi128_si256(_mm_loadu_si128(reinterpret_cast<const __m128i*>(low))),
        _mm_loadu_si128(reinterpret_cast<const __m128i*>(high)), 1);
  }
  static Int repeat_lane(const uint8_t* bytes) {
    return _mm256_broadcastsi128_si256(_mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes)));
  }
  // Bytes of a, b and c at the offsets 0, 1 and 2 modulo 3 of each lane.
  static Int pick(Int a, Int b, Int c) {
    const Int second = _mm256_setr_epi8(0, -1, 0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0, 0, -1,
                                        0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0);
    const Int third = _mm256_setr_epi8(0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0, 0,
                                       -1, 0, 0, -1, 0, 0, -1, 0, 0, -1, 0, 0, -1, 0);
    return _mm256_blendv_epi8(_mm256_blendv_epi8(a, b, second), c, third);
  }
};

inline constexpr Avx2::LaneOrder Avx2::kSplitOrder[3] = {split_order(0), split_order(1),
                                                         split_order(2)};
inline constexpr Avx2::LaneOrder Avx2::kJoinOrder[3] = {join_order(0), join_order(1),
                                                        join_order(2)};

}  // namespace haze
