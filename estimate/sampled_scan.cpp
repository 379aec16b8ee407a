// Sum and maxima of planes sampled on every second row and column, by eight threads.
#include <stddef.h>
#include <stdint.h>

#include "core/image_size.h"
#include "core/numeric.h"
#include "core/stripes.h"
#include "haze_preview.h"

unsigned char* pCalSumGSrc;
int gCalSumWidth;
int gCalSumHeight;
int gCalSumSum[8];

unsigned char* gCalMaxpH;
unsigned char* gCalMaxpA;
int gCalMaxWidth;
int gCalMaxHeight;
unsigned char gCalMaxMaxH[8];
unsigned char gCalMaxMaxA[8];

namespace {

constexpr int kThreads = 8;

bool is_thread(int k) { return k >= 0 && k < kThreads; }

// Rows of stripe k: ceil(height / 8) each, not made even; the last one ends with the image.
haze::StripeRange sampled_stripe(int height, int k) {
  const int64_t rows = height / kThreads + (height % kThreads != 0);
  const int64_t end = k == kThreads - 1 ? height : (k + 1) * rows;
  return {static_cast<int>(haze::min<int64_t>(k * rows, height)),
          static_cast<int>(haze::min<int64_t>(end, height))};
}

// Calls visit(offset) for the samples of stripe k. The position runs on from the end of a sampled
// row, so with an odd width every further row starts one byte more to the right; samples that this
// carries past the end of the plane are left out.
template <typename Visit>
void for_each_sample(int width, int height, int k, Visit visit) {
  const size_t pixels = haze::pixel_count(width, height);
  if (pixels == 0) return;
  const haze::StripeRange rows = sampled_stripe(height, k);
  const size_t columns = static_cast<size_t>(width);
  const size_t row_step = (columns + 1) / 2 * 2 + columns;
  size_t start = haze::pixel_count(width, rows.begin);
  for (int y = rows.begin; y < rows.end; y += 2) {
    for (size_t offset = start; offset < haze::min(start + columns, pixels); offset += 2)
      visit(offset);
    start += row_step;
  }
}

}  // namespace

void CalSum(int k) {
  if (!is_thread(k)) return;
  const uint8_t* const plane = pCalSumGSrc;
  uint32_t sum = 0;
  for_each_sample(gCalSumWidth, gCalSumHeight, k, [&](size_t offset) { sum += plane[offset]; });
  gCalSumSum[k] = static_cast<int>(static_cast<uint32_t>(gCalSumSum[k]) + sum);
}

void* CalSumThreadIntermate(void* arg) {
  CalSum(*static_cast<const int*>(arg));
  return nullptr;
}

int CalSumThreadPreview(unsigned char* src, int w, int h) {
  gCalSumWidth = w;
  gCalSumHeight = h;
  pCalSumGSrc = src;
  for (int& sum : gCalSumSum) sum = 0;
  haze::run_stripes<kThreads>(CalSumThreadIntermate, 0);
  uint32_t total = 0;
  for (int sum : gCalSumSum) total += static_cast<uint32_t>(sum);
  return static_cast<int>(total);
}

void CalMax(int k) {
  if (!is_thread(k)) return;
  const uint8_t* const first = gCalMaxpH;
  const uint8_t* const second = gCalMaxpA;
  uint8_t most_of_first = gCalMaxMaxH[k];
  uint8_t most_of_second = gCalMaxMaxA[k];
  for_each_sample(gCalMaxWidth, gCalMaxHeight, k, [&](size_t offset) {
    most_of_first = haze::max(most_of_first, first[offset]);
    most_of_second = haze::max(most_of_second, second[offset]);
  });
  gCalMaxMaxH[k] = most_of_first;
  gCalMaxMaxA[k] = most_of_second;
}

void* CalMaxPthreadIntermate(void* arg) {
  CalMax(*static_cast<const int*>(arg));
  return nullptr;
}

void CalMaxThreadPreview(unsigned char* pH, unsigned char* pA, int w, int h, unsigned char* maxH,
                         unsigned char* maxA) {
  gCalMaxWidth = w;
  gCalMaxHeight = h;
  gCalMaxpH = pH;
  gCalMaxpA = pA;
  for (int k = 0; k < kThreads; ++k) gCalMaxMaxH[k] = gCalMaxMaxA[k] = 0;
  haze::run_stripes<kThreads>(CalMaxPthreadIntermate, 0);
  if (haze::pixel_count(w, h) == 0) return;
  *maxH = *maxA = 0;
  for (int k = 0; k < kThreads; ++k) {
    *maxH = haze::max(*maxH, gCalMaxMaxH[k]);
    *maxA = haze::max(*maxA, gCalMaxMaxA[k]);
  }
}
