#include "output_kind.h"

#include <algorithm>
#include <cctype>
#include <filesystem>
#include <map>

#include "errors.h"

namespace dehaze {

std::string extension_of(const std::string& path) {
  std::string extension = std::filesystem::path(path).extension().string();
  std::transform(extension.begin(), extension.end(), extension.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return extension;
}

std::optional<OutputKind> known_output_kind(const std::string& path) {
  static const std::map<std::string, OutputKind> kKinds = {
      {".jpg", OutputKind::kJpeg},  {".jpeg", OutputKind::kJpeg}, {".png", OutputKind::kPng},
      {".webp", OutputKind::kWebp}, {".mp4", OutputKind::kMp4},   {".mov", OutputKind::kMov},
      {".mkv", OutputKind::kMkv},   {".y4m", OutputKind::kY4m},   {".yuv", OutputKind::kRaw}};
  if (path == "-") return OutputKind::kY4m;
  const auto found = kKinds.find(extension_of(path));
  if (found == kKinds.end()) return std::nullopt;
  return found->second;
}

OutputKind output_kind_of(const std::string& path) {
  const std::optional<OutputKind> kind = known_output_kind(path);
  if (kind) return *kind;
  throw UsageError(path +
                   ": unknown kind of output; use .jpg .jpeg .png .webp (picture), .mp4 .mkv .mov "
                   ".y4m .yuv (video), - (Y4M on standard output) or the name of a folder");
}

}  // namespace dehaze
