// Whole frames.
#include <cstring>

#include "bench/images.h"
#include "bench/opencv_pipelines.h"
#include "haze_preview.h"

namespace haze::bench {
namespace {

constexpr int kLevel = 50;

// Runs one frame of the given parity, in place over and over: the time does not depend on content.
void run_frame(Bytes& frame, Size size, int parity) {
  gPreFrameNum = parity;
  RemoveHazePreview(frame.data(), size.width, size.height, 0, kLevel);
}

}  // namespace

void add_frame_cases(Size size, std::vector<Case>& cases) {
  const auto frame = shared(hazy_frame(size));
  const auto original = shared(*frame);
  const auto peer_frame = shared(*frame);
  const auto peer = std::make_shared<FastPipeline>(size);
  peer->estimate(*peer_frame);
  InitHazePreviewFormat(kInputFormatNv21, 1280, 720);
  const auto output = [=](int parity) {
    *frame = *original;
    run_frame(*frame, size, parity);
    return *frame;
  };
  cases.push_back({"estimate frame", size, [=] { run_frame(*frame, size, 0); },
                   [=] { return output(0); }, "fast OpenCV pipeline",
                   [=] {
                     peer->estimate(*peer_frame);
                     peer->recover(*peer_frame);
                   }});
  cases.push_back({"estimate frame, classic peer", size, [=] { run_frame(*frame, size, 0); },
                   [=] { return output(0); }, "classic OpenCV pipeline",
                   [=] {
                     Bytes copy = *original;
                     classic_pipeline(copy, size);
                   }});
  cases.push_back({"reuse frame", size, [=] { run_frame(*frame, size, 1); },
                   [=] { return output(1); }, "fast OpenCV pipeline, recovery only",
                   [=] { peer->recover(*peer_frame); }});
}

}  // namespace haze::bench
