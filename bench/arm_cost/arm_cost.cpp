// Runs one function of the library for counting its instructions:
//
//   arm_cost                   prints the names of all functions with their output pixels
//   arm_cost FUNCTION CALLS    calls one of them so often
//
// Threaded stages are run by their workers, one after the other. The inputs are fixed.
#include <haze_preview.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

constexpr int kWidth = 640;
constexpr int kHeight = 480;
constexpr int kPixels = kWidth * kHeight;
constexpr int kHalfPixels = kPixels / 4;

unsigned char frame[kPixels * 3];
unsigned char image[kPixels * 3];
unsigned char map_a[kPixels], map_b[kPixels], map_c[kPixels * 3];
unsigned char codes[kPixels];
float plane_a[kPixels], plane_b[kPixels], out_a[kPixels], out_b[kPixels], out_c[kPixels],
    out_d[kPixels];
unsigned char light[3] = {200, 203, 208};
int histogram[256], sums32[kWidth];
short sums16[kWidth];

void fill() {
  uint32_t state = 1;
  for (int i = 0; i < kPixels * 3; ++i) {
    state = state * 1664525u + 1013904223u;
    image[i] = static_cast<unsigned char>(100 + (i / kWidth) % 100 + static_cast<int>(state >> 29));
    frame[i] = image[i];
  }
  for (int i = 0; i < kPixels; ++i) {
    map_a[i] = image[i];
    map_b[i] = image[kPixels + i];
    codes[i] = static_cast<unsigned char>(40 + image[i] % 119);
    plane_a[i] = static_cast<float>(codes[i] + 40) / 200.0f;
    plane_b[i] = static_cast<float>(image[i]) / 255.0f;
  }
}

void run_workers(void* (*worker)(void*), int stripes) {
  for (int k = 0; k < stripes; ++k) worker(&k);
}

struct Function {
  const char* name;
  int pixels;  // of output
  void (*run)();
};

const Function kFunctions[] = {
    {"RemoveHazePreview_estimate", kPixels,
     [] {
       gPreFrameNum = 0;
       RemoveHazePreview(frame, kWidth, kHeight, 0, 10);
     }},
    {"RemoveHazePreview_reuse", kPixels,
     [] {
       gPreFrameNum = 1;
       RemoveHazePreview(frame, kWidth, kHeight, 0, 10);
     }},
    {"xYCrCb2BGRMaxMinPreviewNeon_NV21", kHalfPixels,
     [] {
       xYCrCb2BGRMaxMinPreviewNeon_NV21(image, image + kPixels, map_a, map_b, kWidth, kHeight);
     }},
    {"AverageFilterShort64_u8", kHalfPixels,
     [] { AverageFilterShort64_u8(map_a, map_b, kWidth / 2, kHeight / 2, 30, sums16); }},
    {"AverageFilter_u8_r30", kHalfPixels,
     [] { AverageFilter_u8(map_a, map_b, kWidth / 2, kHeight / 2, 30, sums32); }},
    {"CalculateTChannelPreviewNeonFloat", kHalfPixels,
     [] {
       CalculateTChannelPreviewNeonFloat(map_a, map_b, map_c, kWidth / 2, kHeight / 2, 0.6f,
                                         0.005f);
     }},
    {"CalTThreadPreview", kHalfPixels,
     [] {
       gCalTSrcPreview[0] = map_a;
       gCalTSrc1Preview[0] = map_b;
       gCalTDstPreview[0] = map_c;
       gAlpha[0] = 150;
       gAA[0] = 200;
       gCalTWPreview = kWidth / 2;
       gCalTHPreview = kHeight / 2;
       run_workers(CalTThreadPreview, 8);
     }},
    {"HazeRemoving3Preview_NV21", kPixels,
     [] { HazeRemoving3Preview_NV21(frame, codes, light, kWidth, kHeight, 0); }},
    {"HazeRemoving3Preview", kPixels,
     [] { HazeRemoving3Preview(frame, codes, light, kWidth, kHeight, 0); }},
    {"HazeRemoving3Preview_NV21_f", kPixels,
     [] { HazeRemoving3Preview_NV21_f(frame, plane_a, light, kWidth, kHeight, 0); }},
    {"HazeRemovingPreview", kPixels,
     [] { HazeRemovingPreview(frame, plane_a, light, kWidth, kHeight, 0); }},
    {"HazeRemoving1Preview", kPixels,
     [] { HazeRemoving1Preview(frame, plane_a, light, kWidth, kHeight, 0); }},
    {"HazeRemoving2Preview", kPixels,
     [] { HazeRemoving2Preview(frame, plane_a, light, kWidth, kHeight, 0); }},
    {"HazeRemovingPreview_packed", kPixels,
     [] { HazeRemovingPreview(image, plane_a, light, map_c, kWidth, kHeight); }},
    {"ImproveBrightnessPreview", kPixels, [] { ImproveBrightnessPreview(frame, kWidth, kHeight); }},
    {"BGR2YCrCbPreview", kPixels, [] { BGR2YCrCbPreview(image, map_c, kWidth, kHeight); }},
    {"YCrCb2BGRPreview", kPixels, [] { YCrCb2BGRPreview(image, map_c, kWidth, kHeight); }},
    {"xBGR2YCrCbPreview", kPixels, [] { xBGR2YCrCbPreview(image, map_c, kWidth, kHeight); }},
    {"xYCrCb2BGRPreview_NV21", kHalfPixels,
     [] { xYCrCb2BGRPreview_NV21(image, image + kPixels, map_c, kWidth, kHeight); }},
    {"CalculateMaxMinChannel", kPixels,
     [] { CalculateMaxMinChannel(image, map_a, map_b, kWidth, kHeight); }},
    {"CalMCThreadPreview", kPixels,
     [] {
       gCalMCSrcPreview[0] = image;
       gCalMCDstPreview[0] = map_a;
       gCalMCWPreview = kWidth;
       gCalMCHPreview = kHeight;
       run_workers(CalMCThreadPreview, 4);
     }},
    {"AverageFilter_fPreview_r20", kHalfPixels,
     [] { AverageFilter_fPreview(plane_a, out_a, kWidth / 2, kHeight / 2, 20); }},
    {"AverageFilter_f_2Preview_r20", kHalfPixels,
     [] { AverageFilter_f_2Preview(plane_a, out_a, kWidth / 2, kHeight / 2, 20); }},
    {"AverageFilter_f_Out4Preview_r20", kHalfPixels,
     [] {
       AverageFilter_f_Out4Preview(plane_a, plane_b, out_a, out_b, out_c, out_d, kWidth / 2,
                                   kHeight / 2, 20);
     }},
    {"GuidedFilterPreview_r20", kHalfPixels,
     [] { GuidedFilterPreview(plane_a, plane_b, map_c, kWidth / 2, kHeight / 2, 20); }},
    {"CalculateDarkChannelPreview_r7", kHalfPixels,
     [] { CalculateDarkChannelPreview(map_a, map_b, histogram, kWidth / 2, kHeight / 2, 7); }},
    {"EstimateTPreview", kHalfPixels,
     [] { EstimateTPreview(image, light, out_a, out_b, kWidth / 2, kHeight / 2, 5); }},
    {"ZoomIn_Linear_fPreview", kPixels,
     [] { ZoomIn_Linear_fPreview(plane_a, out_a, kWidth / 2, kHeight / 2); }},
};

}  // namespace

int main(int argc, char** argv) {
  fill();
  InitHazePreviewFormat(kInputFormatNv21, kWidth, kHeight);
  for (const Function& function : kFunctions) {
    if (argc < 3) {
      std::printf("%s %d\n", function.name, function.pixels);
    } else if (std::strcmp(argv[1], function.name) == 0) {
      for (int i = std::atoi(argv[2]); i > 0; --i) function.run();
      return EXIT_SUCCESS;
    }
  }
  return argc < 3 ? EXIT_SUCCESS : EXIT_FAILURE;
}
