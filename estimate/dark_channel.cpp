// Dark channel: a square minimum filter with a histogram of its output, after the
// dark-channel-prior paper of 2009.
#include <string.h>

#include "core/image_size.h"
#include "core/scratch.h"
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

constexpr int kThreads = 4;
static_assert(sizeof gHistPreview == haze::kSlots * kThreads * kBins * sizeof(int));

// The histogram of one worker, as the signed counters that the column pass takes.
int* worker_histogram(haze::StripeCode code) {
  return reinterpret_cast<int*>(gHistPreview + (code.slot * kThreads + code.stripe) * kBins);
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
  const ptrdiff_t stride = gCalDCWPreview;
  if (!filter_columns<LeastByte>(src, dst, cols, h, stride, r)) return;
  ByteCounts counts;
  for (int y = 0; y < h; ++y) counts.add(dst + y * stride, static_cast<size_t>(cols));
  counts.add_to(hist);
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
  const int width = gCalDCWPreview;
  const haze::StripeRange rows = haze::even_stripe(gCalDCHPreview, kThreads, code.stripe);
  const size_t begin = haze::pixel_count(width, rows.begin);
  filter_rows<LeastByte>(gCalDCSrcPreview[code.slot] + begin, gCalDCDstPreview[code.slot] + begin,
                         width, rows.end - rows.begin, width, gCalDCRPreview);
  return nullptr;
}

void* CalDCThread_verPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (!haze::is_stripe(code, kThreads)) return nullptr;
  const haze::StripeRange columns = haze::even_stripe(gCalDCWPreview, kThreads, code.stripe);
  int* const histogram = worker_histogram(code);
  memset(histogram, 0, kBins * sizeof *histogram);
  getMinChannel_verPreview(gCalDCSrcPreview[code.slot] + columns.begin,
                           gCalDCDstPreview[code.slot] + columns.begin, columns.end - columns.begin,
                           gCalDCHPreview, gCalDCRPreview, histogram);
  return nullptr;
}

void CalculateDarkChannel_MultiThreadPreview(unsigned char* src, unsigned char* dst, int* hist,
                                             int w, int h, int r, int slot) {
  if (!haze::is_slot(slot) || haze::pixel_count(w, h) == 0 || r < 0) return;
  haze::Scratch<uint8_t> rows(haze::pixel_count(w, h));
  if (!rows) return;
  gCalDCWPreview = w;
  gCalDCHPreview = h;
  gCalDCRPreview = r;
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
