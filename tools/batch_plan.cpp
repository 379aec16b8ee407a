#include "batch_plan.h"

#include <algorithm>
#include <filesystem>
#include <map>
#include <set>
#include <system_error>

#include "output_kind.h"

namespace dehaze {
namespace {

namespace fs = std::filesystem;

const std::set<std::string>& readable_pictures() {
  static const std::set<std::string> kExtensions = {".bmp", ".dib", ".dpx", ".exr", ".j2k", ".jp2",
                                                    ".jxl", ".pbm", ".pcx", ".pgm", ".pnm", ".ppm",
                                                    ".psd", ".qoi", ".sgi", ".tif", ".tiff"};
  return kExtensions;
}

const std::set<std::string>& readable_videos() {
  static const std::set<std::string> kExtensions = {
      ".264",  ".265",  ".3g2", ".3gp",  ".asf", ".avi",  ".dv",  ".flv",
      ".h264", ".hevc", ".ivf", ".m2ts", ".m2v", ".mpeg", ".mpg", ".mts",
      ".mxf",  ".nut",  ".ogv", ".ts",   ".vob", ".webm", ".wmv"};
  return kExtensions;
}

// Of the result; empty if the name is not that of a picture or video.
std::string result_name(const fs::path& input) {
  const std::string extension = extension_of(input.string());
  const std::optional<OutputKind> kind = known_output_kind(input.string());
  if (kind && *kind != OutputKind::kRaw) return input.filename().string();
  const std::string stem = input.stem().string();
  if (readable_pictures().count(extension) > 0) return stem + ".png";
  // Soundless, and nothing that only MKV holds.
  if (extension == ".gif" || extension == ".m4v") return stem + ".mp4";
  if (readable_videos().count(extension) > 0) return stem + ".mkv";
  return "";
}

class Planner {
 public:
  explicit Planner(const Options& options) : options_(options) {
    std::error_code ignored;
    output_folder_ = fs::weakly_canonical(options.output_folder, ignored);
  }

  BatchPlan plan() {
    for (const std::string& source : options_.sources) {
      std::error_code ignored;
      if (fs::is_directory(source, ignored)) {
        add_folder(source, options_.output_folder);
      } else {
        add_named_file(source);
      }
    }
    return std::move(plan_);
  }

 private:
  void add_folder(const fs::path& folder, const fs::path& output_folder) {
    std::error_code failure;
    std::vector<fs::directory_entry> entries;
    for (fs::directory_iterator it(folder, failure), end; !failure && it != end;
         it.increment(failure)) {
      entries.push_back(*it);
    }
    if (failure) add_failure(folder.string(), failure.message());
    std::sort(entries.begin(), entries.end());
    for (const fs::directory_entry& entry : entries) {
      const fs::path& path = entry.path();
      std::error_code ignored;
      if (path.filename().string()[0] == '.') continue;
      if (!entry.is_directory(ignored)) {
        // A named pipe would be waited for.
        if (entry.is_regular_file(ignored)) add_found_file(path, output_folder);
      } else if (options_.recurse && !entry.is_symlink(ignored) && !is_output_folder(path)) {
        add_folder(path, output_folder / path.filename());
      }
    }
  }

  bool is_output_folder(const fs::path& folder) const {
    std::error_code ignored;
    return fs::canonical(folder, ignored) == output_folder_;
  }

  void add_found_file(const fs::path& path, const fs::path& output_folder) {
    const std::string name = result_name(path);
    if (name.empty()) {
      ++plan_.others;
    } else {
      add_file(path.string(), (output_folder / name).string());
    }
  }

  void add_named_file(const std::string& path) {
    const std::string name = result_name(path);
    if (name.empty()) {
      add_failure(path, "not known as a picture or video by its extension; name its output");
    } else {
      add_file(path, (fs::path(options_.output_folder) / name).string());
    }
  }

  void add_file(const std::string& input, const std::string& output) {
    std::error_code ignored;
    if (const auto [other, is_new] = input_of_.emplace(output, input); !is_new) {
      add_failure(input, "its result would be that of " + other->second + " as well, " + output);
    } else if (fs::equivalent(input, output, ignored)) {
      add_failure(input, "its result would replace it; choose another output folder");
    } else {
      const bool is_done = !options_.force && fs::exists(fs::status(output, ignored));
      plan_.files.push_back({input, output, is_done, ""});
    }
  }

  void add_failure(const std::string& path, const std::string& reason) {
    plan_.files.push_back({path, "", false, path + ": " + reason});
  }

  const Options& options_;
  fs::path output_folder_;
  std::map<std::string, std::string> input_of_;  // by output
  BatchPlan plan_;
};

}  // namespace

BatchPlan plan_batch(const Options& options) { return Planner(options).plan(); }

}  // namespace dehaze
