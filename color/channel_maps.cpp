// Per-pixel minimum and maximum of three interleaved channels, alone and in worker stripes.
#include "color/channel_maps_kernels.h"
#include "core/image_size.h"
#include "core/shared_int.h"
#include "core/stripes.h"
#include "haze_preview.h"

unsigned char* gCalMCSrcPreview[haze::kSlots];
unsigned char* gCalMCDstPreview[haze::kSlots];
int gCalMCWPreview;
int gCalMCHPreview;

unsigned char* gCalMaxMinSrcPreview[haze::kSlots];
unsigned char* gCalMaxMinDstMinPreview[haze::kSlots];
unsigned char* gCalMaxMinDstMaxPreview[haze::kSlots];
int gCalMaxMinWPreview;
int gCalMaxMinHPreview;

namespace {

constexpr int kMinThreads = 4;
constexpr int kMaxMinThreads = 8;

}  // namespace

void CalculateMaxMinChannel(unsigned char* src, unsigned char* dstMin, unsigned char* dstMax, int w,
                            int h) {
  haze::color::min_max_maps(src, dstMin, dstMax, haze::pixel_count(w, h));
}

void* CalMaxMinThreadPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (!haze::is_stripe(code, kMaxMinThreads)) return nullptr;
  const int height = haze::load_shared(gCalMaxMinHPreview);
  const haze::PixelRange range(haze::even_stripe(height, kMaxMinThreads, code.stripe),
                               haze::load_shared(gCalMaxMinWPreview));
  haze::color::min_max_maps(gCalMaxMinSrcPreview[code.slot] + 3 * range.begin,
                            gCalMaxMinDstMinPreview[code.slot] + range.begin,
                            gCalMaxMinDstMaxPreview[code.slot] + range.begin, range.count);
  return nullptr;
}

int CalculateMaxMinChannelPreview(unsigned char* src, unsigned char* dstMin, unsigned char* dstMax,
                                  int w, int h, int slot) {
  if (!haze::is_slot(slot)) return 0;
  gCalMaxMinSrcPreview[slot] = src;
  gCalMaxMinDstMinPreview[slot] = dstMin;
  gCalMaxMinDstMaxPreview[slot] = dstMax;
  haze::store_shared(gCalMaxMinWPreview, w);
  haze::store_shared(gCalMaxMinHPreview, h);
  return haze::run_stripes<kMaxMinThreads>(CalMaxMinThreadPreview, slot);
}

void* CalMCThreadPreview(void* arg) {
  const haze::StripeCode code = haze::decode_stripe(arg);
  if (!haze::is_stripe(code, kMinThreads)) return nullptr;
  const int height = haze::load_shared(gCalMCHPreview);
  const haze::PixelRange range(haze::even_stripe(height, kMinThreads, code.stripe),
                               haze::load_shared(gCalMCWPreview));
  haze::color::min_map(gCalMCSrcPreview[code.slot] + 3 * range.begin,
                       gCalMCDstPreview[code.slot] + range.begin, range.count);
  return nullptr;
}

int CalculateMinChannelPreview(unsigned char* src, unsigned char* dst, int w, int h, int slot) {
  if (!haze::is_slot(slot)) return 0;
  gCalMCSrcPreview[slot] = src;
  gCalMCDstPreview[slot] = dst;
  haze::store_shared(gCalMCWPreview, w);
  haze::store_shared(gCalMCHPreview, h);
  return haze::run_stripes<kMinThreads>(CalMCThreadPreview, slot);
}
