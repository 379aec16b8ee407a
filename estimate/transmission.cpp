// Transmission map from the smoothed minimum channel: t = 1 - w * dark channel / A, with the mean
// of the minimum channel, bounded by the minimum itself, in place of a minimum filter.
#include "core/image_size.h"
#include "core/shared_int.h"
#include "core/stripes.h"
#include "estimate/transmission_kernels.h"
#include "haze_preview.h"

unsigned char* gCalTSrcPreview[haze::kSlots];
unsigned char* gCalTSrc1Preview[haze::kSlots];
unsigned char* gCalTDstPreview[haze::kSlots];
int gAlpha[haze::kSlots];
int gAA[haze::kSlots];
int gCalTWPreview;
int gCalTHPreview;

namespace {

using haze::estimate::HighLanes;

constexpr int kThreads = 8;

template <HighLanes kHighLanes>
void transmission_map(const uint8_t* mean, const uint8_t* minimum, uint8_t* codes, int width,
                      int height, float strength, float inv_a) {
  const size_t count = haze::pixel_count(width, height);
  const size_t grouped = count & ~(haze::estimate::kGroup - 1);
  haze::estimate::group_codes<kHighLanes>(mean, minimum, codes, grouped,
                                          haze::estimate::group_arguments(strength, inv_a));
  haze::estimate::tail_codes(mean, minimum, codes, grouped, count, strength, inv_a);
}

}  // namespace

void CalculateTChannelPreviewNeonFloat(unsigned char* meanMap, unsigned char* minMap,
                                       unsigned char* transmission, int width, int height,
                                       float strength, float invA) {
  transmission_map<HighLanes::kOwn>(meanMap, minMap, transmission, width, height, strength, invA);
}

void CalculateTChannelPreviewNeon(unsigned char* meanMap, unsigned char* minMap,
                                  unsigned char* transmission, int width, int height,
                                  float strength, float invA) {
  transmission_map<HighLanes::kLow>(meanMap, minMap, transmission, width, height, strength, invA);
}

void* CalTThreadPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (!haze::is_stripe(code, kThreads)) return nullptr;
  const int height = haze::load_shared(gCalTHPreview);
  const haze::PixelRange range(haze::even_stripe(height, kThreads, code.stripe),
                               haze::load_shared(gCalTWPreview));
  const uint8_t* const mean = gCalTSrcPreview[code.slot] + range.begin;
  const uint8_t* const minimum = gCalTSrc1Preview[code.slot] + range.begin;
  uint8_t* const codes = gCalTDstPreview[code.slot] + range.begin;
  haze::estimate::codes_q8(mean, minimum, codes, range.count, gAlpha[code.slot], gAA[code.slot]);
  return nullptr;
}

void CalculateTChannelPreview(unsigned char* meanMap, unsigned char* minMap,
                              unsigned char* transmission, int width, int height, int strengthQ8,
                              int atmosphericLight, int slot) {
  if (!haze::is_slot(slot)) return;
  gCalTSrcPreview[slot] = meanMap;
  gCalTSrc1Preview[slot] = minMap;
  gCalTDstPreview[slot] = transmission;
  gAlpha[slot] = strengthQ8;
  gAA[slot] = atmosphericLight;
  haze::store_shared(gCalTWPreview, width);
  haze::store_shared(gCalTHPreview, height);
  haze::run_stripes<kThreads>(CalTThreadPreview, slot);
}
