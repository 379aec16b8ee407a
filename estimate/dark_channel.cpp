// Dark channel: a square minimum filter with a histogram of its output, after the
// dark-channel-prior paper of 2009.
#include <string.h>

#include "core/image_size.h"
#include "core/scratch.h"
#include "core/shared_int.h"
#include "core/stripes.h"
#include "estimate/histogram.h"
#include "filter/window_extremum.h"
#include "haze_preview.h"

unsigned char* gCalDCSrcPreview[haze::kSlots];
unsigned char* gCalDCDstPreview[haze::kSlots];
int gCalDCWPreview;
int gCalDCHPreview;
int gCalDCRPreview;
unsigned int gHistPreview[haze::kSlots * 4 * haze::estimate::kBins];

namespace {

using haze::estimate::ByteCounts;
using haze::estimate::kBins;
using haze::filter::filter_columns;
using haze::filter::filter_line;
using haze::filter::filter_rows;
using haze::filter::LeastByte;
using haze::filter::search_lines;

constexpr int kThreads = 4;
static_assert(sizeof gHistPreview == haze::kSlots * kThreads * kBins * sizeof(int));

// The histogram of one worker, as the signed counters that the column pass takes.
int* worker_histogram(haze::StripeCode code) {
  return reinterpret_cast<int*>(gHistPreview + (code.slot * kThreads + code.stripe) * kBins);
}

// hist[v] grows by the number of bytes v in a stripe of columns.
void count_columns(const uint8_t* image, int cols, int h, ptrdiff_t stride, int* hist) {
  ByteCounts counts;
  for (int y = 0; y < h; ++y) counts.add(image + y * stride, static_cast<size_t>(cols));
  counts.add_to(hist);
}

}  // namespace

void getMinChannelPreview(unsigned char* src, unsigned char* dst, int n, int dstStride, int r) {
  filter_line<LeastByte>(src, dst, n, dstStride, r);
}

void getMinChannel_horPreview(unsigned char* src, unsigned char* dst, int n, int /*rows*/, int r) {
  filter_line<LeastByte>(src, dst, n, 1, r);
}

void getMCandHistPreview(unsigned char* src, unsigned char* dst, int* hist, int n, int dstStride,
                         int r) {
  filter_line<LeastByte>(src, dst, n, dstStride, r, [=](uint8_t output) { ++hist[output]; });
}

void getMinChannel_verPreview(unsigned char* src, unsigned char* dst, int cols, int h, int r,
                              int* hist) {
  const ptrdiff_t stride = haze::load_shared(gCalDCWPreview);
  if (filter_columns<LeastByte>(src, dst, cols, h, stride, r))
    count_columns(dst, cols, h, stride, hist);
}

void CalculateDarkChannelPreview(unsigned char* src, unsigned char* dst, int* hist, int w, int h,
                                 int r) {
  const size_t count = haze::pixel_count(w, h);
  haze::Scratch<uint8_t> rows(count);
  if (!rows || !filter_rows<LeastByte>(src, rows.data(), w, h, w, r) ||
      !filter_columns<LeastByte>(rows.data(), dst, w, h, w, r))
    return;
  ByteCounts counts;
  counts.add(dst, count);
  counts.add_to(hist);
}

void* CalDCThread_horPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (!haze::is_stripe(code, kThreads)) return nullptr;
  const int width = haze::load_shared(gCalDCWPreview);
  const int radius = haze::load_shared(gCalDCRPreview);
  const haze::StripeRange rows =
      haze::even_stripe(haze::load_shared(gCalDCHPreview), kThreads, code.stripe);
  const int count = rows.end - rows.begin;
  if (width < 1 || count < 1 || radius < 0) return nullptr;
  const size_t begin = haze::pixel_count(width, rows.begin);
  const uint8_t* const src = gCalDCSrcPreview[code.slot] + begin;
  uint8_t* const dst = gCalDCDstPreview[code.slot] + begin;
  if (!filter_rows<LeastByte>(src, dst, width, count, width, radius))
    search_lines<LeastByte>(src, dst, {count, width, width, 1}, radius);
  return nullptr;
}

void* CalDCThread_verPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (!haze::is_stripe(code, kThreads)) return nullptr;
  const int width = haze::load_shared(gCalDCWPreview);
  const int height = haze::load_shared(gCalDCHPreview);
  const int radius = haze::load_shared(gCalDCRPreview);
  const haze::StripeRange columns = haze::even_stripe(width, kThreads, code.stripe);
  const int count = columns.end - columns.begin;
  int* const histogram = worker_histogram(code);
  memset(histogram, 0, kBins * sizeof *histogram);
  if (count < 1 || height < 1 || radius < 0) return nullptr;
  const uint8_t* const src = gCalDCSrcPreview[code.slot] + columns.begin;
  uint8_t* const dst = gCalDCDstPreview[code.slot] + columns.begin;
  if (!filter_columns<LeastByte>(src, dst, count, height, width, radius))
    search_lines<LeastByte>(src, dst, {count, 1, height, width}, radius);
  count_columns(dst, count, height, width, histogram);
  return nullptr;
}

void CalculateDarkChannel_MultiThreadPreview(unsigned char* src, unsigned char* dst, int* hist,
                                             int w, int h, int r, int slot) {
  if (!haze::is_slot(slot) || haze::pixel_count(w, h) == 0 || r < 0) return;
  haze::Scratch<uint8_t> rows(haze::pixel_count(w, h));
  if (!rows) return;
  haze::store_shared(gCalDCWPreview, w);
  haze::store_shared(gCalDCHPreview, h);
  haze::store_shared(gCalDCRPreview, r);
  gCalDCSrcPreview[slot] = src;
  gCalDCDstPreview[slot] = rows.data();
  haze::run_stripes<kThreads>(CalDCThread_horPreview, slot);
  // The row pass is complete before any column is read.
  gCalDCSrcPreview[slot] = rows.data();
  gCalDCDstPreview[slot] = dst;
  haze::run_stripes<kThreads>(CalDCThread_verPreview, slot);
  for (int bin = 0; bin < kBins; ++bin) {
    unsigned total = 0;
    for (int thread = 0; thread < kThreads; ++thread)
      total += gHistPreview[(slot * kThreads + thread) * kBins + bin];
    hist[bin] = static_cast<int>(total);
  }
}
