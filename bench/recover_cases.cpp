// Recoveries and zoom.
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "bench/images.h"
#include "bench/opencv_pipelines.h"
#include "haze_preview.h"

namespace haze::bench {
namespace {

unsigned char light[3] = {210, 205, 200};

// A recovery in place; it runs on its own output over and over, which does not change its time.
void add_in_place(const std::string& name, Size size, std::function<void(unsigned char*)> recover,
                  std::function<void()> peer, std::vector<Case>& cases) {
  const auto frame = shared(hazy_frame(size));
  const auto original = shared(*frame);
  cases.push_back({name, size, [=] { recover(frame->data()); },
                   [=] {
                     *frame = *original;
                     recover(frame->data());
                     return *frame;
                   },
                   peer ? "fast OpenCV recovery" : "", peer});
}

void add_packed(Size size, std::shared_ptr<std::vector<float>> t, std::vector<Case>& cases) {
  const auto source = shared(hazy_image(size, 2));
  const auto target = shared(Bytes(2 * area(size)));
  const auto run = [=] {
    HazeRemovingPreview(source->data(), t->data(), light, target->data(), size.width, size.height);
  };
  cases.push_back({"packed recovery",
                   size,
                   run,
                   [=] {
                     run();
                     return *target;
                   },
                   "",
                   {}});
  const auto image = shared(*source);
  cases.push_back({"brightness lift",
                   size,
                   [=] { ImproveBrightnessPreview(image->data(), size.width, size.height); },
                   [=] {
                     *image = *source;
                     ImproveBrightnessPreview(image->data(), size.width, size.height);
                     return *image;
                   },
                   "",
                   {}});
}

void add_zoom(Size size, std::vector<Case>& cases) {
  const auto plane = shared(transmission_plane(size));
  const auto enlarged = shared(std::vector<float>(4 * area(size)));
  const auto resized = shared(cv::Mat());
  const auto run = [=] {
    ZoomIn_Linear_fPreview(plane->data(), enlarged->data(), size.width, size.height);
  };
  cases.push_back({"float zoom 2 x", size, run,
                   [=] {
                     run();
                     return bytes_of(*enlarged);
                   },
                   "OpenCV resize",
                   [=] {
                     cv::resize(cv::Mat(size.height, size.width, CV_32F, plane->data()), *resized,
                                {}, 2, 2, cv::INTER_LINEAR);
                   }});
}

}  // namespace

void add_recover_cases(Size size, std::vector<Case>& cases) {
  const auto codes = shared(code_map(half(size)));
  const auto t = shared(transmission_plane(half(size)));
  const auto pipeline = std::make_shared<FastPipeline>(size);
  const auto peer_frame = shared(hazy_frame(size));
  pipeline->estimate(*peer_frame);
  const std::function<void()> peer = [=] { pipeline->recover(*peer_frame); };
  const int width = size.width;
  const int height = size.height;
  const auto codes_of = [=] { return codes->data(); };

  add_in_place(
      "frame recovery, NV21", size,
      [=](unsigned char* frame) {
        HazeRemoving3Preview_NV21(frame, codes_of(), light, width, height, 0);
      },
      peer, cases);
  add_in_place(
      "frame recovery, planar", size,
      [=](unsigned char* frame) {
        HazeRemoving3Preview(frame, codes_of(), light, width, height, 0);
      },
      peer, cases);
  add_in_place(
      "slot-table recovery, 8 threads", size,
      [=](unsigned char* frame) {
        HazeRemoving3Preview2_NV21(frame, codes_of(), light, width, height, 0);
      },
      peer, cases);
  add_in_place(
      "float-map recovery", size,
      [=](unsigned char* frame) {
        HazeRemoving3Preview_NV21_f(frame, t->data(), light, width, height, 0);
      },
      peer, cases);
  add_in_place(
      "reciprocal recovery, averaged", size,
      [=](unsigned char* frame) { HazeRemovingPreview(frame, t->data(), light, width, height, 0); },
      peer, cases);
  add_in_place(
      "reciprocal recovery, every pixel", size,
      [=](unsigned char* frame) {
        HazeRemoving1Preview(frame, t->data(), light, width, height, 0);
      },
      peer, cases);
  add_in_place(
      "reciprocal recovery, float", size,
      [=](unsigned char* frame) {
        HazeRemoving2Preview(frame, t->data(), light, width, height, 0);
      },
      peer, cases);
  add_packed(size, t, cases);
  add_zoom(half(size), cases);
}

}  // namespace haze::bench
