// The command line.
#ifndef TOOLS_OPTIONS_H
#define TOOLS_OPTIONS_H

#include <cstdint>
#include <optional>
#include <string>

namespace dehaze {

// Amount of haze removal when the command line does not say. Measured on the rendered pair in
// samples/, whose clear version is known: from 8 to 11 both PSNR and SSIM against it are near their
// best, below the haze stays, above the ground turns black. README.md has the table.
constexpr int kDefaultLevel = 10;
constexpr int kMaxLevel = 255;

enum class OutputKind { kJpeg, kPng, kWebp, kMp4, kMov, kMkv, kY4m };

inline bool is_picture_kind(OutputKind kind) {
  return kind == OutputKind::kJpeg || kind == OutputKind::kPng || kind == OutputKind::kWebp;
}

struct Options {
  std::string input;   // "-": Y4M on standard input
  std::string output;  // "-": Y4M on standard output
  OutputKind output_kind = OutputKind::kY4m;
  int level = kDefaultLevel;
  int64_t max_frames = 0;  // 0: all
  bool quiet = false;
  bool force = false;
  bool timing = false;
};

// Kind by file extension, whatever its case; "-" is Y4M. Throws UsageError for any other.
OutputKind output_kind_of(const std::string& path);

// Empty if the text asked for (help, version) has been printed and there is nothing to do. Throws
// UsageError.
std::optional<Options> parse_options(int argc, char** argv);

}  // namespace dehaze

#endif  // TOOLS_OPTIONS_H
