// Weights of BT.601 in fixed point with 14 fractional bits.
#pragma once

namespace haze::color {

inline constexpr int kBt601Bits = 14;
inline constexpr int kBt601Half = 1 << (kBt601Bits - 1);

// YCrCb to RGB: R = Y + 1.403 Cr, G = Y - 0.714 Cr - 0.344 Cb, B = Y + 1.773 Cb.
inline constexpr int kBt601RedFromCr = 22987;    // 1.403 * 2^14 = 22986.8
inline constexpr int kBt601GreenFromCr = 11698;  // 0.714 * 2^14 = 11698.2
inline constexpr int kBt601GreenFromCb = 5636;   // 0.344 * 2^14 = 5636.1
inline constexpr int kBt601BlueFromCb = 29049;   // 1.773 * 2^14 = 29048.8

inline constexpr int kChromaZero = 128;

}  // namespace haze::color
