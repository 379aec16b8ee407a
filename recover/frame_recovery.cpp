#include "recover/frame_recovery.h"
#include "core/image_size.h"

#include <stddef.h>

#include "core/numeric.h"
#include "haze_preview.h"
#include "recover/frame_recovery_kernels.h"
#include "recover/frame_recovery_neon.h"

namespace haze::recover {
namespace {

// Recovered bytes by lookup, for codes below kTableCodes.
struct FromTables {
  const RecoveryTables& tables;

  const CodeTable& operator()(int code) const { return tables.codes[code]; }
  int leading_blocks(BlockRow, const uint8_t*, int, ChromaLayout) const { return 0; }
};

// Recovered bytes by the formula, for every code.
struct FromFormula {
  struct Samples {
    struct Luma {
      int anchor;
      float factor;
      uint8_t operator[](int sample) const {
        return LutTablePreview[recover_sample(anchor, factor, sample)];
      }
    };
    struct Chroma {
      int anchor;
      float factor;
      uint8_t operator[](int sample) const { return recover_sample(anchor, factor, sample); }
    };
    Luma luma;
    Chroma v;
    Chroma u;
  };
  LightAnchor anchor;

  Samples operator()(int code) const {
    const float factor = recovery_factor(code);
    return {{anchor.y, factor}, {anchor.v, factor}, {anchor.u, factor}};
  }

  // Recovers the row's first blocks in vectors where there are any; returns how many.
  int leading_blocks(BlockRow row, const uint8_t* codes, int blocks, ChromaLayout layout) const {
#if HAZE_NEON
    return layout == ChromaLayout::kInterleavedVu
               ? recover_blocks_neon<ChromaLayout::kInterleavedVu>(row, codes, blocks, anchor,
                                                                   LutTablePreview)
               : recover_blocks_neon<ChromaLayout::kPlanarUv>(row, codes, blocks, anchor,
                                                              LutTablePreview);
#elif HAZE_X86
    if (const auto kernel =
            layout == ChromaLayout::kInterleavedVu
                ? x86_kernel(recover_nv21_blocks_avx2, recover_nv21_blocks_avx512)
                : x86_kernel(recover_planar_blocks_avx2, recover_planar_blocks_avx512))
      return kernel(row, codes, blocks, anchor, LutTablePreview);
#endif
    (void)row, (void)codes, (void)blocks, (void)layout;
    return 0;
  }
};

// Blocks [begin, end); `kChromaStep` bytes lie between chroma samples of one kind.
template <int kChromaStep, typename Recovered>
void recover_blocks(BlockRow row, const uint8_t* codes, int begin, int end, Recovered recovered) {
  for (int x = begin; x < end; ++x) {
    const auto& to = recovered(codes[x]);
    row.luma_top[2 * x] = to.luma[row.luma_top[2 * x]];
    row.luma_top[2 * x + 1] = to.luma[row.luma_top[2 * x + 1]];
    row.luma_bottom[2 * x] = to.luma[row.luma_bottom[2 * x]];
    row.luma_bottom[2 * x + 1] = to.luma[row.luma_bottom[2 * x + 1]];
    row.v[kChromaStep * x] = to.v[row.v[kChromaStep * x]];
    row.u[kChromaStep * x] = to.u[row.u[kChromaStep * x]];
  }
}

// A packed frame of even size with its map of transmission codes.
struct MappedFrame {
  uint8_t* frame;
  CodeMap map;
  int width;
  int height;
  ChromaLayout layout;

  int blocks() const { return width / 2; }
  int block_rows() const { return height / 2; }
  const uint8_t* codes(int y) const {
    return map.codes + static_cast<ptrdiff_t>(y) * map.row_bytes;
  }
  BlockRow row(int y) const {
    const ptrdiff_t luma_bytes = static_cast<ptrdiff_t>(width) * height;
    uint8_t* const luma = frame + static_cast<ptrdiff_t>(2 * y) * width;
    if (layout == ChromaLayout::kInterleavedVu) {
      uint8_t* const vu = frame + luma_bytes + static_cast<ptrdiff_t>(y) * width;
      return {luma, luma + width, vu, vu + 1};
    }
    uint8_t* const u = frame + luma_bytes + static_cast<ptrdiff_t>(y) * blocks();
    return {luma, luma + width, u + luma_bytes / 4, u};
  }
};

template <typename Recovered>
void recover_with(const MappedFrame& frame, Recovered recovered) {
  for (int y = 0; y < frame.block_rows(); ++y) {
    const BlockRow row = frame.row(y);
    const uint8_t* const codes = frame.codes(y);
    const int done = recovered.leading_blocks(row, codes, frame.blocks(), frame.layout);
    if (frame.layout == ChromaLayout::kInterleavedVu)
      recover_blocks<2>(row, codes, done, frame.blocks(), recovered);
    else
      recover_blocks<1>(row, codes, done, frame.blocks(), recovered);
  }
}

bool has_table_for_all(const MappedFrame& frame) {
  uint8_t most = 0;
  for (int y = 0; y < frame.block_rows(); ++y)
    for (int x = 0; x < frame.blocks(); ++x) most = max(most, frame.codes(y)[x]);
  return most < kTableCodes;
}

// Whether vectors do the arithmetic faster than tables are looked up.
bool prefers_formula() {
#if HAZE_X86
  return cpu_level() != CpuLevel::kPortable;
#else
  return HAZE_NEON;
#endif
}

// In a function of its own for the sake of the stack: the tables take 120 KiB.
__attribute__((noinline)) void recover_with_new_tables(const MappedFrame& frame,
                                                       LightAnchor anchor) {
  RecoveryTables tables;
  build_tables(anchor, tables);
  recover_with(frame, FromTables{tables});
}

}  // namespace

void recover_frame(uint8_t* frame, CodeMap map, int width, int height, ChromaLayout layout,
                   LightAnchor anchor, KeptTables* kept) {
  const MappedFrame mapped = {frame, map, width, height, layout};
  if (prefers_formula() || !has_table_for_all(mapped))
    recover_with(mapped, FromFormula{anchor});
  else if (kept != nullptr)
    recover_with(mapped, FromTables{kept->for_anchor(anchor)});
  else
    recover_with_new_tables(mapped, anchor);
}

}  // namespace haze::recover

namespace {

void recover_packed(uint8_t* frame, const uint8_t* transmission, const uint8_t* light_bgr,
                    int width, int height, haze::recover::ChromaLayout layout) {
  if (!haze::has_blocks(width, height)) return;
  haze::recover::recover_frame(frame, {transmission, width / 2}, width, height, layout,
                               haze::recover::light_anchor(light_bgr), nullptr);
}

}  // namespace

void HazeRemoving3Preview_NV21(unsigned char* frame, unsigned char* transmission,
                               unsigned char* light, int width, int height, int /*recoverArg*/) {
  recover_packed(frame, transmission, light, width, height,
                 haze::recover::ChromaLayout::kInterleavedVu);
}

void HazeRemoving3Preview(unsigned char* frame, unsigned char* transmission, unsigned char* light,
                          int width, int height, int /*recoverArg*/) {
  recover_packed(frame, transmission, light, width, height, haze::recover::ChromaLayout::kPlanarUv);
}
