// Box filters and the guided filter.
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>
#include <opencv2/ximgproc.hpp>

#include "bench/images.h"
#include "haze_preview.h"

namespace haze::bench {
namespace {

// OpenCV's blur of a plane by a square window, into a buffer of its own.
template <typename T>
std::function<void()> blur_peer(std::shared_ptr<std::vector<T>> plane, Size size, int window) {
  const auto blurred = shared(cv::Mat());
  const int type = sizeof(T) == 1 ? CV_8U : CV_32F;
  return [=] {
    cv::blur(cv::Mat(size.height, size.width, type, plane->data()), *blurred, {window, window});
  };
}

void add_integer(Size size, std::vector<Case>& cases) {
  const auto image = shared(hazy_image(size, 1));
  const auto mean = shared(Bytes(area(size)));
  const auto sums16 = shared(std::vector<short>(area(size)));
  const auto sums32 = shared(std::vector<int>(area(size)));
  const auto output = [=](const auto& run) {
    return [=] {
      run();
      return *mean;
    };
  };
  const auto run_64 = [=] {
    AverageFilterShort64_u8(image->data(), mean->data(), size.width, size.height, 30,
                            sums16->data());
  };
  cases.push_back(
      {"64 x 64 mean", size, run_64, output(run_64), "OpenCV blur", blur_peer(image, size, 64)});
  const auto run_30 = [=] {
    AverageFilter_u8(image->data(), mean->data(), size.width, size.height, 30, sums32->data());
  };
  cases.push_back(
      {"mean, radius 30", size, run_30, output(run_30), "OpenCV blur", blur_peer(image, size, 61)});
}

void add_float(Size size, int radius, std::vector<Case>& cases) {
  const auto a = shared(float_plane(size));
  const auto b = shared(transmission_plane(size));
  using Plane = std::vector<float>;
  const auto outputs = shared(std::vector<Plane>(4, Plane(area(size))));
  const auto dst = [=](size_t i) { return (*outputs)[i].data(); };
  const auto output = [=](const auto& run, size_t count) {
    return [=] {
      run();
      Bytes bytes;
      for (size_t i = 0; i < count; ++i) {
        const Bytes plane = bytes_of((*outputs)[i]);
        bytes.insert(bytes.end(), plane.begin(), plane.end());
      }
      return bytes;
    };
  };
  const std::string suffix = ", radius " + std::to_string(radius);
  const auto peer = blur_peer(a, size, 2 * radius + 1);
  const auto one = [=] {
    AverageFilter_fPreview(a->data(), dst(0), size.width, size.height, radius);
  };
  cases.push_back({"float mean" + suffix, size, one, output(one, 1), "OpenCV blur", peer});
  const auto square = [=] {
    AverageFilter_f_2Preview(a->data(), dst(0), size.width, size.height, radius);
  };
  const auto squared = shared(cv::Mat());
  cases.push_back({"float mean of squares" + suffix, size, square, output(square, 1),
                   "OpenCV sqrBoxFilter", [=] {
                     cv::sqrBoxFilter(cv::Mat(size.height, size.width, CV_32F, a->data()), *squared,
                                      CV_32F, {2 * radius + 1, 2 * radius + 1});
                   }});
  const auto four = [=] {
    AverageFilter_f_Out4Preview(a->data(), b->data(), dst(0), dst(1), dst(2), dst(3), size.width,
                                size.height, radius);
  };
  const auto peer_b = blur_peer(b, size, 2 * radius + 1);
  const auto products = shared(cv::Mat());
  const auto blurred = shared(cv::Mat());
  cases.push_back({"four float means" + suffix, size, four, output(four, 4), "OpenCV blur", [=] {
                     peer();
                     peer_b();
                     const cv::Mat first(size.height, size.width, CV_32F, a->data());
                     const cv::Mat second(size.height, size.width, CV_32F, b->data());
                     const cv::Size window(2 * radius + 1, 2 * radius + 1);
                     cv::multiply(first, second, *products);
                     cv::blur(*products, *blurred, window);
                     cv::multiply(second, second, *products);
                     cv::blur(*products, *blurred, window);
                   }});
}

void add_guided(Size size, std::vector<Case>& cases) {
  const auto plane = shared(transmission_plane(size));
  const auto guide = shared(float_plane(size));
  const auto codes = shared(Bytes(area(size)));
  const auto run = [=] {
    GuidedFilterPreview(plane->data(), guide->data(), codes->data(), size.width, size.height, 20);
  };
  const auto refined = shared(cv::Mat());
  cases.push_back({"guided filter, radius 20", size, run,
                   [=] {
                     run();
                     return *codes;
                   },
                   "OpenCV ximgproc",
                   [=] {
                     cv::ximgproc::guidedFilter(
                         cv::Mat(size.height, size.width, CV_32F, guide->data()),
                         cv::Mat(size.height, size.width, CV_32F, plane->data()), *refined, 20,
                         1e-4);
                   }});
}

}  // namespace

void add_filter_cases(Size frame, std::vector<Case>& cases) {
  const Size size = half(frame);
  add_integer(size, cases);
  add_float(size, 8, cases);
  add_float(size, 20, cases);
  add_guided(size, cases);
}

}  // namespace haze::bench
