// Long runs of frames, format switches, size changes, releases and restarts, compared after every
// call.
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <vector>

#include "tests/support/moods.h"
#include "tests/support/random.h"
#include "tests/support/session_pair.h"

namespace haze::test {
namespace {

struct Size {
  int width;
  int height;
};

constexpr int kFormats[] = {0, 3, 3, 0, 1, 2, 4, -1, 0x7fffffff, INT_MIN};
constexpr int kLevels[] = {-50, -1, 0, 1, 17, 40, 100, 117, 250};

std::vector<uint8_t> any_frame(Random& random, Size size) {
  switch (random.between(0, 3)) {
    case 0:
      return make_frame(random, random.one_of(kMoods), Colours::kWild, size.width, size.height);
    case 1:
      return make_frame(random, random.one_of(kMoods), Colours::kMuted, size.width, size.height);
    default:
      return make_hazy_frame(random, size.width, size.height);
  }
}

template <int count>
void run_sequence(Random& random, const Size (&sizes)[count], int steps) {
  SessionPair sessions;
  Size opened = random.one_of(sizes);
  sessions.init(random.one_of(kFormats), opened.width, opened.height);
  for (int step = 0; step < steps && !::testing::Test::HasFailure(); ++step) {
    switch (random.between(0, 9)) {
      case 0:  // A new session, of another size perhaps.
        sessions.release();
        if (random.between(0, 3) == 0) {
          const Size refused = random.one_of(sizes);
          sessions.remove_haze(any_frame(random, refused), refused.width, refused.height, 100);
        }
        opened = random.one_of(sizes);
        sessions.init(random.one_of(kFormats), opened.width, opened.height);
        break;
      case 1:  // Another format within the session; the size has no effect.
        sessions.init(random.one_of(kFormats), 1280, 720);
        break;
      case 2: {  // A frame of any size, which the block may hold or not.
        const Size size = random.one_of(sizes);
        sessions.remove_haze(any_frame(random, size), size.width, size.height,
                             random.one_of(kLevels), random.between(-5, 5));
        break;
      }
      default:
        sessions.remove_haze(any_frame(random, opened), opened.width, opened.height,
                             random.one_of(kLevels), random.between(-5, 5));
        break;
    }
  }
}

TEST(FrameSequence, SmallFrames) {
  constexpr Size kSizes[] = {{128, 128}, {130, 130}, {144, 160}, {134, 262}, {198, 128}};
  Random random(test_seed());
  for (int i = 0; i < 8; ++i) run_sequence(random, kSizes, 24);
}

TEST(FrameSequence, LargeFrames) {
  constexpr Size kSizes[] = {{640, 480}, {1280, 720}, {1278, 718},
                             {128, 720}, {1280, 128}, {130, 718}};
  Random random(test_seed() + 1);
  for (int i = 0; i < 2; ++i) run_sequence(random, kSizes, 12);
}

TEST(FrameSequence, TwelveFramesIn1280x720) {
  Random random(test_seed() + 2);
  SessionPair sessions;
  sessions.init(3, 1280, 720);
  for (int i = 0; i < 12; ++i) {
    if (i == 6) sessions.init(0, 1280, 720);
    if (i == 9) {
      sessions.release();
      sessions.init(3, 1280, 720);
    }
    sessions.remove_haze(make_hazy_frame(random, 1280, 720), 1280, 720, random.one_of(kLevels));
  }
}

}  // namespace
}  // namespace haze::test
