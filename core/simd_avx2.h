// 256-bit vectors under the names that the x86 kernels are written in; see simd_avx512.h. For source
// files compiled with the flags of CpuLevel::kAvx2 only.
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
    return _mm256_set1_epi32((odd << 16) | (even & 0xFFFF));
  }

  static Int bit_and(Int a, Int b) { return _mm256_and_si256(a, b); }
  static Int bit_xor(Int a, Int b) { return _mm256_xor_si256(a, b); }
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
  static Int load32(const int16_t* from) {
    return _mm256_cvtepi16_epi32(_mm_loadu_si128(reinterpret_cast<const __m128i*>(from)));
  }
  static Int load32(const int32_t* from) { return load(from); }
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
  static int first32(Int a) { return _mm_cvtsi128_si32(_mm256_castsi256_si128(a)); }
  static void store_low_bytes32(uint8_t* to, Int a) {
    const Int low_bytes =
        _mm256_setr_epi8(0, 4, 8, 12, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, 0, 4, 8, 12,
                         -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1, -1);
    const Int bytes = _mm256_permutevar8x32_epi32(_mm256_shuffle_epi8(a, low_bytes),
                                                  _mm256_setr_epi32(0, 4, 0, 4, 0, 4, 0, 4));
    _mm_storel_epi64(reinterpret_cast<__m128i*>(to), _mm256_castsi256_si128(bytes));
  }

  static Float set_float(float a) { return _mm256_set1_ps(a); }
  static Float set_alternating(float a, float b) { return _mm256_setr_ps(a, b, a, b, a, b, a, b); }
  static Float load_bytes(const uint8_t* from) {
    return _mm256_cvtepi32_ps(
        _mm256_cvtepu8_epi32(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(from))));
  }
  static Float add(Float a, Float b) { return _mm256_add_ps(a, b); }
  static Float sub(Float a, Float b) { return _mm256_sub_ps(a, b); }
  static Float mul(Float a, Float b) { return _mm256_mul_ps(a, b); }
  static Float div(Float a, Float b) { return _mm256_div_ps(a, b); }
  static Float min(Float a, Float b) { return _mm256_min_ps(a, b); }
  static Float max(Float a, Float b) { return _mm256_max_ps(a, b); }
  static Float to_float(Int a) { return _mm256_cvtepi32_ps(a); }
  static Int truncate(Float a) { return _mm256_cvttps_epi32(a); }
  static Float repeat_low(Float a) {
    return _mm256_permutevar8x32_ps(a, _mm256_setr_epi32(0, 0, 1, 1, 2, 2, 3, 3));
  }
  static Float repeat_high(Float a) {
    return _mm256_permutevar8x32_ps(a, _mm256_setr_epi32(4, 4, 5, 5, 6, 6, 7, 7));
  }

  // A table of 256 bytes as sixteen of 16. A byte shuffle gives 0 where bit 7 of the index is set;
  // adding 0x70 with saturation sets it for every byte outside 0 ... 15 and leaves the lower bits of
  // the others, so each table answers for its own range alone.
  struct Table {
    explicit Table(const uint8_t* table_bytes) : bytes(table_bytes) {}

    Int operator[](Int index) const {
      Int result = _mm256_setzero_si256();
      for (int range = 0; range < 16; ++range) {
        const Int sixteen = _mm256_broadcastsi128_si256(
            _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + 16 * range)));
        const Int own = _mm256_adds_epu8(_mm256_sub_epi8(index, set8(16 * range)), set8(0x70));
        result = _mm256_or_si256(result, _mm256_shuffle_epi8(sixteen, own));
      }
      return result;
    }

    const uint8_t* bytes;
  };
};

}  // namespace haze
