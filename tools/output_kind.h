// The kinds of output files.
#pragma once

#include <optional>
#include <string>

namespace dehaze {

enum class OutputKind { kJpeg, kPng, kWebp, kMp4, kMov, kMkv, kY4m, kRaw };

inline bool is_picture_kind(OutputKind kind) {
  return kind == OutputKind::kJpeg || kind == OutputKind::kPng || kind == OutputKind::kWebp;
}

// Y4M and raw frames: nothing but pictures one after the other.
inline bool is_frames_only(OutputKind kind) {
  return kind == OutputKind::kY4m || kind == OutputKind::kRaw;
}

// With its dot and in small letters; empty if there is none.
std::string extension_of(const std::string& path);

// By extension; "-" is Y4M. None for any other.
std::optional<OutputKind> known_output_kind(const std::string& path);

// Throws UsageError for names of no known kind.
OutputKind output_kind_of(const std::string& path);

}  // namespace dehaze
