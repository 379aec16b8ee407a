// Minimum and maximum filters over sliding windows of any length.
//
// A window of 2^k samples is the extremum of two windows of half its length, and a window of any
// length that of two overlapping ones of the largest power of two below it:
//
//   length 1   a b c d e f g
//   length 2   ab bc cd de ..        each step combines a row with itself, shifted
//   length 4   abcd bcde ..
//   length 7   abcd + defg
//
// so the filter costs log2(window) passes whose inner loop runs over contiguous memory, for lines
// along a row as well as for bundles of columns.
#pragma once

#include <stddef.h>
#include <stdint.h>
#include <string.h>

#include "core/cpu_level.h"
#include "core/numeric.h"
#include "core/scratch.h"
#include "core/target.h"

namespace haze::filter {

#if HAZE_X86
// The vector part of combine_lines; each returns the first sample that it did not write.
size_t combine_least_bytes_avx2(const uint8_t* earlier, const uint8_t* later, uint8_t* to,
                                size_t count);
size_t combine_least_bytes_avx512(const uint8_t* earlier, const uint8_t* later, uint8_t* to,
                                  size_t count);
size_t combine_most_floats_avx2(const float* earlier, const float* later, float* to, size_t count);
size_t combine_most_floats_avx512(const float* earlier, const float* later, float* to,
                                  size_t count);
#endif

// Neutral is what samples beyond the image count as. Of equal samples the later one is taken, which
// matters for zeros of different sign.
struct LeastByte {
  using Value = uint8_t;
  static constexpr Value kNeutral = 255;
  static Value combine(Value earlier, Value later) { return earlier < later ? earlier : later; }
#if HAZE_X86
  static auto* x86() { return x86_kernel(combine_least_bytes_avx2, combine_least_bytes_avx512); }
#endif
#if HAZE_NEON
  static constexpr size_t kLanes = 16;
  static void combine_lanes(const Value* earlier, const Value* later, Value* to) {
    vst1q_u8(to, vminq_u8(vld1q_u8(earlier), vld1q_u8(later)));
  }
#endif
};

struct MostFloat {
  using Value = float;
  static constexpr Value kNeutral = -__builtin_inff();
  static Value combine(Value earlier, Value later) { return earlier > later ? earlier : later; }
#if HAZE_X86
  static auto* x86() { return x86_kernel(combine_most_floats_avx2, combine_most_floats_avx512); }
#endif
#if HAZE_NEON && defined(__aarch64__)
  static constexpr size_t kLanes = 4;
  static void combine_lanes(const Value* earlier, const Value* later, Value* to) {
    const float32x4_t a = vld1q_f32(earlier);
    const float32x4_t b = vld1q_f32(later);
    vst1q_f32(to, vbslq_f32(vcgeq_f32(b, a), b, a));
  }
#elif HAZE_NEON
  // NEON of 32-bit ARM compares numbers below the normal range as zeros, hence by their bits: as
  // integers, floats are in order, or in reverse order where both are negative. Zeros of either
  // sign are equal.
  static constexpr size_t kLanes = 4;
  static void combine_lanes(const Value* earlier, const Value* later, Value* to) {
    const int32x4_t a = vreinterpretq_s32_f32(vld1q_f32(earlier));
    const int32x4_t b = vreinterpretq_s32_f32(vld1q_f32(later));
    const int32x4_t both_negative = vshrq_n_s32(vandq_s32(a, b), 31);
    const uint32x4_t not_zeros = vtstq_s32(vorrq_s32(a, b), vdupq_n_s32(INT32_MAX));
    const uint32x4_t above = veorq_u32(vcgtq_s32(a, b), vreinterpretq_u32_s32(both_negative));
    const int32x4_t most = vbslq_s32(vandq_u32(above, not_zeros), a, b);
    vst1q_f32(to, vreinterpretq_f32_s32(most));
  }
#endif
};

// The same for planes without zeros and numbers below the normal range.
struct MostNormalFloat : MostFloat {
#if HAZE_NEON
  static constexpr size_t kLanes = 4;
  static void combine_lanes(const Value* earlier, const Value* later, Value* to) {
    vst1q_f32(to, vmaxq_f32(vld1q_f32(earlier), vld1q_f32(later)));
  }
#endif
};

// to[i] = combine(earlier[i], later[i]). The ranges do not overlap `to`.
template <typename Extremum>
inline void combine_lines(const typename Extremum::Value* earlier,
                          const typename Extremum::Value* later,
                          typename Extremum::Value* __restrict to, size_t count) {
  size_t i = 0;
#if HAZE_NEON
  constexpr size_t kLanes = Extremum::kLanes;
  const size_t whole = count - count % (2 * kLanes);
  for (const typename Extremum::Value* const stop = to + whole; to != stop; to += 2 * kLanes) {
    Extremum::combine_lanes(earlier, later, to);
    Extremum::combine_lanes(earlier + kLanes, later + kLanes, to + kLanes);
    earlier += 2 * kLanes;
    later += 2 * kLanes;
  }
  count -= whole;
#elif HAZE_X86
  if (const auto kernel = Extremum::x86()) i = kernel(earlier, later, to, count);
#endif
#if HAZE_NEON && defined(__clang__)
#pragma clang loop vectorize(disable)  // by the same comparison of NEON
#endif
  for (; i < count; ++i) to[i] = Extremum::combine(earlier[i], later[i]);
}

// Two buffers that hold a bundle of lines, with room for `radius` samples beyond both ends.
template <typename Extremum>
class WindowLines {
 public:
  using Value = typename Extremum::Value;

  // For lines of `samples` samples, `bundle` of them side by side. A radius beyond the line is cut
  // to its length, where the window already covers all of it.
  WindowLines(int samples, int radius, int bundle)
      : samples_(static_cast<size_t>(samples)),
        radius_(static_cast<size_t>(min(radius, samples))),
        bundle_(static_cast<size_t>(bundle)),
        buffers_(2 * padded()) {}

  explicit operator bool() const { return static_cast<bool>(buffers_); }

  // From now on this many lines side by side, at most as many as at first.
  void narrow_to(int bundle) { bundle_ = static_cast<size_t>(bundle); }

  // Where sample i of the lines goes, for `bundle` values. To be filled before each filter().
  Value* sample(int i) { return buffers_.data() + (radius_ + static_cast<size_t>(i)) * bundle_; }

  // Extrema of the windows i - radius ... i + radius of all lines, sample by sample like the input.
  const Value* filter() {
    Value* from = buffers_.data();
    Value* to = from + padded();
    const size_t border = radius_ * bundle_;
    for (size_t i = 0; i < border; ++i) {
      from[i] = Extremum::kNeutral;
      from[padded() - 1 - i] = Extremum::kNeutral;
    }
    const size_t window = 2 * radius_ + 1;
    size_t have = 1;
    size_t left = padded();  // values for which windows of length `have` are known
    while (2 * have <= window) {
      left -= have * bundle_;
      combine_lines<Extremum>(from, from + have * bundle_, to, left);
      Value* const filled = to;
      to = from;
      from = filled;
      have *= 2;
    }
    if (have == window) return from;
    combine_lines<Extremum>(from, from + (window - have) * bundle_, to, samples_ * bundle_);
    return to;
  }

 private:
  size_t padded() const { return (samples_ + 2 * radius_) * bundle_; }

  size_t samples_;
  size_t radius_;
  size_t bundle_;
  Scratch<Value> buffers_;
};

// One line of `samples` contiguous samples; outputs lie `dst_stride` apart and are also given to
// visit(output). If memory is short, or the radius negative, nothing is written.
template <typename Extremum, typename Visit>
inline void filter_line(const typename Extremum::Value* src, typename Extremum::Value* dst,
                        int samples, ptrdiff_t dst_stride, int radius, Visit visit) {
  if (samples < 1 || radius < 0) return;
  WindowLines<Extremum> line(samples, radius, 1);
  if (!line) return;
  memcpy(line.sample(0), src, static_cast<size_t>(samples) * sizeof *src);
  const typename Extremum::Value* const extrema = line.filter();
  for (int i = 0; i < samples; ++i) {
    dst[i * dst_stride] = extrema[i];
    visit(extrema[i]);
  }
}

template <typename Extremum>
inline void filter_line(const typename Extremum::Value* src, typename Extremum::Value* dst,
                        int samples, ptrdiff_t dst_stride, int radius) {
  filter_line<Extremum>(src, dst, samples, dst_stride, radius, [](typename Extremum::Value) {});
}

// All rows of an image whose rows lie `stride` samples apart, one after the other in `line`.
template <typename Extremum>
inline void filter_rows(WindowLines<Extremum>& line, const typename Extremum::Value* src,
                        typename Extremum::Value* dst, int width, int height, ptrdiff_t stride) {
  const size_t bytes = static_cast<size_t>(width) * sizeof *src;
  for (int y = 0; y < height; ++y) {
    memcpy(line.sample(0), src + y * stride, bytes);
    memcpy(dst + y * stride, line.filter(), bytes);
  }
}

// The same in memory of its own; false, with nothing written, if there is none.
template <typename Extremum>
inline bool filter_rows(const typename Extremum::Value* src, typename Extremum::Value* dst,
                        int width, int height, ptrdiff_t stride, int radius) {
  if (width < 1 || height < 1 || radius < 0) return false;
  WindowLines<Extremum> line(width, radius, 1);
  if (!line) return false;
  filter_rows(line, src, dst, width, height, stride);
  return true;
}

// Columns that are filtered side by side: a few cache lines, wide enough to read whole lines,
// narrow enough to stay in the second-level cache.
template <typename Extremum>
constexpr int column_bundle(int width) {
  return min(static_cast<int>(512 / sizeof(typename Extremum::Value)), width);
}

// All columns, column_bundle() of them at a time in `columns`.
template <typename Extremum>
inline void filter_columns(WindowLines<Extremum>& columns, const typename Extremum::Value* src,
                           typename Extremum::Value* dst, int width, int height, ptrdiff_t stride) {
  const int most = column_bundle<Extremum>(width);
  for (int x = 0; x < width; x += most) {
    const int bundle = min(most, width - x);
    columns.narrow_to(bundle);
    const size_t bytes = static_cast<size_t>(bundle) * sizeof *src;
    for (int y = 0; y < height; ++y) memcpy(columns.sample(y), src + y * stride + x, bytes);
    const typename Extremum::Value* const extrema = columns.filter();
    for (int y = 0; y < height; ++y) memcpy(dst + y * stride + x, extrema + y * bundle, bytes);
  }
}

// The same in memory of its own; false, with nothing written, if there is none.
template <typename Extremum>
inline bool filter_columns(const typename Extremum::Value* src, typename Extremum::Value* dst,
                           int width, int height, ptrdiff_t stride, int radius) {
  if (width < 1 || height < 1 || radius < 0) return false;
  WindowLines<Extremum> columns(height, radius, column_bundle<Extremum>(width));
  if (!columns) return false;
  filter_columns(columns, src, dst, width, height, stride);
  return true;
}

// Lines of samples in an image, along the rows or down the columns.
struct ImageLines {
  int count;
  ptrdiff_t step;  // from one line to the next
  int samples;     // of a line
  ptrdiff_t sample_step;
};

// Extrema of all lines without any memory, each window searched through: for workers, which have no
// way to tell that memory is short.
template <typename Extremum>
inline void search_lines(const typename Extremum::Value* src, typename Extremum::Value* dst,
                         ImageLines lines, int radius) {
  for (int line = 0; line < lines.count; ++line) {
    const ptrdiff_t start = line * lines.step;
    for (int i = 0; i < lines.samples; ++i) {
      // radius is compared before it is added: it may be any number from 0 on.
      const int first = radius < i ? i - radius : 0;
      const int last = radius < lines.samples - 1 - i ? i + radius : lines.samples - 1;
      typename Extremum::Value extremum = Extremum::kNeutral;
      for (int j = first; j <= last; ++j)
        extremum = Extremum::combine(extremum, src[start + j * lines.sample_step]);
      dst[start + i * lines.sample_step] = extremum;
    }
  }
}

}  // namespace haze::filter
