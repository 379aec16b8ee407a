// haze_compare: says how close two pictures are, or joins them to one before/after picture.
#include <cstdio>
#include <cstring>
#include <exception>
#include <string>

#include "errors.h"
#include "media/av_error.h"
#include "media/filter_pipe.h"
#include "media/reader.h"
#include "media/writer_picture.h"
#include "output_kind.h"
#include "picture_metrics.h"

namespace dehaze {
namespace {

constexpr char kUsage[] =
    "haze_compare A B                 prints the PSNR (RGB) and SSIM (luma) of B against A\n"
    "haze_compare --all A B           adds CIEDE2000, hue shift and the share of clipped pixels\n"
    "haze_compare --join A B OUT.png  writes a picture: the left half of A, the right half of B";

// Sides of at least this many pixels are needed for the SSIM window.
constexpr int kSmallestSide = 11;

RgbPicture read_picture(const std::string& path) {
  Reader reader(path);
  const FramePtr frame = make_frame();
  if (!reader.read_frame(frame.get())) throw Error(path + ": holds no picture");
  const FramePtr rgb = run_filter(*frame, "format=rgb24");
  RgbPicture picture;
  picture.width = rgb->width;
  picture.height = rgb->height;
  for (int y = 0; y < rgb->height; ++y) {
    const uint8_t* row = rgb->data[0] + static_cast<ptrdiff_t>(y) * rgb->linesize[0];
    picture.bytes.insert(picture.bytes.end(), row, row + static_cast<ptrdiff_t>(rgb->width) * 3);
  }
  return picture;
}

void check_same_size(const RgbPicture& a, const RgbPicture& b) {
  if (a.width == b.width && a.height == b.height) return;
  throw Error("the pictures differ in size: " + std::to_string(a.width) + " x " +
              std::to_string(a.height) + " and " + std::to_string(b.width) + " x " +
              std::to_string(b.height));
}

void compare(const std::string& path_a, const std::string& path_b, bool all) {
  const RgbPicture a = read_picture(path_a);
  const RgbPicture b = read_picture(path_b);
  check_same_size(a, b);
  if (a.width < kSmallestSide || a.height < kSmallestSide) {
    throw Error("the pictures are too small to compare");
  }
  std::printf("psnr %.2f dB ssim %.4f", psnr_rgb(a, b), ssim_luma(a, b));
  if (all) {
    std::printf(" ciede2000 %.3f hue %.3f degrees clipped %.3f %%", mean_ciede2000(a, b),
                mean_hue_shift(a, b), 100 * clipped_share(b));
  }
  std::printf("\n");
}

// One view, split in the middle by a thin white line: the eye meets the difference where it looks.
void join(const std::string& path_a, const std::string& path_b, const std::string& output) {
  const RgbPicture a = read_picture(path_a);
  const RgbPicture b = read_picture(path_b);
  check_same_size(a, b);
  FramePtr frame = make_frame();
  frame->format = AV_PIX_FMT_RGB24;
  frame->width = a.width;
  frame->height = a.height;
  frame->color_range = AVCOL_RANGE_JPEG;
  frame->colorspace = AVCOL_SPC_RGB;
  check(av_frame_get_buffer(frame.get(), 0), "cannot allocate a frame");
  const size_t row_bytes = static_cast<size_t>(a.width) * 3;
  const int line = a.width / 320 + 1;
  const size_t line_begin = static_cast<size_t>((a.width - line) / 2) * 3;
  const size_t line_bytes = static_cast<size_t>(line) * 3;
  for (int y = 0; y < a.height; ++y) {
    const size_t offset = static_cast<size_t>(y) * row_bytes;
    uint8_t* row = frame->data[0] + static_cast<ptrdiff_t>(y) * frame->linesize[0];
    std::memcpy(row, &a.bytes[offset], line_begin);
    std::memset(row + line_begin, 255, line_bytes);
    const size_t rest = line_begin + line_bytes;
    std::memcpy(row + rest, &b.bytes[offset + rest], row_bytes - rest);
  }
  write_picture(*frame, OutputKind::kPng, output);
}

int guarded_main(int argc, char** argv) {
  try {
    capture_av_log();
    const std::string first = argc > 1 ? argv[1] : "";
    if (argc == 5 && first == "--join") {
      join(argv[2], argv[3], argv[4]);
    } else if (argc == 3 && first.rfind("--", 0) != 0) {
      compare(argv[1], argv[2], false);
    } else if (argc == 4 && first == "--all") {
      compare(argv[2], argv[3], true);
    } else if (first == "--help") {
      std::puts(kUsage);
    } else {
      std::fprintf(stderr, "%s\n", kUsage);
      return kExitUsage;
    }
    return kExitDone;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "haze_compare: %s\n", error.what());
  }
  return kExitFailed;
}

}  // namespace
}  // namespace dehaze

int main(int argc, char** argv) { return dehaze::guarded_main(argc, argv); }
