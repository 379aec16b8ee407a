// The kernels of the recovery tables, each called by name.
#include "recover/recovery_kernels.h"

#include <gtest/gtest.h>

#include <array>
#include <memory>

#include "haze_preview.h"
#include "recover/frame_recovery_neon.h"
#include "recover/recovery_tables.h"
#include "tests/reference/frame_recovery.h"
#include "tests/support/bytes_match.h"

namespace haze::test {
namespace {

using Recovered = std::array<uint8_t, 256>;

Recovered reference_row(int anchor, float factor) {
  Recovered row;
  for (int value = 0; value < 256; ++value)
    row[static_cast<size_t>(value)] =
        reference::recover_chroma(static_cast<uint8_t>(value), anchor, factor);
  return row;
}

template <typename Kernel>
void expect_every_anchor_and_code(Kernel kernel) {
  for (int code = 0; code < 256; ++code) {
    const float factor = reference::recovery_factor(code);
    for (int anchor = 0; anchor < 256; ++anchor) {
      Recovered actual;
      actual.fill(0xA5);
      kernel(anchor, factor, actual.data());
      ASSERT_TRUE(
          bytes_match(actual, reference_row(anchor, factor), {{"anchor", anchor}, {"code", code}}));
    }
  }
}

TEST(RecoveryKernels, PortableRowIsExactForEveryAnchorAndCode) {
  expect_every_anchor_and_code(recover::recover_all_portable);
}

#if HAZE_NEON
TEST(RecoveryKernels, NeonRowIsExactForEveryAnchorAndCode) {
  expect_every_anchor_and_code(recover::recover_all_neon);
}

TEST(RecoveryKernels, NeonArithmeticIsExactForEveryAnchorAndCode) {
  expect_every_anchor_and_code([](int anchor, float factor, uint8_t* recovered) {
    const uint8_t byte = static_cast<uint8_t>(anchor);
    const recover::FactorsNeon factors = {vdupq_n_f32(factor), vdupq_n_f32(factor)};
    uint8_t samples[8];
    for (int first = 0; first < 256; first += 8) {
      for (int k = 0; k < 8; ++k) samples[k] = static_cast<uint8_t>(first + k);
      vst1_u8(recovered + first, recover::high_bytes_neon(recover::recover_eight_neon(
                                     vld1_u8(samples), factors, recover::anchor_neon(byte, byte))));
    }
  });
}

TEST(RecoveryKernels, NeonToneCurveIsExactForEveryByte) {
  const recover::ToneCurveNeon tone = recover::load_tone_curve_neon(LutTablePreview);
  Recovered bytes;
  Recovered expected;
  for (size_t i = 0; i < bytes.size(); ++i) {
    bytes[i] = static_cast<uint8_t>(i);
    expected[i] = LutTablePreview[i];
  }
  for (size_t i = 0; i < bytes.size(); i += 16)
    vst1q_u8(bytes.data() + i, recover::brighten_neon(vld1q_u8(bytes.data() + i), tone));
  EXPECT_TRUE(bytes_match(bytes, expected));
}
#endif

TEST(RecoveryKernels, FactorIsTheReciprocalOfTheTransmission) {
  for (int code = 0; code < 256; ++code)
    EXPECT_EQ(recover::recovery_factor(code), reference::recovery_factor(code)) << code;
}

TEST(KeptTables, AreBuiltAgainOnlyWhenTheLightChanges) {
  const auto kept = std::make_unique<recover::KeptTables>();
  const recover::LightAnchor first = {100, 128, 128};
  const recover::LightAnchor second = {100, 128, 129};

  auto& tables = const_cast<recover::RecoveryTables&>(kept->for_anchor(first));
  const uint8_t built = tables.codes[40].v[140];
  EXPECT_EQ(built, 158);
  // A mark that only a rebuild removes.
  tables.codes[40].v[140] = 7;
  EXPECT_EQ(kept->for_anchor(first).codes[40].v[140], 7);
  EXPECT_EQ(kept->for_anchor(second).codes[40].v[140], 156);
  EXPECT_EQ(kept->for_anchor(first).codes[40].v[140], built);
}

}  // namespace
}  // namespace haze::test
