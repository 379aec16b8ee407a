// Half-resolution BGR of preview frames by eight threads, and float planes at twice their size.
#include "core/image_size.h"
#include "core/scratch.h"
#include "core/shared_int.h"
#include "core/stripes.h"
#include "haze_preview.h"

unsigned char* gZoomOutSrcPreview[haze::kSlots];
unsigned char* gZoomOutDstPreview[haze::kSlots];
int gZoomOutWPreview;
int gZoomOutHPreview;

namespace {

constexpr int kThreads = 8;

// Stripe 3, not the last one, takes what the even split leaves over: it ends among the rows of
// stripe 4, and the last rows of the frame are converted by none.
haze::StripeRange zoom_stripe(int height, int stripe) {
  const int rows = haze::even_stripe(height, kThreads, 0).end;
  const int begin = stripe * rows;
  return {begin, stripe == 3 ? height - 4 * rows : begin + rows};
}

// Two samples for each: the sample itself and the mean of it and the next one. The last is
// repeated.
void zoom_row(const float* src, float* dst, int width) {
  for (int x = 0; x < width - 1; ++x) {
    dst[2 * x] = src[x];
    dst[2 * x + 1] = (src[x] + src[x + 1]) * 0.5f;
  }
  dst[2 * width - 2] = src[width - 1];
  dst[2 * width - 1] = src[width - 1];
}

// Converts rows of the frame that a slot describes. Both bounds are even.
void convert_rows(int slot, haze::StripeRange rows) {
  if (rows.end <= rows.begin) return;
  const int columns = haze::load_shared(gZoomOutWPreview);
  const ptrdiff_t width = columns;
  const ptrdiff_t height = haze::load_shared(gZoomOutHPreview);
  unsigned char* const frame = gZoomOutSrcPreview[slot];
  unsigned char* const luma = frame + width * rows.begin;
  unsigned char* const bgr = gZoomOutDstPreview[slot] + width * rows.begin / 4 * 3;
  if (gPerviewFormat == kInputFormatPlanar) {
    xYCrCb2BGRPreview(luma, frame + width * height + width / 2 * (rows.begin / 2), bgr, columns,
                      rows.end - rows.begin);
  } else {
    xYCrCb2BGRPreview_NV21(luma, frame + width * height + width * (rows.begin / 2), bgr, columns,
                           rows.end - rows.begin);
  }
}

// Odd sides would end in blocks whose chroma the frame does not have.
bool has_frame() {
  return haze::has_blocks(haze::load_shared(gZoomOutWPreview), haze::load_shared(gZoomOutHPreview));
}

// Worker beside all others of its slot: as ZoomOutThreadPreview, but stripe 3 leaves the rows out
// that stripes 4 ... 7 convert as well, so that no byte is written by two threads.
void* convert_own_rows(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (code.stripe != 3) return ZoomOutThreadPreview(arg);
  if (!has_frame()) return nullptr;
  const int height = haze::load_shared(gZoomOutHPreview);
  const haze::StripeRange rows = zoom_stripe(height, 3);
  const int next_begin = zoom_stripe(height, 4).begin;
  const int last_end = zoom_stripe(height, 7).end;
  convert_rows(code.slot, {rows.begin, next_begin});
  convert_rows(code.slot, {last_end, rows.end});
  return nullptr;
}

}  // namespace

void* ZoomOutThreadPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (haze::is_stripe(code, kThreads) && has_frame())
    convert_rows(code.slot, zoom_stripe(haze::load_shared(gZoomOutHPreview), code.stripe));
  return nullptr;
}

void ZoomOutImgPreview(unsigned char* src, unsigned char* dst, int width, int height, int slot) {
  if (!haze::is_slot(slot)) return;
  gZoomOutSrcPreview[slot] = src;
  gZoomOutDstPreview[slot] = dst;
  haze::store_shared(gZoomOutWPreview, width);
  haze::store_shared(gZoomOutHPreview, height);
  haze::run_stripes<kThreads>(convert_own_rows, slot);
}

void ZoomIn_Linear_fPreview(const float* src, float* dst, int width, int height) {
  if (width < 1 || height < 1) return;
  const size_t columns = 2 * static_cast<size_t>(width);
  haze::Scratch<float> rows(2 * columns);
  if (!rows) return;
  float* current = rows.data();
  float* next = current + columns;
  zoom_row(src, current, width);
  for (int y = 0; y < height; ++y) {
    float* const even = dst + 2 * static_cast<size_t>(y) * columns;
    float* const odd = even + columns;
    const bool last = y + 1 == height;
    if (!last) zoom_row(src + static_cast<size_t>(y + 1) * static_cast<size_t>(width), next, width);
    for (size_t x = 0; x < columns; ++x) {
      even[x] = current[x];
      odd[x] = last ? current[x] : (current[x] + next[x]) * 0.5f;
    }
    float* const used = current;
    current = next;
    next = used;
  }
}
