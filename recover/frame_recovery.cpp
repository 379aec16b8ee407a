#include "recover/frame_recovery.h"

#include <stddef.h>

#include "core/numeric.h"
#include "haze_preview.h"
#include "recover/recovery_kernels.h"

namespace haze::recover {
namespace {

// One row of 2 x 2 blocks: two luma rows and the chroma samples that belong to them.
struct BlockRow {
  uint8_t* luma_top;
  uint8_t* luma_bottom;
  uint8_t* v;
  uint8_t* u;
};

// Recovered bytes by lookup, for codes below kTableCodes.
struct FromTables {
  const RecoveryTables& tables;

  const CodeTable& operator()(int code) const { return tables.codes[code]; }
};

// Recovered bytes by the formula, for codes that no table holds.
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
};

// `kChromaStep` bytes lie between chroma samples of one kind.
template <int kChromaStep, typename Recovered>
void recover_blocks(BlockRow row, const uint8_t* codes, int blocks, Recovered recovered) {
  for (int x = 0; x < blocks; ++x) {
    const auto& to = recovered(codes[x]);
    row.luma_top[2 * x] = to.luma[row.luma_top[2 * x]];
    row.luma_top[2 * x + 1] = to.luma[row.luma_top[2 * x + 1]];
    row.luma_bottom[2 * x] = to.luma[row.luma_bottom[2 * x]];
    row.luma_bottom[2 * x + 1] = to.luma[row.luma_bottom[2 * x + 1]];
    row.v[kChromaStep * x] = to.v[row.v[kChromaStep * x]];
    row.u[kChromaStep * x] = to.u[row.u[kChromaStep * x]];
  }
}

template <typename Recovered>
void recover_with(uint8_t* frame, CodeMap map, int width, int height, ChromaLayout layout,
                  Recovered recovered) {
  const int blocks = width / 2;
  const ptrdiff_t luma_bytes = static_cast<ptrdiff_t>(width) * height;
  uint8_t* const chroma = frame + luma_bytes;
  for (int y = 0; y < height / 2; ++y) {
    uint8_t* const luma = frame + static_cast<ptrdiff_t>(2 * y) * width;
    const uint8_t* const codes = map.codes + static_cast<ptrdiff_t>(y) * map.row_bytes;
    if (layout == ChromaLayout::kInterleavedVu) {
      uint8_t* const vu = chroma + static_cast<ptrdiff_t>(y) * width;
      recover_blocks<2>({luma, luma + width, vu, vu + 1}, codes, blocks, recovered);
    } else {
      uint8_t* const u = chroma + static_cast<ptrdiff_t>(y) * blocks;
      recover_blocks<1>({luma, luma + width, u + luma_bytes / 4, u}, codes, blocks, recovered);
    }
  }
}

bool has_table_for_all(CodeMap map, int blocks, int rows) {
  uint8_t most = 0;
  for (int y = 0; y < rows; ++y) {
    const uint8_t* const codes = map.codes + static_cast<ptrdiff_t>(y) * map.row_bytes;
    for (int x = 0; x < blocks; ++x) most = max(most, codes[x]);
  }
  return most < kTableCodes;
}

void recover_packed(uint8_t* frame, const uint8_t* transmission, const uint8_t* light_bgr,
                    int width, int height, ChromaLayout layout) {
  if (width < 2 || height < 2) return;
  const LightAnchor anchor = light_anchor(light_bgr);
  RecoveryTables tables;
  build_tables(anchor, tables);
  recover_frame(frame, {transmission, width / 2}, width, height, layout, anchor, tables);
}

}  // namespace

void recover_frame(uint8_t* frame, CodeMap map, int width, int height, ChromaLayout layout,
                   LightAnchor anchor, const RecoveryTables& tables) {
  if (has_table_for_all(map, width / 2, height / 2))
    recover_with(frame, map, width, height, layout, FromTables{tables});
  else
    recover_with(frame, map, width, height, layout, FromFormula{anchor});
}

}  // namespace haze::recover

void HazeRemoving3Preview_NV21(unsigned char* frame, unsigned char* transmission,
                               unsigned char* light, int width, int height, int /*recoverArg*/) {
  haze::recover::recover_packed(frame, transmission, light, width, height,
                                haze::recover::ChromaLayout::kInterleavedVu);
}

void HazeRemoving3Preview(unsigned char* frame, unsigned char* transmission, unsigned char* light,
                          int width, int height, int /*recoverArg*/) {
  haze::recover::recover_packed(frame, transmission, light, width, height,
                                haze::recover::ChromaLayout::kPlanarUv);
}
