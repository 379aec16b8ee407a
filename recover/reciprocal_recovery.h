// Recovery of one sample through a reciprocal index, in integers and in floating point.
#pragma once

#include <stdint.h>

#include "core/numeric.h"
#include "haze_preview.h"
#include "recover/light_anchor.h"
#include "recover/reciprocals.h"

namespace haze::recover {

// anchor + ((sample - anchor) * k >> 8), clamped; k = 2^16 / index, so k / 2^8 is 1 / t.
// Range: |sample - anchor| <= 255 and k <= 2^16 keep the product below 2^24 in size.
inline uint8_t recover_by_index(int anchor, int sample, int index) {
  return clamp_to_byte(anchor + (kReciprocals[index] * (sample - anchor) >> 8));
}

// How a member of the family recovers luma and chroma samples.
struct IntegerRecovery {
  static constexpr bool kInteger = true;
  LightAnchor anchor;

  FloatAnchor float_anchor() const {
    return {static_cast<float>(anchor.y), static_cast<float>(anchor.u),
            static_cast<float>(anchor.v)};
  }

  uint8_t luma(int sample, int index) const {
    return LutTablePreview[recover_by_index(anchor.y, sample, index)];
  }
  uint8_t u(int sample, int index) const { return recover_by_index(anchor.u, sample, index); }
  uint8_t v(int sample, int index) const { return recover_by_index(anchor.v, sample, index); }
};

// The same in single precision around an anchor that keeps its fraction.
class FloatRecovery {
 public:
  static constexpr bool kInteger = false;

  // BT.601 luma in double precision, then narrowed; chroma from the narrowed luma.
  explicit FloatRecovery(const uint8_t* light_bgr) {
    const double luma = light_bgr[1] * 0.587 + light_bgr[0] * 0.114 + light_bgr[2] * 0.299;
    anchor_.y = static_cast<float>(luma);
    anchor_.u = chroma(light_bgr[0], 0.564);
    anchor_.v = chroma(light_bgr[2], 0.713);
    for (int index = 0; index < 256; ++index)
      factors_[index] = static_cast<float>(kReciprocals[index] * 0.00390625);
  }

  FloatAnchor float_anchor() const { return anchor_; }

  uint8_t luma(int sample, int index) const {
    return LutTablePreview[recover(anchor_.y, sample, index)];
  }
  uint8_t u(int sample, int index) const { return recover(anchor_.u, sample, index); }
  uint8_t v(int sample, int index) const { return recover(anchor_.v, sample, index); }

 private:
  float chroma(uint8_t channel, double weight) const {
    return static_cast<float>(128.0 + static_cast<double>(static_cast<float>(channel) - anchor_.y) *
                                          weight);
  }

  uint8_t recover(float anchor, int sample, int index) const {
    const float value = anchor + (static_cast<float>(sample) - anchor) * factors_[index];
    const float below_256 = value > 255.0f ? 255.0f : value;
    return static_cast<uint8_t>(static_cast<int>(below_256 < 0.0f ? 0.0f : below_256));
  }

  FloatAnchor anchor_;
  float factors_[256];
};

}  // namespace haze::recover
