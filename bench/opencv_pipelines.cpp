#include "bench/opencv_pipelines.h"

#include <opencv2/imgproc.hpp>
#include <opencv2/ximgproc.hpp>

#include "haze_preview.h"

namespace haze::bench {

FastPipeline::FastPipeline(Size frame) : size_(frame) {
  tone_ = cv::Mat(1, 256, CV_8U, const_cast<unsigned char*>(LutTablePreview)).clone();
}

void FastPipeline::estimate(const Bytes& nv21) {
  auto* const data = const_cast<uint8_t*>(nv21.data());
  const cv::Mat luma(size_.height, size_.width, CV_8U, data);
  const cv::Mat vu(size_.height / 2, size_.width / 2, CV_8UC2, data + luma.total());
  cv::resize(luma, y_, vu.size(), 0, 0, cv::INTER_NEAREST);
  cv::extractChannel(vu, cr_, 0);
  cv::extractChannel(vu, cb_, 1);
  const cv::Mat planes[] = {y_, cr_, cb_};
  cv::merge(planes, 3, ycrcb_);
  cv::cvtColor(ycrcb_, bgr_, cv::COLOR_YCrCb2BGR);
  cv::split(bgr_, channels_);
  cv::min(channels_[0], channels_[1], min_);
  cv::min(min_, channels_[2], min_);
  cv::max(channels_[0], channels_[1], max_);
  cv::max(max_, channels_[2], max_);
  cv::blur(min_, mean_, {64, 64});
  double most_of_max = 0;
  double most_of_mean = 0;
  cv::minMaxLoc(max_, nullptr, &most_of_max);
  cv::minMaxLoc(mean_, nullptr, &most_of_mean);
  light_ = (most_of_max + most_of_mean) / 2;
  mean_.convertTo(bound_, CV_8U, 3.0);
  cv::min(bound_, min_, bound_);
  bound_.convertTo(t_, CV_32F, -1.0 / light_, 1.0);
  cv::max(t_, 0.4, t_);
  cv::min(t_, 0.99, t_);
  cv::divide(1.0, t_, factor_half_);
}

void FastPipeline::recover(Bytes& nv21) {
  cv::Mat luma(size_.height, size_.width, CV_8U, nv21.data());
  cv::Mat vu(size_.height / 2, size_.width / 2, CV_8UC2, nv21.data() + luma.total());
  cv::resize(factor_half_, factor_full_, luma.size(), 0, 0, cv::INTER_NEAREST);
  luma.convertTo(floats_, CV_32F, 1.0, -light_);
  cv::multiply(floats_, factor_full_, floats_);
  floats_.convertTo(luma, CV_8U, 1.0, light_);
  cv::LUT(luma, tone_, luma);
  vu.convertTo(floats_, CV_32FC2, 1.0, -128.0);
  const cv::Mat twice[] = {factor_half_, factor_half_};
  cv::Mat factors;
  cv::merge(twice, 2, factors);
  cv::multiply(floats_, factors, floats_);
  floats_.convertTo(vu, CV_8UC2, 1.0, 128.0);
}

void classic_pipeline(Bytes& nv21, Size frame) {
  const cv::Mat source(frame.height * 3 / 2, frame.width, CV_8U, nv21.data());
  cv::Mat bgr, floats, darkest, dark, guide, t;
  cv::cvtColor(source, bgr, cv::COLOR_YUV2BGR_NV21);
  bgr.convertTo(floats, CV_32FC3, 1.0 / 255);
  cv::Mat channels[3];
  cv::split(floats, channels);
  cv::min(channels[0], channels[1], darkest);
  cv::min(darkest, channels[2], darkest);
  const cv::Mat window = cv::getStructuringElement(cv::MORPH_RECT, {15, 15});
  cv::erode(darkest, dark, window);
  double brightest = 0;
  cv::Point where;
  cv::minMaxLoc(dark, nullptr, &brightest, nullptr, &where);
  const cv::Vec3f light = floats.at<cv::Vec3f>(where);
  for (int c = 0; c < 3; ++c) channels[c] /= light[c];
  cv::min(channels[0], channels[1], darkest);
  cv::min(darkest, channels[2], darkest);
  cv::erode(darkest, dark, window);
  t = 1.0 - 0.95 * dark;
  cv::cvtColor(floats, guide, cv::COLOR_BGR2GRAY);
  cv::ximgproc::guidedFilter(guide, t, t, 40, 1e-3);
  cv::max(t, 0.1, t);
  cv::split(floats, channels);
  for (int c = 0; c < 3; ++c) channels[c] = (channels[c] - light[c]) / t + light[c];
  cv::merge(channels, 3, floats);
  floats.convertTo(bgr, CV_8UC3, 255);
  cv::Mat i420;
  cv::cvtColor(bgr, i420, cv::COLOR_BGR2YUV_I420);
  std::copy(i420.begin<uint8_t>(), i420.end<uint8_t>(), nv21.begin());
}

}  // namespace haze::bench
