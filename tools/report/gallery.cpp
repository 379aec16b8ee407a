#include "report/gallery.h"

#include <algorithm>

namespace dehaze {
namespace {

constexpr size_t kMostViews = 6;

}  // namespace

Gallery::Gallery(int64_t expected_frames) {
  while (step_ * static_cast<int64_t>(kMostViews) < expected_frames) step_ *= 2;
}

// With one too many, every other one goes and the distance between the frames doubles, so that they
// are always spread evenly from the first one on.
void Gallery::add(View view) {
  views_.push_back(std::move(view));
  if (views_.size() <= kMostViews) return;
  step_ *= 2;
  const auto off_step = [this](const View& kept) { return !wants(kept.frame); };
  views_.erase(std::remove_if(views_.begin(), views_.end(), off_step), views_.end());
}

}  // namespace dehaze
