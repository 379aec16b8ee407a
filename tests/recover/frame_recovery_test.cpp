#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdint>
#include <ostream>
#include <string>
#include <thread>
#include <tuple>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/frame_recovery.h"
#include "tests/reference/tone_curve.h"
#include "tests/support/bytes_match.h"
#include "tests/support/guarded_buffer.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"

namespace haze::test {
namespace {

using Light = std::array<uint8_t, 3>;

struct Layout {
  const char* name;
  void (*recover)(unsigned char*, unsigned char*, unsigned char*, int, int, int);
  void (*reference)(uint8_t*, const uint8_t*, const uint8_t*, int, int);
  bool interleaved;
};

const Layout kNv21 = {"Nv21", HazeRemoving3Preview_NV21, reference::recover_nv21, true};
const Layout kPlanar = {"Planar", HazeRemoving3Preview, reference::recover_planar, false};

void PrintTo(const Layout& layout, std::ostream* out) { *out << layout.name; }

Light grey(int value) {
  const uint8_t byte = static_cast<uint8_t>(value);
  return {byte, byte, byte};
}

Light random_light(Random& random) { return {random.byte(), random.byte(), random.byte()}; }

std::vector<uint8_t> random_codes(Random& random, int width, int height, int first, int last) {
  std::vector<uint8_t> codes(static_cast<size_t>(width / 2 * (height / 2)));
  for (uint8_t& code : codes) code = static_cast<uint8_t>(random.between(first, last));
  return codes;
}

// Frame, map and light in buffers of their exact sizes, against the reference.
void compare(const Layout& layout, const std::vector<uint8_t>& frame,
             const std::vector<uint8_t>& codes, const Light& light, int width, int height,
             int recover_arg = 0) {
  std::vector<uint8_t> want = frame;
  layout.reference(want.data(), codes.data(), light.data(), width, height);
  GuardedBuffer<uint8_t> actual(frame);
  GuardedBuffer<uint8_t> map(codes);
  GuardedBuffer<uint8_t> light_bgr(std::vector<uint8_t>(light.begin(), light.end()));
  layout.recover(actual.data(), map.data(), light_bgr.data(), width, height, recover_arg);
  ASSERT_TRUE(bytes_match(actual, want,
                          {{"width", width},
                           {"height", height},
                           {"B", light[0]},
                           {"G", light[1]},
                           {"R", light[2]},
                           {"row", width}}))
      << layout.name;
  ASSERT_TRUE(bytes_match(map, codes));
  ASSERT_TRUE(bytes_match(light_bgr, light));
}

class FrameRecovery : public ::testing::TestWithParam<Layout> {};

INSTANTIATE_TEST_SUITE_P(Layouts, FrameRecovery, ::testing::Values(kNv21, kPlanar),
                         [](const auto& layout) { return std::string(layout.param.name); });

// One 2 x 2 block: four luma bytes and one chroma pair.
struct Block {
  std::array<uint8_t, 4> luma;
  uint8_t u;
  uint8_t v;
};

Block recover_block(const Layout& layout, const Block& in, int code, const Light& light,
                    int recover_arg = 0) {
  std::vector<uint8_t> frame(in.luma.begin(), in.luma.end());
  frame.push_back(layout.interleaved ? in.v : in.u);
  frame.push_back(layout.interleaved ? in.u : in.v);
  GuardedBuffer<uint8_t> buffer(frame);
  uint8_t map[1] = {static_cast<uint8_t>(code)};
  Light light_bgr = light;
  layout.recover(buffer.data(), map, light_bgr.data(), 2, 2, recover_arg);
  return {{buffer[0], buffer[1], buffer[2], buffer[3]},
          layout.interleaved ? buffer[5] : buffer[4],
          layout.interleaved ? buffer[4] : buffer[5]};
}

TEST_P(FrameRecovery, NearlyClearCode158) {
  const Block out = recover_block(GetParam(), {{200, 100, 0, 100}, 128, 128}, 158, grey(100));
  EXPECT_EQ(out.luma, (std::array<uint8_t, 4>{205, 114, 0, 114}));
  EXPECT_EQ(out.u, 128);
  EXPECT_EQ(out.v, 128);
}

TEST_P(FrameRecovery, DensestCode40) {
  const Block out = recover_block(GetParam(), {{200, 60, 100, 0}, 140, 80}, 40, grey(100));
  EXPECT_EQ(out.luma, (std::array<uint8_t, 4>{250, 0, 114, 0}));
  EXPECT_EQ(out.u, 158);
  EXPECT_EQ(out.v, 8);
  const Block swapped = recover_block(GetParam(), {{0, 0, 0, 0}, 80, 140}, 40, grey(100));
  EXPECT_EQ(swapped.u, 8);
  EXPECT_EQ(swapped.v, 158);
}

// Three equal bytes of 23 add up to a luma of 22.
TEST_P(FrameRecovery, LightLumaBelowItsBytes) {
  const Block out = recover_block(GetParam(), {{22, 23, 22, 23}, 128, 128}, 40, grey(23));
  EXPECT_EQ(out.luma, (std::array<uint8_t, 4>{28, 31, 28, 31}));
}

TEST_P(FrameRecovery, Code0HasFactor5) {
  const Block out = recover_block(GetParam(), {{0, 10, 50, 51}, 130, 100}, 0, grey(0));
  EXPECT_EQ(out.luma, (std::array<uint8_t, 4>{0, reference::kToneCurve[50],
                                              reference::kToneCurve[250], 250}));
  EXPECT_EQ(out.u, 138);
  EXPECT_EQ(out.v, 0);
}

TEST_P(FrameRecovery, LastArgumentHasNoEffect) {
  const Block in = {{200, 90, 130, 17}, 140, 97};
  const Block want = recover_block(GetParam(), in, 77, {180, 190, 200}, 0);
  for (const int recover_arg : {1, -1, 3, 255, INT_MAX, INT_MIN}) {
    const Block out = recover_block(GetParam(), in, 77, {180, 190, 200}, recover_arg);
    EXPECT_EQ(out.luma, want.luma);
    EXPECT_EQ(out.u, want.u);
    EXPECT_EQ(out.v, want.v);
  }
}

TEST(FrameRecoveryLight, GreyLightsOneBelowTheirBytes) {
  const std::vector<int> below = {23,  46,  57,  59,  92,  114, 118, 127,
                                  184, 205, 223, 228, 236, 241, 249, 254};
  std::vector<int> found;
  for (int a = 0; a < 256; ++a) {
    const reference::LightYuv light = reference::light_to_yuv(grey(a).data());
    if (light.y != a) found.push_back(a);
    EXPECT_TRUE(light.y == a || light.y == a - 1);
    EXPECT_EQ(light.u, 128);
    EXPECT_EQ(light.v, 128);
    // A sample equal to the light's luma stays what it is but for the tone curve.
    for (const int y : {light.y, 255 - light.y}) {
      const uint8_t sample = static_cast<uint8_t>(y);
      const Block out =
          recover_block(kNv21, {{sample, sample, sample, sample}, 128, 128}, 40, grey(a));
      EXPECT_EQ(out.luma[0],
                reference::recover_luma(sample, light.y, reference::recovery_factor(40)));
    }
  }
  EXPECT_EQ(found, below);
}

// A frame with every (code, value) pair in each channel: 256 map samples per code in rows of 64.
// Luma takes each value four times, chroma once.
class EveryCodeAndValue {
 public:
  static constexpr int kCodes = 160;
  static constexpr int kHalfWidth = 64;
  static constexpr int kRowsPerCode = 4;
  static constexpr int kWidth = 2 * kHalfWidth;
  static constexpr int kHeight = 2 * kRowsPerCode * kCodes;

  explicit EveryCodeAndValue(const Layout& layout)
      : layout_(layout), codes_(kHalfWidth * kRowsPerCode * kCodes) {
    for (size_t i = 0; i < codes_.size(); ++i) codes_[i] = static_cast<uint8_t>(i / 256);
    for (int y = 0; y < kHeight; ++y)
      for (int x = 0; x < kWidth; ++x) add(Channel::kLuma, y / 8, (y % 2) * kWidth + x);
    const int samples = static_cast<int>(codes_.size());
    if (layout.interleaved) {
      for (int i = 0; i < samples; ++i) {
        add(Channel::kV, i / 256, i % 256);
        add(Channel::kU, i / 256, 255 - i % 256);
      }
    } else {
      for (int i = 0; i < samples; ++i) add(Channel::kU, i / 256, 255 - i % 256);
      for (int i = 0; i < samples; ++i) add(Channel::kV, i / 256, i % 256);
    }
  }

  void compare(const Light& light) {
    const reference::LightYuv yuv = reference::light_to_yuv(light.data());
    for (int code = 0; code < kCodes; ++code) {
      const float factor = reference::recovery_factor(code);
      for (int value = 0; value < 256; ++value) {
        const uint8_t byte = static_cast<uint8_t>(value);
        const int entry = code * 256 + value;
        wanted(Channel::kLuma, entry) = reference::recover_luma(byte, yuv.y, factor);
        wanted(Channel::kU, entry) = reference::recover_chroma(byte, yuv.u, factor);
        wanted(Channel::kV, entry) = reference::recover_chroma(byte, yuv.v, factor);
      }
    }
    const size_t bytes = frame_.size();
    std::vector<uint8_t> want(bytes);
    for (size_t i = 0; i < bytes; ++i) want[i] = wanted_[entries_[i]];
    std::vector<uint8_t> actual = frame_;
    Light light_bgr = light;
    layout_.recover(actual.data(), codes_.data(), light_bgr.data(), kWidth, kHeight, 0);
    ASSERT_TRUE(bytes_match(actual, want,
                            {{"B", light[0]}, {"G", light[1]}, {"R", light[2]}, {"row", kWidth}}))
        << layout_.name;
  }

 private:
  enum class Channel { kLuma, kU, kV };

  static size_t table_index(Channel channel, int entry) {
    return static_cast<size_t>(static_cast<int>(channel) * kCodes * 256 + entry);
  }
  uint8_t& wanted(Channel channel, int entry) { return wanted_[table_index(channel, entry)]; }

  void add(Channel channel, int code, int value) {
    frame_.push_back(static_cast<uint8_t>(value));
    entries_.push_back(static_cast<uint32_t>(table_index(channel, code * 256 + value)));
  }

  const Layout& layout_;
  std::vector<uint8_t> codes_;
  std::vector<uint8_t> frame_;
  std::vector<uint32_t> entries_;
  std::vector<uint8_t> wanted_ = std::vector<uint8_t>(3 * kCodes * 256);
};

// In four parts, so that they may run side by side.
class GreyLights : public ::testing::TestWithParam<std::tuple<Layout, int>> {};

INSTANTIATE_TEST_SUITE_P(Quarters, GreyLights,
                         ::testing::Combine(::testing::Values(kNv21, kPlanar),
                                            ::testing::Values(0, 1, 2, 3)),
                         [](const auto& quarter) {
                           return std::string(std::get<0>(quarter.param).name) +
                                  std::to_string(std::get<1>(quarter.param));
                         });

TEST_P(GreyLights, EveryCodeAndValue) {
  EveryCodeAndValue frame(std::get<0>(GetParam()));
  for (int a = std::get<1>(GetParam()); a < 256; a += 4) frame.compare(grey(a));
}

TEST_P(FrameRecovery, ColouredLightsEveryCodeAndValue) {
  Random random(test_seed());
  EveryCodeAndValue frame(GetParam());
  for (const Light light : {Light{255, 0, 0}, Light{0, 255, 0}, Light{0, 0, 255},
                            Light{0, 255, 255}, Light{255, 0, 255}, Light{255, 255, 0}})
    frame.compare(light);
  for (int i = 0; i < 24; ++i) frame.compare(random_light(random));
}

TEST_P(FrameRecovery, CodesOf160AndAboveFollowTheFormula) {
  Random random(test_seed());
  for (int i = 0; i < 8; ++i) {
    const std::vector<uint8_t> frame = make_frame(random, Mood::kNoise, Colours::kWild, 192, 96);
    compare(GetParam(), frame, random_codes(random, 192, 96, i < 4 ? 160 : 0, 255),
            random_light(random), 192, 96);
  }
  for (int code = 0; code < 256; ++code)
    compare(GetParam(), make_frame(random, Mood::kNoise, Colours::kWild, 16, 4),
            std::vector<uint8_t>(16, static_cast<uint8_t>(code)), random_light(random), 16, 4);
}

TEST_P(FrameRecovery, EveryTailLength) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 40; ++half_width)
    for (const Mood mood : kMoods) {
      const int width = 2 * half_width;
      const int height = 2 * random.between(1, 3);
      compare(GetParam(), make_frame(random, mood, Colours::kWild, width, height),
              random_codes(random, width, height, 0, 159), random_light(random), width, height);
    }
}

TEST_P(FrameRecovery, FrameSizes) {
  Random random(test_seed());
  const int sizes[][2] = {{2, 720}, {1280, 2}, {128, 128}, {130, 130}, {640, 480}, {1280, 720}};
  for (const auto& size : sizes)
    compare(GetParam(), make_hazy_frame(random, size[0], size[1]),
            random_codes(random, size[0], size[1], 40, 158), grey(random.byte()), size[0], size[1],
            7);
}

// One code for the whole frame, and few codes: whatever a table is built for, the bytes are the
// same.
TEST_P(FrameRecovery, FewCodes) {
  Random random(test_seed());
  for (const int code : {0, 1, 39, 40, 41, 99, 157, 158, 159}) {
    const std::vector<uint8_t> frame = make_frame(random, Mood::kNoise, Colours::kWild, 66, 34);
    std::vector<uint8_t> codes(33 * 17, static_cast<uint8_t>(code));
    compare(GetParam(), frame, codes, grey(200), 66, 34);
    codes.back() = static_cast<uint8_t>(159 - code);
    compare(GetParam(), frame, codes, grey(200), 66, 34);
  }
}

TEST_P(FrameRecovery, CallsDoNotRememberTheLight) {
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_frame(random, Mood::kNoise, Colours::kWild, 64, 64);
  const std::vector<uint8_t> codes = random_codes(random, 64, 64, 0, 158);
  for (const int a : {200, 201, 200, 23, 22, 23, 0, 255})
    compare(GetParam(), frame, codes, grey(a), 64, 64);
  compare(GetParam(), frame, codes, {10, 200, 30}, 64, 64);
  compare(GetParam(), frame, codes, {30, 200, 10}, 64, 64);
}

TEST_P(FrameRecovery, TouchesNothingPastTheFrame) {
  Random random(test_seed());
  for (int half_width = 1; half_width <= 40; ++half_width) {
    const int width = 2 * half_width;
    const std::vector<uint8_t> content = make_frame(random, Mood::kNoise, Colours::kWild, width, 4);
    PageEndBuffer<uint8_t> frame(content);
    PageEndBuffer<uint8_t> codes(random_codes(random, width, 4, 0, 158));
    PageEndBuffer<uint8_t> light(std::vector<uint8_t>{90, 180, 200});
    std::vector<uint8_t> want = content;
    GetParam().reference(want.data(), codes.data(), light.data(), width, 4);
    GetParam().recover(frame.data(), codes.data(), light.data(), width, 4, 0);
    EXPECT_TRUE(bytes_match(frame, want, {{"width", width}}));
  }
}

TEST_P(FrameRecovery, EmptySizesWriteNothing) {
  std::vector<uint8_t> codes(256, 40);
  Light light = grey(100);
  const int sizes[][2] = {{0, 0},       {0, 2},   {2, 0},   {1, 2},   {2, 1},
                          {1, 1},       {-2, 2},  {2, -2},  {-2, -2}, {INT_MIN, 2},
                          {2, INT_MIN}, {-8, -8}, {-16, 4}, {4, -16}, {-1, -1}};
  for (const auto& size : sizes) {
    GuardedBuffer<uint8_t> frame(384, 60);
    GetParam().recover(frame.data(), codes.data(), light.data(), size[0], size[1], 0);
    EXPECT_TRUE(all_bytes_are(frame, 60, {{"width", size[0]}, {"height", size[1]}}));
  }
}

TEST(FrameRecoveryLayouts, LumaIsTheSameInBoth) {
  Random random(test_seed());
  const std::vector<uint8_t> frame = make_hazy_frame(random, 96, 64);
  std::vector<uint8_t> codes = random_codes(random, 96, 64, 40, 158);
  Light light = {170, 180, 190};
  std::vector<uint8_t> nv21 = frame;
  std::vector<uint8_t> planar = frame;
  HazeRemoving3Preview_NV21(nv21.data(), codes.data(), light.data(), 96, 64, 0);
  HazeRemoving3Preview(planar.data(), codes.data(), light.data(), 96, 64, 0);
  const size_t luma_bytes = 96 * 64;
  EXPECT_TRUE(bytes_match({planar.data(), luma_bytes}, {nv21.data(), luma_bytes}));
  // The same chroma samples in the other order come out the same.
  std::vector<uint8_t> reordered = frame;
  const size_t quarter = luma_bytes / 4;
  for (size_t i = 0; i < quarter; ++i) {
    reordered[luma_bytes + i] = frame[luma_bytes + 2 * i + 1];
    reordered[luma_bytes + quarter + i] = frame[luma_bytes + 2 * i];
  }
  HazeRemoving3Preview(reordered.data(), codes.data(), light.data(), 96, 64, 0);
  for (size_t i = 0; i < quarter; ++i) {
    ASSERT_EQ(reordered[luma_bytes + i], nv21[luma_bytes + 2 * i + 1]) << i;
    ASSERT_EQ(reordered[luma_bytes + quarter + i], nv21[luma_bytes + 2 * i]) << i;
  }
}

// Calls share nothing: four threads with lights and layouts of their own.
TEST(FrameRecoveryThreads, IndependentCalls) {
  struct Job {
    Layout layout;
    Light light;
    std::vector<uint8_t> frame;
    std::vector<uint8_t> codes;
    std::vector<uint8_t> want;
  };
  constexpr int kWidth = 128;
  constexpr int kHeight = 128;
  Random random(test_seed());
  std::vector<Job> jobs;
  for (int i = 0; i < 4; ++i) {
    Job job = {i % 2 == 0 ? kNv21 : kPlanar, random_light(random),
               make_frame(random, Mood::kNoise, Colours::kWild, kWidth, kHeight),
               random_codes(random, kWidth, kHeight, 0, 158), std::vector<uint8_t>()};
    job.want = job.frame;
    job.layout.reference(job.want.data(), job.codes.data(), job.light.data(), kWidth, kHeight);
    jobs.push_back(job);
  }
  for (int round = 0; round < 5; ++round) {
    std::vector<Job> running = jobs;
    std::vector<std::thread> threads;
    for (Job& job : running)
      threads.emplace_back([&job] {
        job.layout.recover(job.frame.data(), job.codes.data(), job.light.data(), kWidth, kHeight,
                           0);
      });
    for (std::thread& thread : threads) thread.join();
    for (const Job& job : running)
      EXPECT_TRUE(bytes_match(job.frame, job.want, {{"round", round}, {"row", kWidth}}));
  }
}

}  // namespace
}  // namespace haze::test
