// The kernels of the recovery tables, each called by name.
#include "recover/recovery_kernels.h"

#include <gtest/gtest.h>

#include <array>
#include <memory>

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
