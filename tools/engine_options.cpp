#include "engine_options.h"

#include <CLI/CLI.hpp>
#include <map>

#include "errors.h"
#include "media/frame_size.h"

namespace dehaze {
namespace {

const std::map<std::string, EngineKind> kEngineNames = {{"preview", EngineKind::kPreview},
                                                        {"photo", EngineKind::kPhoto}};
const std::map<std::string, Show> kShowNames = {
    {"map", Show::kMap}, {"compare", Show::kCompare}, {"light", Show::kLight}};

template <typename Value>
std::function<void(const std::string&)> choice(const char* option,
                                               const std::map<std::string, Value>& names,
                                               Value& value) {
  return [=, &names, &value](const std::string& text) {
    const auto found = names.find(text);
    if (found == names.end()) {
      std::string all;
      for (const auto& entry : names) all += (all.empty() ? "" : ", ") + entry.first;
      throw CLI::ValidationError(option, "\"" + text + "\" is not one of " + all);
    }
    value = found->second;
  };
}

void read_strength(const std::string& text, std::optional<int>& strength) {
  strength.reset();
  if (text == "auto") return;
  const bool is_number = !text.empty() && text.size() <= 3 &&
                         text.find_first_not_of("0123456789") == std::string::npos;
  const int value = is_number ? std::stoi(text) : -1;
  if (value < 0 || value > kMaxStrength) {
    throw CLI::ValidationError("--strength", "\"" + text + "\" is neither auto nor in range [0 - " +
                                                 std::to_string(kMaxStrength) + "]");
  }
  strength = value;
}

bool fits_preview(int width, int height) {
  return width >= kMinFrameSide && height >= kMinFrameSide && width <= kMaxFrameWidth &&
         height <= kMaxFrameHeight;
}

}  // namespace

void add_engine_options(CLI::App& app, EngineOptions& options) {
  CLI::Option* strength =
      app.add_option_function<std::string>(
             "--strength",
             [&options](const std::string& text) { read_strength(text, options.strength); },
             "how much of the haze to take out, 0 to 100, or auto: judged from the picture or the "
             "first second of the video")
          ->type_name("S=auto");
  app.add_option_function<std::string>(
         "--engine", choice("--engine", kEngineNames, options.engine),
         "photo: full resolution; preview: the fast path of camera pipelines, up to 1280 x 720. "
         "Without it, photo for pictures and for videos that do not fit, preview for other videos")
      ->type_name("NAME");
  // The ranges are in the help texts; without a description CLI11 does not print them again.
  app.add_option("--level", options.level,
                 "in place of a strength, the preview engine's own number, 0 to " +
                     std::to_string(kMaxLevel))
      ->type_name("N")
      ->check(CLI::Range(0, kMaxLevel).description(""))
      ->excludes(strength);
  app.add_option_function<std::string>("--show", choice("--show", kShowNames, options.show),
                                       "map: write the transmission instead of the result; "
                                       "compare: write input and result side by side in one view; "
                                       "light: print the colour of the haze (OUTPUT may be left "
                                       "out)")
      ->type_name("WHAT");
}

void check_engine_options(const EngineOptions& options) {
  if (options.level && options.engine == EngineKind::kPhoto) {
    throw UsageError(
        "--level is a number of the preview engine; give the photo engine a --strength");
  }
}

EngineKind choose_engine(const EngineOptions& options, int width, int height, bool is_picture) {
  if (options.engine != EngineKind::kByInput) return options.engine;
  if (options.level) return EngineKind::kPreview;
  return !is_picture && fits_preview(width, height) ? EngineKind::kPreview : EngineKind::kPhoto;
}

}  // namespace dehaze
