// Many small frames with changing sizes, formats, levels and sessions: long_run [FRAMES]
//
// Fails if the digest of what the library made of them is not that of the reference, or if memory
// grows.
#include <malloc.h>
#include <unistd.h>

#include <algorithm>
#include <cinttypes>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <vector>

#include "haze_preview.h"
#include "tests/reference/session.h"
#include "tests/support/effort.h"
#include "tests/support/fnv1a.h"
#include "tests/support/moods.h"
#include "tests/support/session_pair.h"

namespace haze::test {
namespace {

// Of memory, in bytes. An emulator's own memory counts as resident, and grows with the code that it
// translates.
constexpr long kMostGrowth = 1 << 20;
constexpr long kMostResidentGrowth = effort(kMostGrowth, 16 * kMostGrowth);

struct Memory {
  long resident;
  long on_heap;

  static Memory now() {
    long total = 0;
    long pages = 0;
    FILE* const file = std::fopen("/proc/self/statm", "r");
    if (file == nullptr || std::fscanf(file, "%ld %ld", &total, &pages) != 2) std::abort();
    std::fclose(file);
    return {pages * sysconf(_SC_PAGESIZE), static_cast<long>(mallinfo2().uordblks)};
  }
};

// Frames to choose from; making one anew for each turn would take most of the time.
struct Frames {
  int width;
  int height;
  std::vector<std::vector<uint8_t>> frames;
};

std::vector<Frames> make_frames(Random& random) {
  std::vector<Frames> all;
  const int sizes[][2] = {{128, 128}, {130, 130}, {144, 128}, {128, 150}, {160, 132}};
  for (const auto& size : sizes) {
    all.push_back({size[0], size[1], {}});
    for (const Mood mood : kMoods)
      all.back().frames.push_back(make_frame(random, mood, Colours::kMuted, size[0], size[1]));
    for (int i = 0; i < 4; ++i)
      all.back().frames.push_back(make_hazy_frame(random, size[0], size[1]));
  }
  return all;
}

class LongRun {
 public:
  LongRun() : random_(test_seed()), all_(make_frames(random_)) { reset_library_session(); }
  ~LongRun() { reset_library_session(); }

  // Frame `number`; now and then a session ends before it, or the format changes.
  void turn(int number) {
    if (number == 0 || random_.between(0, 9) == 0) open();
    if (random_.between(0, 9) == 0) set_format();
    const std::vector<uint8_t>& frame = sizes_->frames[pick(sizes_->frames.size())];
    const int level = random_.between(-20, 260);
    actual_ = wanted_ = frame;
    RemoveHazePreview(actual_.data(), sizes_->width, sizes_->height, 0, level);
    reference_.remove_haze(wanted_.data(), sizes_->width, sizes_->height, level);
    actual_digest_.add(actual_.data(), actual_.size());
    wanted_digest_.add(wanted_.data(), wanted_.size());
  }

  // With no session open, so that every run of the program is in the same state here.
  void close() {
    ReleaseHazePreview();
    reference_.release();
  }

  uint64_t actual() const { return actual_digest_.value(); }
  uint64_t wanted() const { return wanted_digest_.value(); }

 private:
  size_t pick(size_t count) {
    return static_cast<size_t>(random_.between(0, static_cast<int>(count) - 1));
  }

  void open() {
    close();
    sizes_ = &all_[pick(all_.size())];
    format_ = random_.between(0, 1) == 0 ? 0 : 3;
    InitHazePreviewFormat(static_cast<INPUT_FORMAT>(format_), sizes_->width, sizes_->height);
    reference_.init(format_, sizes_->width, sizes_->height);
  }

  void set_format() {
    format_ = 3 - format_;
    InitHazePreviewFormat(static_cast<INPUT_FORMAT>(format_), 1280, 720);
    reference_.init(format_, 1280, 720);
  }

  Random random_;
  std::vector<Frames> all_;
  const Frames* sizes_ = nullptr;
  int format_ = 3;
  reference::ReferenceSession reference_;
  std::vector<uint8_t> actual_;
  std::vector<uint8_t> wanted_;
  Fnv1a actual_digest_;
  Fnv1a wanted_digest_;
};

int run(int frames) {
  LongRun run;
  const int warm_up = frames / 10;
  Memory before = {};
  for (int number = 0; number < frames; ++number) {
    if (number == warm_up) before = Memory::now();
    run.turn(number);
  }
  run.close();
  const Memory after = Memory::now();
  std::printf("%d frames, digest %016" PRIx64 ", the reference's %016" PRIx64 "\n", frames,
              run.actual(), run.wanted());
  std::printf("resident memory grew by %ld bytes after the first tenth, the heap by %ld\n",
              after.resident - before.resident, after.on_heap - before.on_heap);
  const bool flat = after.resident - before.resident <= kMostResidentGrowth &&
                    after.on_heap - before.on_heap <= kMostGrowth;
  return run.actual() == run.wanted() && flat ? 0 : 1;
}

}  // namespace
}  // namespace haze::test

int main(int argc, char** argv) {
  const int frames = argc > 1 ? std::atoi(argv[1]) : 2000;
  if (frames < 10) return std::fprintf(stderr, "usage: long_run [FRAMES]\n"), 2;
  return haze::test::run(frames);
}
