// Maximum filters of float planes.
#include "filter/window_extremum.h"
#include "haze_preview.h"

using haze::filter::MostFloat;

void getMaxChannelPreview(float* src, float* dst, int n, int dstStride, int r) {
  haze::filter::filter_line<MostFloat>(src, dst, n, dstStride, r);
}

void getMaxChannel_horPreview(float* src, float* dst, int n, int /*rows*/, int r) {
  haze::filter::filter_line<MostFloat>(src, dst, n, 1, r);
}

void getMaxChannel_verPreview(float* src, float* dst, int w, int h, int r) {
  haze::filter::filter_columns<MostFloat>(src, dst, w, h, w, r);
}
