// Digests of drawn calls of every building block, the same on every target and with every set of
// vector paths. HAZE_TEST_SEED has no effect here.
#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "tests/support/fnv1a.h"
#include "tests/surface/blocks.h"

namespace haze::test {
namespace {

constexpr int kCalls = 12;

struct Golden {
  const char* block;
  uint64_t digest;
};

// clang-format off
constexpr Golden kGolden[] = {
    {"xYCrCb2BGRMaxMinPreviewNeon_NV21", 0x033d05d9b719b0b3},
    {"xYCrCb2BGRPreview_NV21", 0x3dffcf47efbb4b7f},
    {"xYCrCb2BGRPreviewNeon_NV21", 0x71b7e6e1bd5538b4},
    {"xYCrCb2BGRPreview", 0x5304871dc21bb06e},
    {"BGR2YCrCbPreview", 0x7767ef6851ae0992},
    {"YCrCb2BGRPreview", 0xbf842b3ed0ef24d3},
    {"xBGR2YCrCbPreview", 0x67aa307ce974295a},
    {"split_4componentPreview", 0x34685331a62b24d1},
    {"CalculateMaxMinChannel", 0x11acc1f718f1f1c5},
    {"CalculateMaxMinChannelPreview", 0xad4e5b6907639ce1},
    {"CalMaxMinThreadPreview", 0xeb38d6e37785dd4f},
    {"CalculateMinChannelPreview", 0x98cef0b3c04267d5},
    {"CalMCThreadPreview", 0xc2b1f13a3432087d},
    {"AverageFilterShort64_u8", 0xc359bad4dee83d2d},
    {"AverageFilter_u8", 0x8a96ce45f52843e3},
    {"AverageFilter_fPreview, one plane", 0xeec9366f4b4d3626},
    {"AverageFilter_f_2Preview", 0xf9cb4ec2d7f121e8},
    {"AverageFilter_fPreview, two planes", 0x13319d5130f9248d},
    {"AverageFilter_f_Out2Preview", 0x586f051def203b1a},
    {"AverageFilter_f_Out4Preview", 0xf5abb15308327eeb},
    {"GuidedFilterPreview", 0xa2701b5c94ce2cfb},
    {"CalculateTChannelPreviewNeonFloat", 0x4d331e53e150cdf8},
    {"CalculateTChannelPreviewNeon", 0x6319b61b52fc8f04},
    {"CalculateTChannelPreview", 0x774df77a5436d9a2},
    {"CalTThreadPreview", 0xc067fb91fd20ee00},
    {"EstimateAPreview", 0x163a332cdcad62ee},
    {"CalSumThreadPreview", 0x857f0eda32908331},
    {"CalMaxThreadPreview", 0x56c66a8e85a8c1e8},
    {"CalSum, CalMax and their workers", 0x97bfb5654c391b17},
    {"EstimateTPreview", 0xe4e7b2624f3355e3},
    {"CalculateDarkChannelPreview", 0xc1d8b66540937d78},
    {"CalculateDarkChannel_MultiThreadPreview", 0xb5478245435ff51d},
    {"getMinChannelPreview", 0x068e30832b9a251f},
    {"getMCandHistPreview", 0x10193ac18fade4bc},
    {"getMinChannel_horPreview", 0x982ee98072e27e5d},
    {"getMinChannel_verPreview", 0xe773b3ce20c471c5},
    {"CalDCThread_horPreview", 0xc0eeaaa9c1efada3},
    {"CalDCThread_verPreview", 0x509cb4d6b72d3d8f},
    {"getMaxChannelPreview, getMaxChannel_horPreview", 0x6074eebb297d0de8},
    {"getMaxChannel_verPreview", 0x987509066cf1d20e},
    {"HazeRemoving3Preview", 0x4be7fcfb003e83e7},
    {"HazeRemoving3Preview_NV21", 0xce078c7b00d7c150},
    {"HazeRemoving3Preview2_NV21", 0x7bbaa965d5975957},
    {"CalculateRemovePreview", 0x24ffbffb0f7d4712},
    {"CalRemoveThreadPreview", 0x71686a00fb6ac373},
    {"HazeRemoving3Preview_NV21_f", 0x4f21312243e97921},
    {"ImproveBrightnessPreview", 0x11325a772360f327},
    {"ZoomOutImgPreview", 0x78b3f09b216c2cdf},
    {"ZoomOutThreadPreview", 0x95fa1fa8f8c45610},
    {"ZoomIn_Linear_fPreview", 0x3b6797d006c9e89c},
    {"HazeRemovingPreview", 0x0e67c5a261668cb4},
    {"HazeRemoving1Preview", 0x0658fa2f997bbd2c},
    {"HazeRemoving2Preview", 0xced51e72c08de64b},
    {"HazeRemovingPreview, packed", 0x0e23895754966955},
    {"HazeRemovingThreadPreview", 0x6ccd69b7897d2b31},
    {"HRThreadPreview", 0x62ea3c48aa7b8bd3},
};
// clang-format on

uint64_t digest_of(const Block& block) {
  Random random(20);
  Fnv1a digest;
  for (int i = 0; i < kCalls; ++i) {
    const std::vector<uint8_t> bytes = draw_choices(random, 100);
    Choices choices(bytes.data(), bytes.size());
    Call call(Placement::kHeap);
    block.draw(choices, call);
    call.prepare();
    call.run();
    call.add_to(digest);
  }
  return digest.value();
}

TEST(SurfaceDigest, EqualsTheGoldenOneOfEveryBlock) {
  const std::vector<Block> blocks = all_blocks();
  ASSERT_EQ(blocks.size(), std::size(kGolden));
  for (size_t i = 0; i < blocks.size(); ++i) {
    EXPECT_STREQ(blocks[i].name, kGolden[i].block);
    const uint64_t digest = digest_of(blocks[i]);
    EXPECT_EQ(digest, kGolden[i].digest) << blocks[i].name << ": 0x" << std::hex << digest;
  }
}

}  // namespace
}  // namespace haze::test
