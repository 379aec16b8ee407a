// The part of the command line that says how the haze is removed and what of it is shown.
#pragma once

#include <optional>
#include <string>

namespace CLI {
class App;
}

namespace dehaze {

enum class EngineKind { kByInput, kPreview, kPhoto };

enum class Show {
  kResult,
  kMap,      // the transmission as a grey picture
  kCompare,  // left half of the input, right half of the result
  kLight,    // the atmospheric light as text
};

constexpr int kMaxLevel = 255;
constexpr int kMaxStrength = 100;

struct EngineOptions {
  EngineKind engine = EngineKind::kByInput;
  std::optional<int> strength;  // 0 ... kMaxStrength; none: judged from the input
  std::optional<int> level;     // of the library's frame path; in place of a strength
  Show show = Show::kResult;
};

// Adds --engine, --strength, --level and --show.
void add_engine_options(CLI::App& app, EngineOptions& options);

// Throws UsageError for options that contradict each other. To be called after parsing.
void check_engine_options(const EngineOptions& options);

// The engine asked for; else preview for a level, photo for pictures, and for videos preview if its
// frames need no scaling.
EngineKind choose_engine(const EngineOptions& options, int width, int height, bool is_picture);

}  // namespace dehaze
