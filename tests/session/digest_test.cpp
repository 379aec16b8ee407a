// Digests of whole-frame sequences, the same on every target and with every set of vector paths.
// The inputs come from fixed seeds, so HAZE_TEST_SEED has no effect here.
#include <gtest/gtest.h>

#include <cstdint>
#include <ostream>
#include <string>
#include <vector>

#include "haze_preview.h"
#include "tests/support/fnv1a.h"
#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/session_pair.h"

namespace haze::test {
namespace {

constexpr int kLevels[] = {-50, 0, 40, 100, 250};

// Digests of the frames of a sequence, one sequence for each of kLevels.
struct Golden {
  int width;
  int height;
  int format;
  uint64_t digests[5];
};

std::string name_of(const Golden& golden) {
  return std::to_string(golden.width) + "x" + std::to_string(golden.height) +
         (golden.format == 3 ? "Planar" : "Nv21");
}

void PrintTo(const Golden& golden, std::ostream* out) { *out << name_of(golden); }

// clang-format off
constexpr Golden kGolden[] = {
    {128, 128, 0,
     {0x77b6eb6865be208b, 0x77b6eb6865be208b, 0xa624ba06783d76e8,
      0x616a31ba8015f0bf, 0x139ed24c050dc174}},
    {128, 128, 3,
     {0x77b6eb6865be208b, 0x77b6eb6865be208b, 0xec22dd040ec22d04,
      0xa19801f6fd88fcd8, 0x369d31695fe1553f}},
    {130, 130, 0,
     {0x725c7f3c7b968629, 0x725c7f3c7b968629, 0xa8657cffc8daa192,
      0x54a51a50f92e5595, 0x6bb8fc7c440b645a}},
    {130, 130, 3,
     {0x725c7f3c7b968629, 0x725c7f3c7b968629, 0x705518ccffc4d2ad,
      0xe8a649b109eabb40, 0xbfac880a2c8388dc}},
    {640, 480, 0,
     {0x41ec2aaaaf8b7b26, 0x41ec2aaaaf8b7b26, 0x4267750b3560ee8c,
      0x9888bf8173fa7cfe, 0xd43ce9a741f1016d}},
    {640, 480, 3,
     {0x41ec2aaaaf8b7b26, 0x41ec2aaaaf8b7b26, 0x51e51f0171db30fb,
      0x380f0dfb141c9f36, 0x1aa2e8ee1e4bbc62}},
    {1280, 720, 0,
     {0xe121371aab166d1c, 0xe121371aab166d1c, 0xebbe3c3f141baf31,
      0x64477865d39b3e4f, 0xcabe5c10f6b10a14}},
    {1280, 720, 3,
     {0xe121371aab166d1c, 0xe121371aab166d1c, 0xeb4fd43ca634984d,
      0x30373f801ae7c19b, 0x65162cdbe7bb4ba0}},
};
// clang-format on

// An estimate and a reuse frame of a hazy view, of rough blocks and of sparks in the dark (where
// strengths far above 1 still tell); then the cached map and light.
uint64_t sequence_digest(const Golden& golden, int level) {
  const int width = golden.width;
  const int height = golden.height;
  Random random(static_cast<uint64_t>(width) * 1000003u + static_cast<uint64_t>(height));
  SessionPair sessions;
  sessions.init(golden.format, width, height);
  Fnv1a digest;
  const auto run = [&](const std::vector<uint8_t>& frame) {
    const std::vector<uint8_t> recovered = sessions.remove_haze(frame, width, height, level);
    digest.add(recovered.data(), recovered.size());
  };
  for (int i = 0; i < 2; ++i) run(make_hazy_frame(random, width, height));
  for (const Mood mood : {Mood::kBlocks, Mood::kSparks})
    for (int i = 0; i < 2; ++i) run(make_frame(random, mood, Colours::kMuted, width, height));
  digest.add(gPreT, sizeof gPreT);
  digest.add(gPreAA, sizeof gPreAA);
  return digest.value();
}

class FrameDigest : public ::testing::TestWithParam<Golden> {};

INSTANTIATE_TEST_SUITE_P(Sizes, FrameDigest, ::testing::ValuesIn(kGolden),
                         [](const auto& golden) { return name_of(golden.param); });

TEST_P(FrameDigest, EqualsTheGoldenOne) {
  for (int i = 0; i < 5; ++i) {
    const uint64_t digest = sequence_digest(GetParam(), kLevels[i]);
    EXPECT_EQ(digest, GetParam().digests[i])
        << "level " << kLevels[i] << ", digest 0x" << std::hex << digest;
  }
}

}  // namespace
}  // namespace haze::test
