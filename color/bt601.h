// Conversions of BT.601, full range, in fixed point with 14 fractional bits.
#pragma once

namespace haze::color {

inline constexpr int kBt601Bits = 14;
inline constexpr int kBt601Half = 1 << (kBt601Bits - 1);

inline constexpr int kChromaZero = 128;

// RGB to YCrCb: Y = 0.114 B + 0.587 G + 0.299 R, Cr = 0.713 (R - Y), Cb = 0.564 (B - Y).
inline constexpr int kBt601LumaFromBlue = 1868;   // 0.114 * 2^14 = 1867.8
inline constexpr int kBt601LumaFromGreen = 9617;  // 0.587 * 2^14 = 9617.4
inline constexpr int kBt601LumaFromRed = 4899;    // 0.299 * 2^14 = 4898.8
inline constexpr int kBt601CrFromRed = 11682;     // 0.713 * 2^14 = 11681.8
inline constexpr int kBt601CbFromBlue = 9241;     // 0.564 * 2^14 = 9240.6
static_assert(kBt601LumaFromBlue + kBt601LumaFromGreen + kBt601LumaFromRed == 1 << kBt601Bits);

// YCrCb to RGB: R = Y + 1.403 Cr, G = Y - 0.714 Cr - 0.344 Cb, B = Y + 1.773 Cb.
inline constexpr int kBt601RedFromCr = 22987;    // 1.403 * 2^14 = 22986.8
inline constexpr int kBt601GreenFromCr = 11698;  // 0.714 * 2^14 = 11698.2
inline constexpr int kBt601GreenFromCb = 5636;   // 0.344 * 2^14 = 5636.1
inline constexpr int kBt601BlueFromCb = 29049;   // 1.773 * 2^14 = 29048.8

// Luma of a colour, 0 ... 255: the weights add up to 1.
constexpr int luma_of(int blue, int green, int red) {
  return (kBt601LumaFromGreen * green + kBt601LumaFromBlue * blue + kBt601LumaFromRed * red +
          kBt601Half) >>
         kBt601Bits;
}

// Chroma with its offset of 128. Range: R - Y within +-179 and B - Y within +-226 give 0 ... 256.
constexpr int cr_of(int red, int luma) {
  return (kBt601CrFromRed * (red - luma) + (kChromaZero << kBt601Bits) + kBt601Half) >> kBt601Bits;
}
constexpr int cb_of(int blue, int luma) {
  return (kBt601CbFromBlue * (blue - luma) + (kChromaZero << kBt601Bits) + kBt601Half) >>
         kBt601Bits;
}

// What a colour channel differs from luma by. `cr` and `cb` are chroma less 128, -128 ... 127, so
// sums of products stay below 2^22 in size and the offsets within -227 ... 226.
struct ChannelOffsets {
  int blue;
  int green;
  int red;
};

constexpr ChannelOffsets channel_offsets(int cr, int cb) {
  return {(kBt601BlueFromCb * cb + kBt601Half) >> kBt601Bits,
          (kBt601Half - kBt601GreenFromCr * cr - kBt601GreenFromCb * cb) >> kBt601Bits,
          (kBt601RedFromCr * cr + kBt601Half) >> kBt601Bits};
}

}  // namespace haze::color
