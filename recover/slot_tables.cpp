// Recovery of NV21 frames through global tables, one set per slot, by eight threads.
#include <stdint.h>

#include "core/image_size.h"
#include "core/shared_int.h"
#include "core/stripes.h"
#include "haze_preview.h"
#include "recover/recovery_tables.h"

unsigned int gTable1[haze::kSlots * haze::recover::kTableCodes * 256];
unsigned int gTable2[haze::kSlots * haze::recover::kTableCodes * 256];
unsigned int gTable3[haze::kSlots * haze::recover::kTableCodes * 256];

unsigned char* gCalRemoveSrcPreview[haze::kSlots];
unsigned char* gCalRemoveScalePreview[haze::kSlots];
int gCalRemoveWPreview;
int gCalRemoveHPreview;

namespace {

using haze::recover::CodeTable;
using haze::recover::kTableCodes;

constexpr int kThreads = 8;

// Where the row of one code starts in each table.
ptrdiff_t row_of(int slot, int code) {
  return (static_cast<ptrdiff_t>(slot) * kTableCodes + code) * 256;
}

void fill_slot(int slot, haze::recover::LightAnchor anchor) {
  for (int code = 0; code < kTableCodes; ++code) {
    CodeTable bytes;
    haze::recover::build_code_table(anchor, code, bytes);
    const ptrdiff_t row = row_of(slot, code);
    for (int value = 0; value < 256; ++value) {
      gTable1[row + value] = bytes.luma[value];
      gTable2[row + value] = bytes.v[value];
      gTable3[row + value] = bytes.u[value];
    }
  }
}

// One row of 2 x 2 blocks. Codes without a table leave their block as it is.
void recover_row(uint8_t* top, uint8_t* bottom, uint8_t* vu, const uint8_t* codes, int blocks,
                 int slot) {
  for (int x = 0; x < blocks; ++x) {
    if (codes[x] >= kTableCodes) continue;
    const ptrdiff_t row = row_of(slot, codes[x]);
    const unsigned* const luma = gTable1 + row;
    top[2 * x] = static_cast<uint8_t>(luma[top[2 * x]]);
    top[2 * x + 1] = static_cast<uint8_t>(luma[top[2 * x + 1]]);
    bottom[2 * x] = static_cast<uint8_t>(luma[bottom[2 * x]]);
    bottom[2 * x + 1] = static_cast<uint8_t>(luma[bottom[2 * x + 1]]);
    vu[2 * x] = static_cast<uint8_t>(gTable2[row + vu[2 * x]]);
    vu[2 * x + 1] = static_cast<uint8_t>(gTable3[row + vu[2 * x + 1]]);
  }
}

}  // namespace

void* CalRemoveThreadPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (!haze::is_stripe(code, kThreads)) return nullptr;
  const int columns = haze::load_shared(gCalRemoveWPreview);
  const int luma_rows = haze::load_shared(gCalRemoveHPreview);
  if (!haze::has_blocks(columns, luma_rows)) return nullptr;
  const ptrdiff_t width = columns;
  const ptrdiff_t height = luma_rows;
  const int blocks = columns / 2;
  uint8_t* const frame = gCalRemoveSrcPreview[code.slot];
  const uint8_t* const codes = gCalRemoveScalePreview[code.slot];
  const haze::StripeRange rows = haze::even_stripe(luma_rows / 2, kThreads, code.stripe);
  for (ptrdiff_t y = rows.begin; y < rows.end; ++y) {
    uint8_t* const luma = frame + 2 * y * width;
    recover_row(luma, luma + width, frame + (height + y) * width, codes + y * blocks, blocks,
                code.slot);
  }
  return nullptr;
}

void CalculateRemovePreview(unsigned char* frame, unsigned char* transmission, int width,
                            int height, int slot) {
  if (!haze::is_slot(slot)) return;
  gCalRemoveSrcPreview[slot] = frame;
  gCalRemoveScalePreview[slot] = transmission;
  haze::store_shared(gCalRemoveWPreview, width);
  haze::store_shared(gCalRemoveHPreview, height);
  haze::run_stripes<kThreads>(CalRemoveThreadPreview, slot);
}

void HazeRemoving3Preview2_NV21(unsigned char* frame, unsigned char* transmission,
                                unsigned char* light, int width, int height, int slot) {
  if (!haze::is_slot(slot)) return;
  fill_slot(slot, haze::recover::light_anchor(light));
  CalculateRemovePreview(frame, transmission, width, height, slot);
}
