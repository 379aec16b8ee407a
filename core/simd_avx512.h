// 512-bit vectors under the names that the x86 kernels are written in. For source files compiled
// with the flags of CpuLevel::kAvx512 only.
#pragma once

#include <immintrin.h>
#include <stdint.h>

namespace haze {

struct Avx512 {
  using Int = __m512i;
  using Float = __m512;
  static constexpr int kBytes = 64;
  static constexpr int kFloats = 16;

  static Int load(const void* from) { return _mm512_loadu_si512(from); }
  static void store(void* to, Int a) { _mm512_storeu_si512(to, a); }

  static Int set8(int a) { return _mm512_set1_epi8(static_cast<char>(a)); }
  static Int set16(int a) { return _mm512_set1_epi16(static_cast<short>(a)); }
  static Int set32(int a) { return _mm512_set1_epi32(a); }
  // Pairs of 16-bit values, `even` in the lower half of each 32 bits.
  static Int set_pairs16(int even, int odd) {
    return _mm512_set1_epi32(odd * 65536 + (even & 0xFFFF));
  }

  static Int bit_and(Int a, Int b) { return _mm512_and_si512(a, b); }
  static Int bit_xor(Int a, Int b) { return _mm512_xor_si512(a, b); }
  static Int bit_or(Int a, Int b) { return _mm512_or_si512(a, b); }
  static Int add16(Int a, Int b) { return _mm512_add_epi16(a, b); }
  static Int add32(Int a, Int b) { return _mm512_add_epi32(a, b); }
  static Int min16(Int a, Int b) { return _mm512_min_epi16(a, b); }
  static Int max16(Int a, Int b) { return _mm512_max_epi16(a, b); }
  static Int max8u(Int a, Int b) { return _mm512_max_epu8(a, b); }
  // (a * b + 2^14) >> 15
  static Int round_high_product16(Int a, Int b) { return _mm512_mulhrs_epi16(a, b); }
  // Sums of the products of neighbouring 16-bit values, as 32 bits.
  static Int sum_of_products16(Int a, Int b) { return _mm512_madd_epi16(a, b); }
  template <int kBits>
  static Int shift_left16(Int a) {
    return _mm512_slli_epi16(a, kBits);
  }
  template <int kBits>
  static Int shift_right16(Int a) {
    return _mm512_srai_epi16(a, kBits);
  }
  template <int kBits>
  static Int shift_left32(Int a) {
    return _mm512_slli_epi32(a, kBits);
  }
  template <int kBits>
  static Int shift_right32(Int a) {
    return _mm512_srai_epi32(a, kBits);
  }

  // Zero bytes below the bytes of `a`, and back from 32 to 16 bits. Both work within 128-bit lanes
  // and cancel out.
  static Int low_as_high_bytes(Int a) { return _mm512_unpacklo_epi8(_mm512_setzero_si512(), a); }
  static Int high_as_high_bytes(Int a) { return _mm512_unpackhi_epi8(_mm512_setzero_si512(), a); }
  static Int narrow32(Int low, Int high) { return _mm512_packs_epi32(low, high); }

  // 16-bit values of two vectors as bytes, in order, clamped to 0 ... 255.
  static Int clamp16(Int low, Int high) {
    const Int order = _mm512_setr_epi64(0, 2, 4, 6, 1, 3, 5, 7);
    return _mm512_permutexvar_epi64(order, _mm512_packus_epi16(low, high));
  }
  // 32-bit values of four vectors as bytes, in order, clamped to 0 ... 255. Values beyond 16 bits
  // clamp as well.
  static Int clamp32(const Int (&a)[4]) {
    const Int order = _mm512_setr_epi32(0, 4, 8, 12, 1, 5, 9, 13, 2, 6, 10, 14, 3, 7, 11, 15);
    return _mm512_permutexvar_epi32(
        order, _mm512_packus_epi16(_mm512_packs_epi32(a[0], a[1]), _mm512_packs_epi32(a[2], a[3])));
  }

  // Bytes as 16-bit values.
  static Int load_bytes16(const uint8_t* from) {
    return _mm512_cvtepu8_epi16(_mm256_loadu_si256(reinterpret_cast<const __m256i*>(from)));
  }
  static Int sub16(Int a, Int b) { return _mm512_sub_epi16(a, b); }
  static Int sub32(Int a, Int b) { return _mm512_sub_epi32(a, b); }
  // Each lane plus all lanes below it.
  static Int running_sums32(Int a) {
    const Int zero = _mm512_setzero_si512();
    a = add32(a, _mm512_alignr_epi32(a, zero, 15));
    a = add32(a, _mm512_alignr_epi32(a, zero, 14));
    a = add32(a, _mm512_alignr_epi32(a, zero, 12));
    return add32(a, _mm512_alignr_epi32(a, zero, 8));
  }
  static Int repeat_last32(Int a) { return _mm512_permutexvar_epi32(set32(15), a); }
  // The low halves of 32-bit values, which are below 2^16.
  static void store_low_halves32(void* to, Int a) {
    _mm256_storeu_si256(static_cast<__m256i*>(to), _mm512_cvtepi32_epi16(a));
  }

  static Int min8u(Int a, Int b) { return _mm512_min_epu8(a, b); }
  // Bytes of a and b in turn, a first, by 128-bit lanes; as 16-bit values with b = 0.
  static Int interleave_low8(Int a, Int b) { return _mm512_unpacklo_epi8(a, b); }
  static Int interleave_high8(Int a, Int b) { return _mm512_unpackhi_epi8(a, b); }
  static Int interleave_low16(Int a, Int b) { return _mm512_unpacklo_epi16(a, b); }
  static Int interleave_high16(Int a, Int b) { return _mm512_unpackhi_epi16(a, b); }
  // 16-bit values as bytes clamped to 0 ... 255, by 128-bit lanes.
  static Int clamp16_by_lanes(Int low, Int high) { return _mm512_packus_epi16(low, high); }

  // The bytes as floats by 128-bit lanes: quarter q takes the bytes 4 q ... 4 q + 3 of each lane.
  // They come as 2^23 + byte, which is what a byte below the exponent of 2^23 means.
  static void split_bytes(Int bytes, Float (&quarters)[4]) {
    const Int exponent = set16(0x4B00);
    const Int low = _mm512_unpacklo_epi8(bytes, _mm512_setzero_si512());
    const Int high = _mm512_unpackhi_epi8(bytes, _mm512_setzero_si512());
    quarters[0] = _mm512_castsi512_ps(_mm512_unpacklo_epi16(low, exponent));
    quarters[1] = _mm512_castsi512_ps(_mm512_unpackhi_epi16(low, exponent));
    quarters[2] = _mm512_castsi512_ps(_mm512_unpacklo_epi16(high, exponent));
    quarters[3] = _mm512_castsi512_ps(_mm512_unpackhi_epi16(high, exponent));
  }
  // 32-bit values of such quarters back as bytes, clamped to 0 ... 255. Values beyond 16 bits clamp
  // as well.
  static Int join_clamped(const Int (&quarters)[4]) {
    return _mm512_packus_epi16(_mm512_packs_epi32(quarters[0], quarters[1]),
                               _mm512_packs_epi32(quarters[2], quarters[3]));
  }
  // kBytes / 2 bytes as 2^23 + byte in the order of split_pairs.
  static void load_half(const uint8_t* from, Float& low, Float& high) {
    const Int bytes = _mm512_permutexvar_epi64(
        _mm512_setr_epi64(0, 0, 1, 1, 2, 2, 3, 3),
        _mm512_castsi256_si512(_mm256_loadu_si256(reinterpret_cast<const __m256i*>(from))));
    const Int words = _mm512_unpacklo_epi8(bytes, _mm512_setzero_si512());
    low = _mm512_castsi512_ps(_mm512_unpacklo_epi16(words, set16(0x4B00)));
    high = _mm512_castsi512_ps(_mm512_unpackhi_epi16(words, set16(0x4B00)));
  }
  // Two vectors of consecutive values in the order of split_pairs.
  static void order_half(Float& low, Float& high) {
    const Float first = low;
    low = _mm512_shuffle_f32x4(first, high, 0x88);   // lanes 0 and 2 of each
    high = _mm512_shuffle_f32x4(first, high, 0xDD);  // lanes 1 and 3
  }
  // One value each of a and of b for every pair of bytes that split_bytes takes apart. Lane j of
  // `low` holds the values 8 j ... 8 j + 3, of `high` 8 j + 4 ... 8 j + 7.
  static void split_pairs(Float a_low, Float a_high, Float b_low, Float b_high,
                          Float (&quarters)[4]) {
    quarters[0] = _mm512_unpacklo_ps(a_low, b_low);
    quarters[1] = _mm512_unpackhi_ps(a_low, b_low);
    quarters[2] = _mm512_unpacklo_ps(a_high, b_high);
    quarters[3] = _mm512_unpackhi_ps(a_high, b_high);
  }
  // Quarter of the values for groups of four bytes: a, a, b, a.
  template <int kQuarter>
  static Float split_group(Float a, Float b) {
    return _mm512_mask_permute_ps(_mm512_permute_ps(a, kQuarter * 0x55), 0x4444, b,
                                  kQuarter * 0x55);
  }
  // kBytes / 2 bytes of two planes each in turn, and back.
  static Int load_in_turn(const uint8_t* first, const uint8_t* second) {
    return bit_or(load_bytes16(first), shift_left16<8>(load_bytes16(second)));
  }
  static void store_in_turn(uint8_t* first, uint8_t* second, Int a) {
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(first), _mm512_cvtepi16_epi8(a));
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(second),
                        _mm512_cvtepi16_epi8(_mm512_srli_epi16(a, 8)));
  }

  // kBytes pixels of three bytes as three vectors, and back.
  static void load_three(const uint8_t* from, Int (&channels)[3]) {
    const Int a = load(from);
    const Int b = load(from + 64);
    const Int c = load(from + 128);
    for (int channel = 0; channel < 3; ++channel) {
      const ByteOrder& order = kSplitOrder[channel];
      channels[channel] = _mm512_permutex2var_epi8(
          _mm512_permutex2var_epi8(a, load(order.first), b), load(order.second), c);
    }
  }
  static void store_three(uint8_t* to, Int a, Int b, Int c) {
    for (int part = 0; part < 3; ++part) {
      const ByteOrder& order = kJoinOrder[part];
      store(to + 64 * part,
            _mm512_permutex2var_epi8(_mm512_permutex2var_epi8(a, load(order.first), b),
                                     load(order.second), c));
    }
  }

  static Float set_float(float a) { return _mm512_set1_ps(a); }
  // a in even lanes, b in odd ones.
  static Float set_alternating(float a, float b) {
    return _mm512_castpd_ps(_mm512_set1_pd(_mm512_cvtsd_f64(
        _mm512_castps_pd(_mm512_setr_ps(a, b, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0)))));
  }
  // kFloats bytes as floats.
  static Float load_bytes(const uint8_t* from) {
    return _mm512_cvtepi32_ps(
        _mm512_cvtepu8_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i*>(from))));
  }
  static void store_floats(float* to, Float a) { _mm512_storeu_ps(to, a); }
  static Float load_floats(const float* from) { return _mm512_loadu_ps(from); }
  static Float set_four(float a, float b, float c, float d) { return _mm512_setr4_ps(a, b, c, d); }
  static Float add(Float a, Float b) { return _mm512_add_ps(a, b); }
  static Float sub(Float a, Float b) { return _mm512_sub_ps(a, b); }
  static Float mul(Float a, Float b) { return _mm512_mul_ps(a, b); }
  static Float div(Float a, Float b) { return _mm512_div_ps(a, b); }
  static Float size_of(Float a) { return _mm512_abs_ps(a); }
  // a / (b + c) in double precision, narrowed.
  static Float wide_quotient(Float a, Float b, double c) {
    const auto half = [c](__m256 x, __m256 y) {
      return _mm512_cvtpd_ps(
          _mm512_div_pd(_mm512_cvtps_pd(x), _mm512_add_pd(_mm512_cvtps_pd(y), _mm512_set1_pd(c))));
    };
    const __m256 low = half(_mm512_castps512_ps256(a), _mm512_castps512_ps256(b));
    const __m256 high = half(_mm512_extractf32x8_ps(a, 1), _mm512_extractf32x8_ps(b, 1));
    return _mm512_insertf32x8(_mm512_castps256_ps512(low), high, 1);
  }
  // a < b ? a : b and a > b ? a : b; b where either is not a number.
  static Float min(Float a, Float b) { return _mm512_min_ps(a, b); }
  static Float max(Float a, Float b) { return _mm512_max_ps(a, b); }
  static Float to_float(Int a) { return _mm512_cvtepi32_ps(a); }
  // Truncated; what is not a number becomes the least integer.
  static Int truncate(Float a) { return _mm512_cvttps_epi32(a); }
  // Whole part of a value that is not negative.
  static Float whole_part(Float a) {
    return _mm512_roundscale_ps(a, _MM_FROUND_TO_ZERO | _MM_FROUND_NO_EXC);
  }

  // A table of 256 bytes in registers.
  struct Table {
    explicit Table(const uint8_t* bytes)
        : a(load(bytes)), b(load(bytes + 64)), c(load(bytes + 128)), d(load(bytes + 192)) {}

    Int operator[](Int index) const {
      return _mm512_mask_blend_epi8(_mm512_movepi8_mask(index),
                                    _mm512_permutex2var_epi8(a, index, b),
                                    _mm512_permutex2var_epi8(c, index, d));
    }

    Int a, b, c, d;
  };

 private:
  // Indices for two byte permutations: the first takes from two vectors, the second from its result
  // (0 ... 63) and a third vector (64 ... 127).
  struct ByteOrder {
    uint8_t first[64];
    uint8_t second[64];
  };

  // Byte i of a channel is byte 3 i + channel of 192.
  static constexpr ByteOrder split_order(int channel) {
    ByteOrder order = {};
    for (int i = 0; i < 64; ++i) {
      const int source = 3 * i + channel;
      order.first[i] = static_cast<uint8_t>(source % 128);
      order.second[i] = static_cast<uint8_t>(source < 128 ? i : source - 64);
    }
    return order;
  }
  // Byte i of a part is byte (64 part + i) / 3 of channel (64 part + i) % 3.
  static constexpr ByteOrder join_order(int part) {
    ByteOrder order = {};
    for (int i = 0; i < 64; ++i) {
      const int pixel = (64 * part + i) / 3;
      const int channel = (64 * part + i) % 3;
      order.first[i] = static_cast<uint8_t>(channel == 1 ? 64 + pixel : pixel);
      order.second[i] = static_cast<uint8_t>(channel == 2 ? 64 + pixel : i);
    }
    return order;
  }
  static const ByteOrder kSplitOrder[3];
  static const ByteOrder kJoinOrder[3];
};

inline constexpr Avx512::ByteOrder Avx512::kSplitOrder[3] = {split_order(0), split_order(1),
                                                             split_order(2)};
inline constexpr Avx512::ByteOrder Avx512::kJoinOrder[3] = {join_order(0), join_order(1),
                                                            join_order(2)};

}  // namespace haze
