// Transmission maps, dark channel, float transmission.
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "bench/images.h"
#include "haze_preview.h"

namespace haze::bench {
namespace {

constexpr float kStrength = 3.0f;
constexpr float kLight = 210.0f;

void add_transmission(Size size, std::vector<Case>& cases) {
  const auto mean = shared(hazy_image(size, 1));
  const auto minimum = shared(hazy_image(size, 1));
  const auto codes = shared(Bytes(area(size)));
  const auto run = [=] {
    CalculateTChannelPreviewNeonFloat(mean->data(), minimum->data(), codes->data(), size.width,
                                      size.height, kStrength, 1 / kLight);
  };
  const auto output = [=](const auto& function) {
    return [=] {
      function();
      return *codes;
    };
  };
  const auto bound = shared(cv::Mat());
  const auto t = shared(cv::Mat());
  const auto peer = [=] {
    const cv::Mat means(size.height, size.width, CV_8U, mean->data());
    const cv::Mat minima(size.height, size.width, CV_8U, minimum->data());
    means.convertTo(*bound, CV_8U, kStrength);
    cv::min(*bound, minima, *bound);
    bound->convertTo(*t, CV_8U, -200.0 / kLight, 159.5);
    cv::max(*t, 40, *t);
    cv::min(*t, 158, *t);
  };
  cases.push_back({"transmission map", size, run, output(run), "OpenCV", peer});
}

void add_dark_channel(Size size, int radius, std::vector<Case>& cases) {
  const auto image = shared(hazy_image(size, 1));
  const auto dark = shared(Bytes(area(size)));
  const auto histogram = shared(std::vector<int>(256));
  const auto run = [=] {
    histogram->assign(256, 0);
    CalculateDarkChannelPreview(image->data(), dark->data(), histogram->data(), size.width,
                                size.height, radius);
  };
  const auto output = [=](const auto& function) {
    return [=] {
      function();
      Bytes bytes = *dark;
      for (int count : *histogram)
        for (int shift = 0; shift < 32; shift += 8)
          bytes.push_back(static_cast<uint8_t>(count >> shift));
      return bytes;
    };
  };
  const auto eroded = shared(cv::Mat());
  const auto counts = shared(cv::Mat());
  const cv::Mat window =
      cv::getStructuringElement(cv::MORPH_RECT, {2 * radius + 1, 2 * radius + 1});
  const auto peer = [=] {
    cv::erode(cv::Mat(size.height, size.width, CV_8U, image->data()), *eroded, window);
    const int bins = 256;
    const float bounds[] = {0, 256};
    const float* ranges = bounds;
    const int channel = 0;
    cv::calcHist(eroded.get(), 1, &channel, cv::noArray(), *counts, 1, &bins, &ranges);
  };
  cases.push_back({"dark channel, radius " + std::to_string(radius), size, run, output(run),
                   "OpenCV erode + calcHist", peer});
}

void add_float_transmission(Size size, std::vector<Case>& cases) {
  const auto image = shared(hazy_image(size, 3));
  const auto t = shared(std::vector<float>(area(size)));
  const auto raw = shared(std::vector<float>(area(size)));
  const auto run = [=] {
    unsigned char light[3] = {210, 205, 200};
    EstimateTPreview(image->data(), light, t->data(), raw->data(), size.width, size.height, 5);
  };
  struct Peer {
    cv::Mat floats, channels[3], t, filtered;
  };
  const auto peer = shared(Peer());
  const cv::Mat window = cv::getStructuringElement(cv::MORPH_RECT, {15, 15});
  cases.push_back({"float transmission, 15 x 15 maximum", size, run,
                   [=] {
                     run();
                     Bytes bytes = bytes_of(*t);
                     const Bytes rest = bytes_of(*raw);
                     bytes.insert(bytes.end(), rest.begin(), rest.end());
                     return bytes;
                   },
                   "OpenCV",
                   [=] {
                     const cv::Mat source(size.height, size.width, CV_8UC3, image->data());
                     source.convertTo(peer->floats, CV_32FC3);
                     cv::split(peer->floats, peer->channels);
                     const double light[] = {210, 205, 200};
                     for (int c = 0; c < 3; ++c)
                       peer->channels[c].convertTo(peer->channels[c], CV_32F, -0.5 / light[c], 1);
                     cv::max(peer->channels[0], peer->channels[1], peer->t);
                     cv::max(peer->t, peer->channels[2], peer->t);
                     cv::max(peer->t, 0.4, peer->t);
                     cv::dilate(peer->t, peer->filtered, window);
                   }});
}

}  // namespace

void add_estimate_cases(Size frame, std::vector<Case>& cases) {
  const Size size = half(frame);
  add_transmission(size, cases);
  add_dark_channel(size, 7, cases);
  add_dark_channel(size, 15, cases);
  add_float_transmission(size, cases);
}

}  // namespace haze::bench
