// One BGR pixel per 2 x 2 block: NV21 by two functions, planar chroma by one.
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/color_convert.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

size_t area(int width, int height) { return static_cast<size_t>(width * height); }

using ConvertNv21 = void (*)(unsigned char*, unsigned char*, unsigned char*, int, int);
using DefineNv21 = void (*)(const uint8_t*, const uint8_t*, uint8_t*, int, int);

struct Nv21Conversion {
  const char* name;
  ConvertNv21 convert;
  DefineNv21 define;
  bool rounds_up;

  int half(int full) const { return (full + (rounds_up ? 1 : 0)) / 2; }
};

const Nv21Conversion kScalar = {"xYCrCb2BGRPreview_NV21", xYCrCb2BGRPreview_NV21,
                                reference::half_bgr_nv21, true};
const Nv21Conversion kNeon = {"xYCrCb2BGRPreviewNeon_NV21", xYCrCb2BGRPreviewNeon_NV21,
                              reference::half_bgr_nv21_rounded_down, false};

void compare_nv21(const Nv21Conversion& conversion, Random& random, Mood luma_mood,
                  Mood chroma_mood, int width, int height, size_t skew = 0) {
  SCOPED_TRACE(conversion.name);
  const int half_width = conversion.half(width);
  const int half_height = conversion.half(height);
  const std::vector<uint8_t> luma_content = make_image(random, luma_mood, width, height);
  const std::vector<uint8_t> vu_content =
      make_image(random, chroma_mood, 2 * half_width, half_height);
  GuardedBuffer<uint8_t> luma(luma_content, skew);
  GuardedBuffer<uint8_t> vu(vu_content, skew);
  GuardedBuffer<uint8_t> bgr(3 * area(half_width, half_height), 0xA5, skew);
  std::vector<uint8_t> want(bgr.size(), 0x5A);
  conversion.convert(luma.data(), vu.data(), bgr.data(), width, height);
  conversion.define(luma_content.data(), vu_content.data(), want.data(), width, height);
  EXPECT_TRUE(
      bytes_match(bgr, want, {{"width", width}, {"height", height}, {"row", 3 * half_width}}));
  EXPECT_TRUE(bytes_match(luma, luma_content));
  EXPECT_TRUE(bytes_match(vu, vu_content));
}

// The size by which the V plane is found, as it was before the test.
class FrameSizeGlobals {
 public:
  FrameSizeGlobals() : width_(gZoomOutWPreview), height_(gZoomOutHPreview) {}
  FrameSizeGlobals(const FrameSizeGlobals&) = delete;
  FrameSizeGlobals& operator=(const FrameSizeGlobals&) = delete;
  ~FrameSizeGlobals() { set(width_, height_); }

  void set(int width, int height) {
    gZoomOutWPreview = width;
    gZoomOutHPreview = height;
  }

 private:
  int width_;
  int height_;
};

// Converts a stripe of width x height whose frame has the given size. U and V stand in one buffer
// from the stripe's first U to its last V, as they do in a frame.
void compare_planar(Random& random, Mood luma_mood, Mood chroma_mood, int width, int height,
                    int frame_width, int frame_height, size_t skew = 0) {
  const int half_width = (width + 1) / 2;
  const int half_height = (height + 1) / 2;
  const int v_offset = frame_width * frame_height / 4;
  const std::vector<uint8_t> luma_content = make_image(random, luma_mood, width, height);
  const std::vector<uint8_t> chroma_content =
      make_image(random, chroma_mood, v_offset + half_width * half_height, 1);
  GuardedBuffer<uint8_t> luma(luma_content, skew);
  GuardedBuffer<uint8_t> chroma(chroma_content, skew);
  GuardedBuffer<uint8_t> bgr(3 * area(half_width, half_height), 0xA5, skew);
  std::vector<uint8_t> want(bgr.size(), 0x5A);
  FrameSizeGlobals globals;
  globals.set(frame_width, frame_height);
  xYCrCb2BGRPreview(luma.data(), chroma.data(), bgr.data(), width, height);
  EXPECT_EQ(gZoomOutWPreview, frame_width);
  EXPECT_EQ(gZoomOutHPreview, frame_height);
  reference::half_bgr_planar(luma_content.data(), chroma_content.data(),
                             chroma_content.data() + v_offset, want.data(), width, height);
  EXPECT_TRUE(bytes_match(bgr, want,
                          {{"width", width},
                           {"height", height},
                           {"frame width", frame_width},
                           {"frame height", frame_height},
                           {"row", 3 * half_width}}));
  EXPECT_TRUE(bytes_match(luma, luma_content));
  EXPECT_TRUE(bytes_match(chroma, chroma_content));
}

// Rows run over Cb and columns over Y; one call per Cr and function.
TEST(HalfResolutionBgr, EveryTripleOfYCrCb) {
  constexpr int kHalf = 256;
  constexpr int kSize = 2 * kHalf;
  std::vector<uint8_t> luma(area(kSize, kSize));
  // Luma beside the sampled positions is the complement, which no sample may pick up.
  for (int y = 0; y < kSize; ++y)
    for (int x = 0; x < kSize; ++x)
      luma[area(y, kSize) + static_cast<size_t>(x)] =
          static_cast<uint8_t>(x % 2 == 0 && y % 2 == 0 ? x / 2 : 255 - x / 2);
  std::vector<uint8_t> vu(area(kSize, kHalf));
  std::vector<uint8_t> planes(vu.size());
  for (size_t i = 0; i < area(kHalf, kHalf); ++i) {
    vu[2 * i + 1] = static_cast<uint8_t>(i / kHalf);
    planes[i] = vu[2 * i + 1];
  }
  std::vector<uint8_t> want(3 * area(kHalf, kHalf));
  std::vector<uint8_t> actual(want.size());
  FrameSizeGlobals globals;
  globals.set(kSize, kSize);
  for (int cr = 0; cr < 256; ++cr) {
    uint8_t* out = want.data();
    for (int cb = 0; cb < kHalf; ++cb)
      for (int y = 0; y < kHalf; ++y) {
        const reference::Bgr pixel = reference::bgr_of_ycrcb(y, cr, cb);
        *out++ = pixel.b;
        *out++ = pixel.g;
        *out++ = pixel.r;
      }
    for (size_t i = 0; i < area(kHalf, kHalf); ++i) {
      vu[2 * i] = static_cast<uint8_t>(cr);
      planes[area(kHalf, kHalf) + i] = static_cast<uint8_t>(cr);
    }
    for (size_t i = 0; i < want.size(); ++i) actual[i] = static_cast<uint8_t>(~want[i]);
    xYCrCb2BGRPreviewNeon_NV21(luma.data(), vu.data(), actual.data(), kSize, kSize);
    ASSERT_TRUE(bytes_match(actual, want, {{"neon, cr", cr}, {"row", 3 * kHalf}}));
    for (size_t i = 0; i < want.size(); ++i) actual[i] = static_cast<uint8_t>(~want[i]);
    xYCrCb2BGRPreview_NV21(luma.data(), vu.data(), actual.data(), kSize, kSize);
    ASSERT_TRUE(bytes_match(actual, want, {{"scalar, cr", cr}, {"row", 3 * kHalf}}));
    for (size_t i = 0; i < want.size(); ++i) actual[i] = static_cast<uint8_t>(~want[i]);
    xYCrCb2BGRPreview(luma.data(), planes.data(), actual.data(), kSize, kSize);
    ASSERT_TRUE(bytes_match(actual, want, {{"planar, cr", cr}, {"row", 3 * kHalf}}));
  }
}

TEST(HalfResolutionBgr, TwoByTwo) {
  std::vector<uint8_t> luma = {128, 11, 22, 33};
  std::vector<uint8_t> vu = {255, 0};
  std::vector<uint8_t> uv = {0, 255};
  // Cr' = 127, Cb' = -128: B = 128 - 227, G = 128 - 47, R = 128 + 178.
  const std::vector<uint8_t> want = {0, 81, 255};
  std::vector<uint8_t> bgr(3, 7);
  xYCrCb2BGRPreview_NV21(luma.data(), vu.data(), bgr.data(), 2, 2);
  EXPECT_EQ(bgr, want);
  bgr.assign(3, 7);
  xYCrCb2BGRPreviewNeon_NV21(luma.data(), vu.data(), bgr.data(), 2, 2);
  EXPECT_EQ(bgr, want);
  bgr.assign(3, 7);
  FrameSizeGlobals globals;
  globals.set(2, 2);
  xYCrCb2BGRPreview(luma.data(), uv.data(), bgr.data(), 2, 2);
  EXPECT_EQ(bgr, want);
}

// 16 blocks in whole steps and 2 after them.
TEST(HalfResolutionBgr, Width36EqualsScalar) {
  Random random(test_seed());
  std::vector<uint8_t> luma = make_image(random, Mood::kNoise, 36, 10);
  std::vector<uint8_t> vu = make_image(random, Mood::kNoise, 36, 5);
  std::vector<uint8_t> scalar(3 * area(18, 5), 1);
  std::vector<uint8_t> neon(scalar.size(), 2);
  xYCrCb2BGRPreview_NV21(luma.data(), vu.data(), scalar.data(), 36, 10);
  xYCrCb2BGRPreviewNeon_NV21(luma.data(), vu.data(), neon.data(), 36, 10);
  EXPECT_TRUE(bytes_match(neon, scalar, {{"row", 54}}));
}

TEST(HalfResolutionBgr, EveryTailLength) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 40; ++half_width)
    for (const Mood luma_mood : kMoods)
      for (const Mood chroma_mood : {Mood::kNoise, Mood::kBlocks, Mood::kNearZero}) {
        const int width = 2 * half_width;
        const int height = 2 * random.between(1, 4);
        compare_nv21(kScalar, random, luma_mood, chroma_mood, width, height);
        compare_nv21(kNeon, random, luma_mood, chroma_mood, width, height);
        compare_planar(random, luma_mood, chroma_mood, width, height, width, height);
      }
}

// Up to three of the widest vector steps.
TEST(HalfResolutionBgr, HalfWidthsUpTo200) {
  Random random(test_seed());
  for (int half_width = 41; half_width <= 200; ++half_width) {
    const Mood mood = random.one_of(kMoods);
    compare_nv21(kScalar, random, mood, Mood::kNoise, 2 * half_width, 4);
    compare_nv21(kNeon, random, mood, Mood::kNoise, 2 * half_width, 4);
    compare_planar(random, mood, Mood::kNoise, 2 * half_width, 4, 2 * half_width, 4);
  }
}

TEST(HalfResolutionBgr, UnalignedStarts) {
  Random random(test_seed());
  for (size_t skew = 1; skew < 16; ++skew) {
    const int width = 2 * random.between(1, 40);
    compare_nv21(kScalar, random, Mood::kNoise, Mood::kNoise, width, 4, skew);
    compare_nv21(kNeon, random, Mood::kNoise, Mood::kNoise, width, 4, skew);
    compare_planar(random, Mood::kNoise, Mood::kNoise, width, 4, width, 4, skew);
  }
}

TEST(HalfResolutionBgr, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{640, 360}, {1280, 720}, {130, 130}};
  for (const auto& size : sizes) {
    compare_nv21(kScalar, random, Mood::kGradient, Mood::kNoise, size[0], size[1]);
    compare_nv21(kNeon, random, Mood::kBlocks, Mood::kNoise, size[0], size[1]);
    compare_planar(random, Mood::kNoise, Mood::kBlocks, size[0], size[1], size[0], size[1]);
  }
}

// Blocks cut by the right or lower border count.
TEST(HalfResolutionBgr, OddSizesRoundUp) {
  Random random(test_seed());
  for (int width = 1; width <= 41; ++width)
    for (const int height : {1, 2, 3, 5, 8}) {
      compare_nv21(kScalar, random, Mood::kNoise, Mood::kNoise, width, height);
      compare_planar(random, Mood::kNoise, Mood::kNoise, width, height, width, 2 * height + 6);
    }
}

// Blocks cut by a border are left out, and the positions fall behind by a byte per row.
TEST(HalfResolutionBgr, OddSizesRoundDownInTheVectorVersion) {
  Random random(test_seed());
  for (int width = 1; width <= 41; ++width)
    for (const int height : {1, 2, 3, 5, 8})
      compare_nv21(kNeon, random, Mood::kNoise, Mood::kNoise, width, height);
}

TEST(HalfResolutionBgr, VPlaneIsFoundByTheSizeOfTheFrame) {
  Random random(test_seed());
  for (int i = 0; i < 60; ++i) {
    const int width = 2 * random.between(1, 30);
    const int height = 2 * random.between(1, 6);
    // A stripe of a frame of the same width, then frames that have nothing to do with it.
    compare_planar(random, Mood::kNoise, Mood::kNoise, width, height, width,
                   height + 2 * random.between(0, 40));
    compare_planar(random, Mood::kNoise, Mood::kNoise, width, height, random.between(1, 60),
                   random.between(1, 60));
  }
  // A quarter of 15 is 3; a frame without area has V where U is.
  compare_planar(random, Mood::kNoise, Mood::kNoise, 6, 4, 5, 3);
  compare_planar(random, Mood::kNoise, Mood::kNoise, 6, 4, 0, 0);
}

TEST(HalfResolutionBgr, OddLumaRowsAndColumnsDoNotMatter) {
  constexpr int kWidth = 46;
  constexpr int kHeight = 8;
  Random random(test_seed());
  std::vector<uint8_t> luma = make_image(random, Mood::kNoise, kWidth, kHeight);
  std::vector<uint8_t> chroma = make_image(random, Mood::kNoise, kWidth, kHeight / 2);
  FrameSizeGlobals globals;
  globals.set(kWidth, kHeight);
  for (const ConvertNv21 convert :
       {xYCrCb2BGRPreview_NV21, xYCrCb2BGRPreviewNeon_NV21, xYCrCb2BGRPreview}) {
    std::vector<uint8_t> before(3 * area(kWidth / 2, kHeight / 2), 1);
    std::vector<uint8_t> after(before.size(), 2);
    convert(luma.data(), chroma.data(), before.data(), kWidth, kHeight);
    for (int y = 0; y < kHeight; ++y)
      for (int x = 0; x < kWidth; ++x)
        if (y % 2 == 1 || x % 2 == 1)
          luma[area(y, kWidth) + static_cast<size_t>(x)] = random.byte();
    convert(luma.data(), chroma.data(), after.data(), kWidth, kHeight);
    EXPECT_TRUE(bytes_match(after, before));
  }
}

// The last luma row that matters is an even one: nothing past its end may be read.
TEST(HalfResolutionBgr, ReadsNothingPastTheLastRows) {
  Random random(test_seed());
  FrameSizeGlobals globals;
  for (int half_width = 1; half_width <= 140; ++half_width) {
    const int width = 2 * half_width;
    PageEndBuffer<uint8_t> luma(make_image(random, Mood::kNoise, width, 3));
    PageEndBuffer<uint8_t> chroma(make_image(random, Mood::kNoise, width, 2));
    std::vector<uint8_t> want(3 * area(half_width, 2));
    reference::half_bgr_nv21(luma.data(), chroma.data(), want.data(), width, 4);
    for (const Nv21Conversion& conversion : {kScalar, kNeon}) {
      PageEndBuffer<uint8_t> bgr(want.size());
      conversion.convert(luma.data(), chroma.data(), bgr.data(), width, 4);
      EXPECT_TRUE(bytes_match(bgr, want, {{"half width", half_width}})) << conversion.name;
    }
    reference::half_bgr_planar(luma.data(), chroma.data(), chroma.data() + width, want.data(),
                               width, 4);
    PageEndBuffer<uint8_t> bgr(want.size());
    globals.set(width, 4);
    xYCrCb2BGRPreview(luma.data(), chroma.data(), bgr.data(), width, 4);
    EXPECT_TRUE(bytes_match(bgr, want, {{"planar, half width", half_width}}));
  }
}

// An odd width ends in a block of one column, an odd height in one of one row: the image may end
// with that byte, whole steps of blocks or not.
TEST(HalfResolutionBgr, OddSizesReadNothingPastTheLastLuma) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 200; ++half_width) {
    const int width = 2 * half_width - 1;
    PageEndBuffer<uint8_t> luma(make_image(random, Mood::kNoise, width, 3));
    PageEndBuffer<uint8_t> vu(make_image(random, Mood::kNoise, 2 * half_width, 2));
    std::vector<uint8_t> want(3 * area(half_width, 2));
    reference::half_bgr_nv21(luma.data(), vu.data(), want.data(), width, 3);
    PageEndBuffer<uint8_t> bgr(want.size());
    xYCrCb2BGRPreview_NV21(luma.data(), vu.data(), bgr.data(), width, 3);
    EXPECT_TRUE(bytes_match(bgr, want, {{"width", width}}));
  }
}

TEST(HalfResolutionBgr, EmptySizesWriteNothing) {
  const int sizes[][2] = {{0, 0},   {0, 4},       {4, 0},       {-2, 4},  {4, -2},
                          {-4, -4}, {-8, -8},     {-1, -1},     {16, -1}, {-16, 1},
                          {-1, 16}, {INT_MIN, 4}, {4, INT_MIN}, {0, -4},  {-4, 0}};
  std::vector<uint8_t> source(512, 200);
  FrameSizeGlobals globals;
  globals.set(8, 8);
  for (const ConvertNv21 convert :
       {xYCrCb2BGRPreview_NV21, xYCrCb2BGRPreviewNeon_NV21, xYCrCb2BGRPreview})
    for (const auto& size : sizes) {
      GuardedBuffer<uint8_t> bgr(512, 0xA5);
      convert(source.data() + 256, source.data() + 256, bgr.data() + 256, size[0], size[1]);
      EXPECT_TRUE(all_bytes_are(bgr, 0xA5, {{"width", size[0]}, {"height", size[1]}}));
    }
}

// Less than a block is a block for the rounding up and nothing for the rounding down.
TEST(HalfResolutionBgr, OneByOne) {
  uint8_t luma = 77;
  std::vector<uint8_t> vu = {128, 128};
  std::vector<uint8_t> bgr(3, 0xA5);
  xYCrCb2BGRPreviewNeon_NV21(&luma, vu.data(), bgr.data(), 1, 1);
  EXPECT_TRUE(all_bytes_are(bgr, 0xA5));
  xYCrCb2BGRPreview_NV21(&luma, vu.data(), bgr.data(), 1, 1);
  EXPECT_TRUE(all_bytes_are(bgr, 77));
}

}  // namespace
}  // namespace haze::test
