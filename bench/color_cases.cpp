// Channel extraction, colour conversions, channel maps.
#include <libyuv.h>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "bench/images.h"
#include "haze_preview.h"

namespace haze::bench {
namespace {

// Half-resolution BGRA of an NV21 frame by libyuv: one luma sample for each chroma pair, so the
// conversion runs on 4:4:4 planes.
class LibyuvHalf {
 public:
  explicit LibyuvHalf(Size frame)
      : frame_(frame),
        size_(half(frame)),
        y_(area(size_)),
        u_(y_),
        v_(y_),
        bgra_(4 * area(size_)) {}

  const cv::Mat convert(const Bytes& nv21) {
    libyuv::ScalePlane(nv21.data(), frame_.width, frame_.width, frame_.height, y_.data(),
                       size_.width, size_.width, size_.height, libyuv::kFilterNone);
    libyuv::SplitUVPlane(nv21.data() + area(frame_), frame_.width, v_.data(), size_.width,
                         u_.data(), size_.width, size_.width, size_.height);
    libyuv::I444ToARGB(y_.data(), size_.width, u_.data(), size_.width, v_.data(), size_.width,
                       bgra_.data(), 4 * size_.width, size_.width, size_.height);
    return cv::Mat(size_.height, size_.width, CV_8UC4, bgra_.data());
  }

  void convert_to_bgr(const Bytes& nv21, Bytes& bgr) {
    convert(nv21);
    libyuv::ARGBToRGB24(bgra_.data(), 4 * size_.width, bgr.data(), 3 * size_.width, size_.width,
                        size_.height);
  }

 private:
  Size frame_;
  Size size_;
  Bytes y_, u_, v_, bgra_;
};

// Minimum and maximum over the channels by OpenCV.
struct OpencvMaps {
  std::vector<cv::Mat> channels;
  cv::Mat least, most;

  void compute(const cv::Mat& picture) {
    cv::split(picture, channels);
    cv::min(channels[0], channels[1], least);
    cv::min(least, channels[2], least);
    cv::max(channels[0], channels[1], most);
    cv::max(most, channels[2], most);
  }
};

// Runs, and gives both maps one after the other.
std::function<Bytes()> output_of(std::function<void()> run, std::shared_ptr<Bytes> first,
                                 std::shared_ptr<Bytes> second) {
  return [=] {
    run();
    Bytes both = *first;
    both.insert(both.end(), second->begin(), second->end());
    return both;
  };
}

void add_extraction(Size size, std::vector<Case>& cases) {
  const Size small = half(size);
  const auto frame = shared(hazy_frame(size));
  const auto least = shared(Bytes(area(small)));
  const auto most = shared(Bytes(area(small)));
  const auto bgr = shared(Bytes(3 * area(small)));
  const auto libyuv_half = shared(LibyuvHalf(size));
  const auto maps = shared(OpencvMaps());
  const auto run = [=] {
    xYCrCb2BGRMaxMinPreviewNeon_NV21(frame->data(), frame->data() + area(size), least->data(),
                                     most->data(), size.width, size.height);
  };
  cases.push_back({"half-resolution min/max channels", size, run, output_of(run, least, most),
                   "libyuv + OpenCV", [=] { maps->compute(libyuv_half->convert(*frame)); }});
  const auto run_bgr = [=] {
    xYCrCb2BGRPreviewNeon_NV21(frame->data(), frame->data() + area(size), bgr->data(), size.width,
                               size.height);
  };
  cases.push_back({"half-resolution BGR from NV21", size, run_bgr,
                   [=] {
                     run_bgr();
                     return *bgr;
                   },
                   "libyuv", [=] { libyuv_half->convert_to_bgr(*frame, *bgr); }});
}

void add_conversion(const char* name, Size size,
                    void (*convert)(unsigned char*, unsigned char*, int, int), int opencv_code,
                    std::vector<Case>& cases) {
  const auto source = shared(hazy_image(size, 3));
  const auto target = shared(Bytes(3 * area(size)));
  const auto peer_target = shared(cv::Mat());
  const auto run = [=] { convert(source->data(), target->data(), size.width, size.height); };
  cases.push_back({name, size, run,
                   [=] {
                     run();
                     return *target;
                   },
                   "OpenCV",
                   [=] {
                     cv::cvtColor(cv::Mat(size.height, size.width, CV_8UC3, source->data()),
                                  *peer_target, opencv_code);
                   }});
}

void add_maps(Size size, std::vector<Case>& cases) {
  const auto image = shared(hazy_image(size, 3));
  const auto least = shared(Bytes(area(size)));
  const auto most = shared(Bytes(area(size)));
  const auto maps = shared(OpencvMaps());
  const auto peer = [=] {
    maps->compute(cv::Mat(size.height, size.width, CV_8UC3, image->data()));
  };
  const auto run = [=] {
    CalculateMaxMinChannel(image->data(), least->data(), most->data(), size.width, size.height);
  };
  cases.push_back(
      {"min and max maps of BGR", size, run, output_of(run, least, most), "OpenCV", peer});
}

}  // namespace

void add_color_cases(Size size, std::vector<Case>& cases) {
  add_extraction(size, cases);
  add_conversion("BGR to YCrCb", size, BGR2YCrCbPreview, cv::COLOR_BGR2YCrCb, cases);
  add_conversion("YCrCb to BGR", size, YCrCb2BGRPreview, cv::COLOR_YCrCb2BGR, cases);
  add_maps(size, cases);
}

}  // namespace haze::bench
